#ifndef AVPOST_TOOLS_AVPOST_ENCODE_VIDEOENCODER_H
#define AVPOST_TOOLS_AVPOST_ENCODE_VIDEOENCODER_H

#include <cstdint>

extern "C" {
#include <libavutil/pixfmt.h>
}

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/common/Ratio.h"
#include "tools/avpost/encode/Encoder.h"
#include "tools/avpost/ffmpeg/FfmpegPicture.h"

struct SwsContext;

namespace avpost::tool {

// The pictures an encoder gets: studio-range YUV 4:2:0 of one size at a constant rate.
struct PictureFormat {
    int width = 0;
    int height = 0;
    Ratio frameRate;
    Ratio pixelAspect;  // unknown: square
    // How the input's colours are to be read; the stages keep them as they are.
    AVColorPrimaries primaries = AVCOL_PRI_UNSPECIFIED;
    AVColorTransferCharacteristic transfer = AVCOL_TRC_UNSPECIFIED;
    AVColorSpace space = AVCOL_SPC_UNSPECIFIED;
};

// Encodes the output pictures, numbered from 0 at the constant rate. Encoders that take no
// planar 4:2:0 get the pictures converted to the nearest format they take.
class VideoEncoder : public Encoder {
public:
    // Opens the encoder with the settings that concern pictures (quality, preset, bit rate,
    // threads). Throws ToolError when it refuses them; globalHeader: the container keeps the
    // codec's headers apart from the pictures.
    VideoEncoder(const AVCodec& codec, const PictureFormat& format, const EncodeSettings& settings, bool globalHeader);
    ~VideoEncoder() override;

    // Encodes output picture `index`.
    void Encode(FramePtr picture, int64_t index, const PacketHandler& handle);
    // Gives out what the encoder still holds.
    void Finish(const PacketHandler& handle) { Send(nullptr, handle); }

private:
    SwsContext* converter_ = nullptr;
};

}  // namespace avpost::tool

#endif
