// The bitmap reader behind BMP2JPEG, and the encoder on every picture it accepts: the input is
// written to a temporary file and converted.
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "FuzzSeeds.h"
#include "ScratchFile.h"
#include "doubles/MediaFiles.h"
#include "image/output/JpegEncoder.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string bmp = ScratchFolder::Get().Write("in.bmp", data, size);
    const std::string jpeg = ScratchFolder::Get().File("out.jpg");
    BMP2JPEG(bmp.c_str(), jpeg.c_str());
    std::remove(jpeg.c_str());
    std::remove(bmp.c_str());
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    return {media_files::Bmp(1, 1, 24, 200), media_files::Bmp(8, 8, 24, 10), media_files::Bmp(17, 9, 24, 90)};
}
