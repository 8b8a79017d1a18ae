// The bitmap reader behind BMP2JPEG, and the encoder on every picture it accepts: the input is
// written to a temporary file and converted.
#include <stdlib.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "FuzzSeeds.h"
#include "image/output/JpegEncoder.h"

namespace {

// A scratch folder of this process, made on first use and removed at exit.
class ScratchFolder {
public:
    ScratchFolder()
    {
        char name[] = "/tmp/avpost-fuzz-XXXXXX";
        if (mkdtemp(name) == nullptr)
            std::abort();
        path_ = name;
    }
    ~ScratchFolder() { rmdir(path_.c_str()); }
    std::string File(const char* name) const { return path_ + "/" + name; }

private:
    std::string path_;
};

void PutLe(std::vector<uint8_t>& out, uint32_t value, int bytes)
{
    for (int i = 0; i < bytes; ++i)
        out.push_back(static_cast<uint8_t>(value >> (8 * i)));
}

// A 24-bit bottom-up BMP file of w x h pixels with rows padded to 4 bytes.
std::vector<uint8_t> BmpFile(int w, int h, uint8_t shade)
{
    const uint32_t rowBytes = (static_cast<uint32_t>(w) * 3 + 3) & ~3u;
    std::vector<uint8_t> file = {'B', 'M'};
    PutLe(file, 54 + rowBytes * h, 4);
    PutLe(file, 0, 4);
    PutLe(file, 54, 4);
    PutLe(file, 40, 4);
    PutLe(file, static_cast<uint32_t>(w), 4);
    PutLe(file, static_cast<uint32_t>(h), 4);
    PutLe(file, 1, 2);
    PutLe(file, 24, 2);
    for (int i = 0; i < 6; ++i)
        PutLe(file, 0, 4);
    for (uint32_t i = 0; i < rowBytes * h; ++i)
        file.push_back(static_cast<uint8_t>(shade + i * 7));
    return file;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    static const ScratchFolder scratch;
    const std::string bmp = scratch.File("in.bmp"), jpeg = scratch.File("out.jpg");
    std::FILE* file = std::fopen(bmp.c_str(), "wb");
    if (file == nullptr || std::fwrite(data, 1, size, file) != size || std::fclose(file) != 0)
        std::abort();
    BMP2JPEG(bmp.c_str(), jpeg.c_str());
    std::remove(jpeg.c_str());
    std::remove(bmp.c_str());
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    return {BmpFile(1, 1, 200), BmpFile(8, 8, 10), BmpFile(17, 9, 90)};
}
