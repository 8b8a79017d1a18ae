#ifndef AVPOST_TOOLS_AVPOST_ENCODE_OUTPUTPLAN_H
#define AVPOST_TOOLS_AVPOST_ENCODE_OUTPUTPLAN_H

#include <string>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
}

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// What avpost convert writes: the container, and the encoder of each kind it holds.
struct OutputPlan {
    const AVOutputFormat* container = nullptr;
    const AVCodec* video = nullptr;  // null: no pictures in the output
    const AVCodec* audio = nullptr;  // null: no sound
    bool containerHoldsVideo = false;
    bool containerHoldsAudio = false;
};

// Picks the container by --format or the output's name (matroska for standard output), and
// the encoders: those given, else H.264 by libx264 and AAC where the container surely holds
// them and its own choice is no uncompressed format (WAV keeps PCM, Y4M raw pictures), else
// the container's own choice. Throws ToolError naming the option or the output for a
// container or encoder FFmpeg does not have, or a pair that does not fit.
OutputPlan PlanOutput(const std::string& output, const EncodeSettings& settings);

// The codec and the encoder that writes it: "h264 (libx264)", or "aac" where they share the name.
std::string EncoderName(const AVCodec& codec);

}  // namespace avpost::tool

#endif
