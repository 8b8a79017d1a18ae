#include "image/output/SaveYUVImage.h"

#include <cstdio>
#include <cstring>
#include <string>

#include "Common/Image/ImageConvert.h"
#include "image/output/JpegEncoder.h"
#include "image/output/DibImage.h"
#include "support/TextEncoding.h"

namespace {

constexpr char kTemporarySuffix[] = ".tmp~yuv~2~rgb~temp.bmp";
constexpr size_t kBmpNameLimit = 512;
constexpr size_t kJpegNameLimit = 1024;
// The JPEG name and the temporary name each fit a 512-byte buffer with its terminator.
constexpr size_t kNameBuffer = 512;

std::string Utf8Name(const wchar_t* path, size_t limit)
{
    std::string buffer(limit, '\0');
    if (path != nullptr)
        WtoUTF8(path, -1, &buffer[0], static_cast<int>(limit), false);
    buffer.resize(std::strlen(buffer.c_str()));
    return buffer;
}

// The bitmap is freed once written, so the encoder's copy of the picture can take its memory.
int SaveAsJpeg(DibImage& image, const std::string& jpegName)
{
    const std::string temporaryName = jpegName + kTemporarySuffix;
    if (temporaryName.size() >= kNameBuffer)
        return 0;
    const int written = image.Save(temporaryName.c_str());
    image.Clear();
    BMP2JPEG(temporaryName.c_str(), jpegName.c_str());
    // Removed through the C library: the name never reaches a shell.
    std::remove(temporaryName.c_str());
    return written;
}

}  // namespace

int SaveYUVImage(const wchar_t* path, int jpeg, int width, int height, unsigned char* y, unsigned char* u,
                 unsigned char* v, int pitchY, int pitchU, int pitchV)
{
    DibImage image;
    if (!image.Create(width, height, 24))
        return 0;
    Yuv420_2_rgb24(&image.info->bmiHeader, image.bits, y, u, v, pitchY, pitchU, pitchV);

    if (jpeg == 0)
        return image.Save(Utf8Name(path, kBmpNameLimit).c_str());
    return SaveAsJpeg(image, Utf8Name(path, kJpegNameLimit));
}
