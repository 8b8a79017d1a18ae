// The tool's watermark loading on any bytes (as a BMP file, which is what the tool reads itself),
// then the picture it accepts handed to a video stage as the fixed and the user watermark, the
// way the tool does, and two pictures drawn.
#include <cstdint>
#include <vector>

#include "FuzzSeeds.h"
#include "ScratchFile.h"
#include "doubles/MediaFiles.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "media/VideoExports.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/sources/Inputs.h"

namespace {

void DrawWith(avpost::tool::Bitmap32& bitmap)
{
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 3), 25, 48, 32);
    const RESIZE_PARAM request{64, 36, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    VideoDecoder* stage = PCVideoInit(&source, &request, 25, false);
    tagBITMAPINFO header = bitmap.Header();
    tagRECT place{40, 2, 62, 14};
    tagFRECT userPlace{0.0f, 0.5f, 0.5f, 1.0f};
    PCSetWatermarkImage(stage, &header, bitmap.pixels.data(), &place, 80);
    PCSetUserWatermarkImage(stage, &header, bitmap.pixels.data(), &userPlace, 60, 0);
    for (int i = 0; i < 2 && stage->Forward(1) >= 1; ++i)
        stage->GetFrame();
    PCVideoRelease(stage);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    // Files that do not start with "BM" go to FFmpeg's image decoders, which are not ours to fuzz.
    std::vector<uint8_t> bytes = {'B', 'M'};
    bytes.insert(bytes.end(), data, data + size);
    const std::string path = ScratchFolder::Get().Write("mark.bmp", bytes.data(), bytes.size());
    try {
        avpost::tool::Bitmap32 bitmap = avpost::tool::LoadWatermarkImage(path);
        DrawWith(bitmap);
    } catch (const avpost::tool::ToolError&) {
        // the one-line refusal the tool prints
    }
    std::remove(path.c_str());
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    std::vector<std::vector<uint8_t>> files = {media_files::Bmp(6, 4, 32, 60), media_files::Bmp(5, -3, 24, 9)};
    for (auto& file : files)
        file.erase(file.begin(), file.begin() + 2);  // the target puts "BM" back
    return files;
}
