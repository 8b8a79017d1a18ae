// JPEG writing beside libjpeg-turbo at the encoder's own quality (libjpeg quality 75, 4:4:4, the
// standard Huffman tables): BMP file to JPEG file, the encoding alone, and a capture of a video
// stage's 1080p picture. Each way reports the size of the file it wrote.
#include <stdlib.h>
#include <turbojpeg.h>
#include <unistd.h>

#include <cmath>
#include <cstdio>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "PeerBench.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "image/output/DibImage.h"
#include "image/output/JpegEncoder.h"
#include "support/FileHandle.h"
#include "video/VideoProcess.h"

namespace {

constexpr int kWidth = 1920;
constexpr int kHeight = 1080;
constexpr int kQuality = 75;
constexpr size_t kBmpHeaderSize = 54;

// Something between a test card and a photograph: broad gradients, rings of every spatial
// frequency and a little grain, so that the coder sees long zero runs and busy blocks.
unsigned char Scene(int x, int y, int channel, std::mt19937& grain)
{
    const double radius = std::hypot(x - kWidth * 0.6, y - kHeight * 0.4);
    const double rings = 40.0 * std::sin(radius * radius / 9000.0 + channel);
    const double ramp = channel == 0   ? 200.0 * y / kHeight
                        : channel == 1 ? 120.0 * (x + y) / (kWidth + kHeight)
                                       : 220.0 * x / kWidth;
    const double value = 20.0 + ramp + rings + static_cast<int>(grain() % 9) - 4;
    return static_cast<unsigned char>(value < 0 ? 0 : value > 255 ? 255 : value);
}

struct ScratchDir {
    std::string path;
    ScratchDir()
    {
        char pattern[] = "/tmp/avpost-jpeg-peers-XXXXXX";
        path = mkdtemp(pattern) != nullptr ? pattern : "/tmp";
    }
    ~ScratchDir()
    {
        for (const char* name : {"/picture.bmp", "/ours.jpg", "/peer.jpg"})
            std::remove((path + name).c_str());
        rmdir(path.c_str());
    }
    std::string File(const char* name) const { return path + "/" + name; }
};

// The 24-bit bottom-up BMP a capture writes.
std::string WriteScene(const ScratchDir& dir)
{
    DibImage image;
    image.Create(kWidth, kHeight, 24);
    std::mt19937 grain(7);
    for (int y = 0; y < kHeight; ++y)
        for (int i = 0; i < 3 * kWidth; ++i)
            image.bits[(kHeight - 1 - y) * image.stride + i] = Scene(i / 3, y, i % 3, grain);
    const std::string path = dir.File("picture.bmp");
    image.Save(path.c_str());
    return path;
}

std::vector<unsigned char> ReadWhole(const std::string& path)
{
    std::vector<unsigned char> bytes;
    if (const auto file = avpost::detail::OpenFile(path.c_str(), "rb")) {
        std::fseek(file.get(), 0, SEEK_END);
        bytes.resize(static_cast<size_t>(std::ftell(file.get())));
        std::fseek(file.get(), 0, SEEK_SET);
        bytes.resize(std::fread(bytes.data(), 1, bytes.size(), file.get()));
    }
    return bytes;
}

long FileSize(const std::string& path)
{
    const auto file = avpost::detail::OpenFile(path.c_str(), "rb");
    if (!file)
        return -1;
    std::fseek(file.get(), 0, SEEK_END);
    return std::ftell(file.get());
}

struct TjDestroy {
    void operator()(void* handle) const { tjDestroy(handle); }
};
using TjHandle = std::unique_ptr<void, TjDestroy>;

// Compresses bottom-up BGR rows and writes the file; returns the JPEG's size, 0 on failure.
unsigned long CompressToFile(tjhandle compressor, const unsigned char* bgr, int pitch, int flags,
                             const std::string& path)
{
    unsigned char* jpeg = nullptr;
    unsigned long size = 0;
    if (tjCompress2(compressor, bgr, kWidth, pitch, kHeight, TJPF_BGR, &jpeg, &size, TJSAMP_444, kQuality, flags) != 0)
        return 0;
    if (const auto file = avpost::detail::OpenFile(path.c_str(), "wb"))
        std::fwrite(jpeg, 1, size, file.get());
    tjFree(jpeg);
    return size;
}

void Bmp2JpegOurs(benchmark::State& state)
{
    ScratchDir dir;
    const std::string bmp = WriteScene(dir), jpeg = dir.File("ours.jpg");
    for (auto _ : state)
        benchmark::DoNotOptimize(BMP2JPEG(bmp.c_str(), jpeg.c_str()));
    state.counters["jpeg_bytes"] = static_cast<double>(FileSize(jpeg));
}

// Reads the same BMP whole, compresses its rows where they lie and writes the file.
void Bmp2JpegTurbo(benchmark::State& state)
{
    ScratchDir dir;
    const std::string bmp = WriteScene(dir), jpeg = dir.File("peer.jpg");
    TjHandle compressor(tjInitCompress());
    for (auto _ : state) {
        const std::vector<unsigned char> file = ReadWhole(bmp);
        benchmark::DoNotOptimize(
            CompressToFile(compressor.get(), file.data() + kBmpHeaderSize, kWidth * 3, TJFLAG_BOTTOMUP, jpeg));
    }
    state.counters["jpeg_bytes"] = static_cast<double>(FileSize(jpeg));
}

// The picture loaded and the tables built once; the bytes of the scan go nowhere.
void EncodeOurs(benchmark::State& state)
{
    ScratchDir dir;
    const std::string bmp = WriteScene(dir);
    load_bitmap(bmp.c_str(), nullptr, nullptr);
    init_all();
    for (auto _ : state)
        main_encoder();
}

void EncodeTurbo(benchmark::State& state)
{
    ScratchDir dir;
    const std::vector<unsigned char> file = ReadWhole(WriteScene(dir));
    TjHandle compressor(tjInitCompress());
    unsigned char* jpeg = nullptr;
    unsigned long size = 0;
    for (auto _ : state) {
        tjCompress2(compressor.get(), file.data() + kBmpHeaderSize, kWidth, kWidth * 3, kHeight, TJPF_BGR, &jpeg, &size,
                    TJSAMP_444, kQuality, TJFLAG_BOTTOMUP);
        benchmark::DoNotOptimize(jpeg);
    }
    tjFree(jpeg);
}

// A 1080p 4:2:0 picture as a decoder hands it over.
void PaintYuv(MEDIA_FRAME* picture)
{
    std::mt19937 grain(3);
    for (int y = 0; y < kHeight; ++y)
        for (int x = 0; x < kWidth; ++x)
            picture->plane[0][y * picture->pitch[0] + x] =
                static_cast<unsigned char>(16 + Scene(x, y, 1, grain) * 219 / 255);
    for (int y = 0; y < kHeight / 2; ++y) {
        for (int x = 0; x < kWidth / 2; ++x) {
            const int u = 64 + Scene(2 * x, 2 * y, 0, grain) / 2, v = 64 + Scene(2 * x, 2 * y, 2, grain) / 2;
            picture->plane[1][y * picture->pitch[1] + x] = static_cast<unsigned char>(u);
            picture->plane[2][y * picture->pitch[2] + x] = static_cast<unsigned char>(v);
        }
    }
}

void CaptureOurs(benchmark::State& state)
{
    ScratchDir dir;
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 1), 25.0, kWidth, kHeight);
    PaintYuv(source.GetFrame());
    VideoProcess stage(&source, nullptr, -1.0, false);
    const std::string jpeg = dir.File("ours.jpg");
    std::wstring path(jpeg.begin(), jpeg.end());
    for (auto _ : state)
        benchmark::DoNotOptimize(stage.CaptureImage(path.data(), 1, 0));
    state.counters["jpeg_bytes"] = static_cast<double>(FileSize(jpeg));
}

