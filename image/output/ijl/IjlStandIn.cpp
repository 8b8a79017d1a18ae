// A stand-in for the JPEG library that CIjlObj loads at run time as "IJL15.DLL", built on
// libjpeg. It offers what the wrapper uses: ijlInit, ijlFree, ijlRead (parameters or the whole
// picture from a memory buffer) and ijlWrite (the whole picture to a file), pictures of three
// channels in blue, green, red order. Results: 0 for success, a negative code otherwise.
//
// libjpeg reports fatal errors through a callback that must not return; it jumps back to the
// operation with longjmp, so the functions that set the jump hold only plain C records.
#include <csetjmp>
#include <cstdio>
#include <cstdlib>

#include <jpeglib.h>

#include "image/output/IjlIoCodes.h"
#include "image/output/JpegCoreProperties.h"
#include "support/FileHandle.h"

#define IJL_EXPORT extern "C" __attribute__((visibility("default")))

namespace {

using avpost::detail::kIjlOk;

constexpr int kInvalidArgument = -1;
constexpr int kUnsupportedOperation = -2;
constexpr int kCorruptData = -3;
constexpr int kFileError = -4;

constexpr uint32_t kDefaultQuality = 75;
constexpr uint32_t kChannels = 3;

struct ErrorTrap {
    jpeg_error_mgr manager;
    std::jmp_buf jump;
};

[[noreturn]] void JumpToTrap(j_common_ptr codec) { std::longjmp(reinterpret_cast<ErrorTrap*>(codec->err)->jump, 1); }

void DiscardMessage(j_common_ptr) {}

jpeg_error_mgr* InstallTrap(ErrorTrap& trap)
{
    jpeg_std_error(&trap.manager);
    trap.manager.error_exit = JumpToTrap;
    trap.manager.output_message = DiscardMessage;
    return &trap.manager;
}

uint32_t PictureHeight(int32_t signedHeight) { return static_cast<uint32_t>(std::abs(signedHeight)); }

// The memory row that holds picture row `line`: bottom-up for a negative DIBHeight.
unsigned char* DibRow(const JPEG_CORE_PROPERTIES& p, uint32_t line)
{
    const size_t stride = size_t{p.DIBWidth} * kChannels + p.DIBPadBytes;
    const uint32_t rows = PictureHeight(p.DIBHeight);
    const uint32_t memoryRow = p.DIBHeight < 0 ? rows - 1 - line : line;
    return p.DIBBytes + memoryRow * stride;
}

bool HasBuffer(const JPEG_CORE_PROPERTIES& p) { return p.JPGBytes != nullptr && p.JPGSizeBytes > 0; }

// Runs work on a decoder that has read the header of the buffer; work gives the result code.
template <typename Work>
int WithDecoder(const JPEG_CORE_PROPERTIES& p, Work work)
{
    jpeg_decompress_struct codec;
    ErrorTrap trap;
    codec.err = InstallTrap(trap);
    if (setjmp(trap.jump)) {
        jpeg_destroy_decompress(&codec);
        return kCorruptData;
    }
    jpeg_create_decompress(&codec);
    jpeg_mem_src(&codec, p.JPGBytes, p.JPGSizeBytes);
    jpeg_read_header(&codec, TRUE);
    const int result = work(codec);
    jpeg_destroy_decompress(&codec);
    return result;
}

int ReadParameters(JPEG_CORE_PROPERTIES& p)
{
    if (!HasBuffer(p))
        return kInvalidArgument;
    return WithDecoder(p, [&p](jpeg_decompress_struct& codec) {
        p.JPGWidth = codec.image_width;
        p.JPGHeight = static_cast<int32_t>(codec.image_height);
        p.JPGChannels = static_cast<uint32_t>(codec.num_components);
        return kIjlOk;
    });
}

int DecodeRows(const JPEG_CORE_PROPERTIES& p, jpeg_decompress_struct& codec)
{
    if (codec.image_width != p.DIBWidth || codec.image_height != PictureHeight(p.DIBHeight))
        return kInvalidArgument;
    codec.out_color_space = JCS_EXT_BGR;
    jpeg_start_decompress(&codec);
    while (codec.output_scanline < codec.output_height) {
        JSAMPROW row = DibRow(p, codec.output_scanline);
        jpeg_read_scanlines(&codec, &row, 1);
    }
    jpeg_finish_decompress(&codec);
    return kIjlOk;
}

int ReadImage(const JPEG_CORE_PROPERTIES& p)
{
    if (!HasBuffer(p) || p.DIBBytes == nullptr || p.DIBChannels != kChannels)
        return kInvalidArgument;
    return WithDecoder(p, [&p](jpeg_decompress_struct& codec) { return DecodeRows(p, codec); });
}

int Compress(const JPEG_CORE_PROPERTIES& p, std::FILE* file)
{
    jpeg_compress_struct codec;
    ErrorTrap trap;
    codec.err = InstallTrap(trap);
    if (setjmp(trap.jump)) {
        jpeg_destroy_compress(&codec);
        return kCorruptData;
    }
    jpeg_create_compress(&codec);
    jpeg_stdio_dest(&codec, file);
    codec.image_width = p.JPGWidth;
    codec.image_height = PictureHeight(p.JPGHeight);
    codec.input_components = kChannels;
    codec.in_color_space = JCS_EXT_BGR;
    jpeg_set_defaults(&codec);
    jpeg_set_quality(&codec, static_cast<int>(p.jquality < 1 ? 1 : p.jquality > 100 ? 100 : p.jquality), TRUE);
    jpeg_start_compress(&codec, TRUE);
    while (codec.next_scanline < codec.image_height) {
        JSAMPROW row = DibRow(p, codec.next_scanline);
        jpeg_write_scanlines(&codec, &row, 1);
    }
    jpeg_finish_compress(&codec);
    jpeg_destroy_compress(&codec);
    return kIjlOk;
}

// Checks everything before the file is created, so a refused call leaves no file behind.
int WriteImage(const JPEG_CORE_PROPERTIES& p)
{
    if (p.JPGFile == nullptr || p.DIBBytes == nullptr || p.DIBChannels != kChannels || p.JPGWidth == 0 ||
        p.JPGHeight == 0 || p.DIBWidth != p.JPGWidth || PictureHeight(p.DIBHeight) != PictureHeight(p.JPGHeight))
        return kInvalidArgument;
    auto file = avpost::detail::OpenFile(p.JPGFile, "wb");
    if (!file)
        return kFileError;
    int result = Compress(p, file.get());
    if (avpost::detail::CloseFile(file) != 0 && result == kIjlOk)
        result = kFileError;
    if (result != kIjlOk)
        std::remove(p.JPGFile);
    return result;
}

}  // namespace

