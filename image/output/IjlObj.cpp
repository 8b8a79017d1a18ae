#include "image/output/IjlObj.h"

#include <cstdlib>

#include "image/output/IjlIoCodes.h"
#include "image/output/IjlLoader.h"

namespace {

using avpost::detail::kIjlOk;

constexpr int kBitsPerPixel = 24;
constexpr uint32_t kChannels = 3;

// The bytes that pad a row of 24-bit pixels to the bitmap's 32-bit row stride.
uint32_t PadBytes(uint32_t width) { return ((width * 3 + 3) & ~uint32_t{3}) - width * 3; }

bool Loaded(const CIjlObj& obj)
{
    return obj.handle != nullptr && obj.ijlInit != nullptr && obj.ijlFree != nullptr && obj.ijlRead != nullptr &&
           obj.ijlWrite != nullptr;
}

// The instance of the process: loaded once, closed by its destructor at process exit.
struct ProcessInstance {
    CIjlObj ijlObj;
    ProcessInstance() { ijlObj.Init(); }
    ~ProcessInstance() { avpost::detail::UnloadIjlLibrary(ijlObj); }
};

}  // namespace

void CIjlObj::Init()
{
    if (handle != nullptr)
        return;
    for (const std::string& candidate : avpost::detail::IjlLibraryCandidates())
        if (avpost::detail::LoadIjlLibrary(*this, candidate.c_str()))
            return;
}

int CIjlObj::ProcessBuffer(unsigned char* buffer, unsigned long size, DibImage& image)
{
    if (!Loaded(*this) || buffer == nullptr)
        return 0;
    JPEG_CORE_PROPERTIES properties{};
    if (ijlInit(&properties) != kIjlOk)
        return 0;
    properties.JPGBytes = buffer;
    properties.JPGSizeBytes = size;
    if (ijlRead(&properties, avpost::detail::kIjlReadParamsFromBuffer) != kIjlOk ||
        !image.Create(static_cast<int>(properties.JPGWidth), std::abs(properties.JPGHeight), kBitsPerPixel)) {
        ijlFree(&properties);
        return 0;
    }
    properties.DIBBytes = image.bits;
    properties.DIBWidth = properties.JPGWidth;
    properties.DIBHeight = -properties.JPGHeight;
    properties.DIBChannels = kChannels;
    properties.DIBPadBytes = PadBytes(properties.JPGWidth);
    const int read = ijlRead(&properties, avpost::detail::kIjlReadImageFromBuffer);
    ijlFree(&properties);
    return read == kIjlOk ? 1 : 0;
}

// The library reads rows of the 24-bit stride, so an image of another depth is refused here.
int CIjlObj::Save(DibImage& image, const char* path, unsigned long /*quality*/)
{
    const tagBITMAPINFOHEADER* header = image.info != nullptr ? &image.info->bmiHeader : nullptr;
    if (!Loaded(*this) || (header != nullptr && header->biBitCount != kBitsPerPixel))
        return 0;
    JPEG_CORE_PROPERTIES properties{};
    if (ijlInit(&properties) != kIjlOk)
        return 0;
    const int32_t width = header != nullptr ? header->biWidth : 0;
    const int32_t height = header != nullptr ? header->biHeight : 0;
    properties.JPGFile = path != nullptr ? path : "";
    properties.JPGWidth = static_cast<uint32_t>(width);
    properties.JPGHeight = height;
    properties.DIBBytes = image.bits;
    properties.DIBWidth = static_cast<uint32_t>(width);
    properties.DIBHeight = -height;
    properties.DIBChannels = kChannels;
    properties.DIBPadBytes = PadBytes(static_cast<uint32_t>(width));
    const bool written = ijlWrite(&properties, avpost::detail::kIjlWriteImageToFile) == kIjlOk;
    ijlFree(&properties);
    return written ? 1 : 0;
}

CIjlObj* GetIjlObj()
{
    static ProcessInstance instance;
    return instance.ijlObj.handle != nullptr ? &instance.ijlObj : nullptr;
}