// The same planes turned into BGR by libjpeg-turbo, then compressed at 4:4:4 and written.
void CaptureTurbo(benchmark::State& state)
{
    ScratchDir dir;
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 1), 25.0, kWidth, kHeight);
    MEDIA_FRAME* picture = source.GetFrame();
    PaintYuv(picture);
    const std::string jpeg = dir.File("peer.jpg");
    TjHandle compressor(tjInitCompress()), decompressor(tjInitDecompress());
    const unsigned char* planes[3] = {picture->plane[0], picture->plane[1], picture->plane[2]};
    const int strides[3] = {picture->pitch[0], picture->pitch[1], picture->pitch[2]};
    for (auto _ : state) {
        std::vector<unsigned char> bgr(size_t{kWidth} * kHeight * 3);
        tjDecodeYUVPlanes(decompressor.get(), planes, strides, TJSAMP_420, bgr.data(), kWidth, kWidth * 3, kHeight,
                          TJPF_BGR, 0);
        benchmark::DoNotOptimize(CompressToFile(compressor.get(), bgr.data(), kWidth * 3, 0, jpeg));
    }
    state.counters["jpeg_bytes"] = static_cast<double>(FileSize(jpeg));
}

const bool registered = [] {
    peers::AddWork("bmp2jpeg_file_1920x1080", peers::kOurs, Bmp2JpegOurs);
    peers::AddWork("bmp2jpeg_file_1920x1080", "libjpeg-turbo", Bmp2JpegTurbo);
    peers::AddWork("jpeg_encode_1920x1080", peers::kOurs, EncodeOurs);
    peers::AddWork("jpeg_encode_1920x1080", "libjpeg-turbo", EncodeTurbo);
    peers::AddWork("capture_jpeg_1920x1080", peers::kOurs, CaptureOurs);
    peers::AddWork("capture_jpeg_1920x1080", "libjpeg-turbo", CaptureTurbo);
    return true;
}();

}  // namespace