IJL_EXPORT int ijlInit(JPEG_CORE_PROPERTIES* properties)
{
    if (properties == nullptr)
        return kInvalidArgument;
    properties->DIBChannels = kChannels;
    properties->JPGChannels = kChannels;
    properties->jquality = kDefaultQuality;
    return kIjlOk;
}

// Every operation finishes its own work, so there is nothing left to free.
IJL_EXPORT int ijlFree(JPEG_CORE_PROPERTIES* properties) { return properties == nullptr ? kInvalidArgument : kIjlOk; }

IJL_EXPORT int ijlRead(JPEG_CORE_PROPERTIES* properties, int ioType)
{
    if (properties == nullptr)
        return kInvalidArgument;
    switch (ioType) {
    case avpost::detail::kIjlReadParamsFromBuffer:
        return ReadParameters(*properties);
    case avpost::detail::kIjlReadImageFromBuffer:
        return ReadImage(*properties);
    default:
        return kUnsupportedOperation;
    }
}

IJL_EXPORT int ijlWrite(JPEG_CORE_PROPERTIES* properties, int ioType)
{
    if (properties == nullptr)
        return kInvalidArgument;
    return ioType == avpost::detail::kIjlWriteImageToFile ? WriteImage(*properties) : kUnsupportedOperation;
}
