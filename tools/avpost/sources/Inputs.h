#ifndef AVPOST_TOOLS_AVPOST_SOURCES_INPUTS_H
#define AVPOST_TOOLS_AVPOST_SOURCES_INPUTS_H

#include <memory>
#include <optional>
#include <string>

#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// Opens the decoder that fits a file: the tool's own for Y4M and 16-bit WAV, FFmpeg's
// libraries for everything else and for the Y4M and WAV variants the tool's readers refuse
// (when the tool has them). "-" is standard input, which must be Y4M or WAV. Throws
// ToolError naming the file and the problem.
std::unique_ptr<VideoSource> OpenVideoInput(const std::string& path);
std::unique_ptr<AudioSource> OpenAudioInput(const std::string& path);

// How messages name an input.
std::string InputName(const std::string& path);

// Reads a watermark image: BMP of 24 or 32 bits by the tool itself, anything else through
// FFmpeg when the tool has it. Throws ToolError naming the file and the problem.
Bitmap32 LoadWatermarkImage(const std::string& path);
// The image when a path is given (not empty).
std::optional<Bitmap32> LoadWatermarkIfGiven(const std::string& path);

}  // namespace avpost::tool

#endif
