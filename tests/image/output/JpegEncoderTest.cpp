#include "image/output/JpegEncoder.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <thread>

#include "OutputTestFiles.h"
#include "doubles/SimdLevels.h"
#include "image/output/DibImage.h"
#include "support/CpuFeatures.h"

namespace {

using avpost_test::Bytes;
using avpost_test::EncodeJpeg;
using avpost_test::ScratchDir;

// Segments before the scan have fixed lengths: SOI 2, APP0 18, DQT 134, SOF0 19, DHT 420, SOS 14.
constexpr size_t kDqtOffset = 20;
constexpr size_t kScanOffset = 607;

Bytes EncodeGrey(int size, int level, const ScratchDir& dir)
{
    DibImage image;
    avpost_test::Paint(image, size, size, [level](int, int, int) { return level; });
    return EncodeJpeg(image, dir);
}

// Zigzag order visits natural indexes 0, 1, 8, 16, 9, 2: luminance 16 11 12 14 12 10 halved,
// chrominance 17 18 18 24 21 24; both tables end with 99 -> 50.
TEST(JpegFile, QuantisationTablesAreTheStandardOnesHalvedInZigzagOrder)
{
    ScratchDir dir;
    const Bytes jpeg = EncodeGrey(8, 0, dir);
    const auto dqt = jpeg.begin() + kDqtOffset;
    EXPECT_EQ(Bytes(dqt, dqt + 11), (Bytes{0xFF, 0xDB, 0, 132, 0x00, 8, 6, 6, 7, 6, 5}));
    EXPECT_EQ(Bytes(dqt + 68, dqt + 76), (Bytes{50, 0x01, 9, 9, 9, 12, 11, 12}));
    EXPECT_EQ(dqt[133], 50);
}

// Grey pictures have Y = level - 128 and zero chroma: each flat block codes its DC difference
// and one end-of-block code. The entropy-coded data runs up to the end-of-image marker.
TEST(JpegScan, FlatGreyPicturesCodeEachBlocksDcAndOneEndOfBlock)
{
    const struct {
        int size, level;
        Bytes scan;
    } cases[] = {
        // Y = 5: DC category 3 (100) and 101, EOB 1010; chroma 00 00 twice; one-bits pad.
        {1, 133, {0x96, 0x80, 0x3F, 0xFF, 0xD9}},
        // Rows of 2 padding bytes; the repeated last column and row keep all four blocks flat.
        {10, 133, {0x96, 0x80, 0x0A, 0x00, 0x28, 0x00, 0xA0, 0x0F, 0xFF, 0xD9}},
        // Y = 1: exactly two bytes, yet a byte of one-bits follows, stuffed as FF 00.
        {8, 129, {0x5A, 0x00, 0xFF, 0x00, 0xFF, 0xD9}},
    };
    ScratchDir dir;
    for (const auto& c : cases) {
        const Bytes jpeg = EncodeGrey(c.size, c.level, dir);
        EXPECT_EQ(Bytes(jpeg.begin() + kScanOffset, jpeg.end()), c.scan) << c.size;
    }
}

uint64_t Fnv1a(const Bytes& bytes)
{
    uint64_t hash = 14695981039346656037ull;
    for (unsigned char b : bytes)
        hash = (hash ^ b) * 1099511628211ull;
    return hash;
}

// Pinned when the x86-64 and 32-bit builds agreed: the arithmetic, rounding included, must
// give the same bytes on every build.
TEST(JpegScan, EveryBuildWritesTheSameBytes)
{
    ScratchDir dir;
    DibImage noise;
    avpost_test::PaintNoise(noise, 45, 29, 11);
    EXPECT_EQ(Fnv1a(EncodeJpeg(noise, dir)), 2173301848693968694ull);
}

// Pictures that reach every path of the coder: noise (large values, stuffed FF bytes), smooth
// gradients (padding by repetition), one-pixel checks, saturated colours (the ends of the chroma
// range) and single DCT basis functions, one frequency per block and channel (zero runs of every
// length, 16 and more included, up to the last zigzag position).
enum class Content { kNoise, kGradient, kChecks, kSaturated, kBasis };

// cos(m pi / 16) x 1000, in integers so that every build paints the same picture.
int Cosine(int m)
{
    constexpr int kQuarter[9] = {1000, 981, 924, 831, 707, 556, 383, 195, 0};
    m %= 32;
    if (m > 16)
        m = 32 - m;
    return m <= 8 ? kQuarter[m] : -kQuarter[16 - m];
}

int BasisSample(int x, int y, int channel)
{
    const int frequency = 1 + ((x / 8) * 5 + (y / 8) * 11 + channel * 21) % 63;
    const int wave = Cosine((2 * (x % 8) + 1) * (frequency % 8)) * Cosine((2 * (y % 8) + 1) * (frequency / 8));
    return 128 + 110 * wave / 1000000;
}

void PaintContent(DibImage& image, int width, int height, Content content)
{
    switch (content) {
    case Content::kNoise:
        return avpost_test::PaintNoise(image, width, height, static_cast<uint32_t>(width * 131 + height));
    case Content::kGradient:
        return avpost_test::PaintGradient(image, width, height);
    case Content::kChecks:
        return avpost_test::Paint(image, width, height, [](int x, int y, int c) { return (x + y + c) % 2 * 255; });
    case Content::kBasis:
        return avpost_test::Paint(image, width, height, BasisSample);
    case Content::kSaturated:
        // Yellow, cyan, blue, red ... in one-pixel-wide diagonal bands of the eight corners of the RGB cube.
        return avpost_test::Paint(image, width, height,
                                  [](int x, int y, int c) { return ((x + 2 * y) / 3 % 8 >> c & 1) * 255; });
    }
}

// Pinned from the encoder as first written, agreed by the x86-64, 32-bit and sanitizer builds:
// whole blocks, odd sizes, single rows and columns; the same bytes at every instruction-set level.
TEST(JpegScan, PinnedFilesAcrossSizes)
{
    const struct {
        int width, height;
        Content content;
        uint64_t hash;
    } cases[] = {
        {1, 1, Content::kNoise, 4202928657668981349ull},        {8, 8, Content::kNoise, 2096077637085012109ull},
        {9, 7, Content::kNoise, 2546781633652468741ull},        {64, 48, Content::kNoise, 4746689434414567178ull},
        {67, 33, Content::kNoise, 17353925480773855651ull},     {1, 37, Content::kNoise, 8583439818104409794ull},
        {203, 1, Content::kNoise, 5750935098234129895ull},      {16, 16, Content::kGradient, 7062311530282425889ull},
        {161, 95, Content::kGradient, 4027701855513303729ull},  {320, 240, Content::kGradient, 4124311777100302406ull},
        {8, 8, Content::kChecks, 15888048445037434470ull},      {77, 41, Content::kChecks, 15492450617705220120ull},
        {24, 24, Content::kSaturated, 14861674594231001901ull}, {99, 51, Content::kSaturated, 1968099523827378989ull},
        {64, 64, Content::kBasis, 6607009278063751447ull},      {203, 99, Content::kBasis, 15099398329717187023ull},
    };
    ScratchDir dir;
    for (avpost::simd::Level level : AvailableSimdLevels()) {
        avpost::simd::ScopedLevel pin(level);
        for (const auto& c : cases) {
            DibImage image;
            PaintContent(image, c.width, c.height, c.content);
            EXPECT_EQ(Fnv1a(EncodeJpeg(image, dir)), c.hash) << avpost::simd::NameOf(level) << ", " << c.width << "x"
                                                             << c.height << " content " << static_cast<int>(c.content);
        }
    }
}

// Other depths, a damaged header, missing rows, a size with no rows behind it, names longer
// than 511 bytes, and JPEG files that cannot be created or written.
TEST(JpegRefusals, WhatItCannotUseWritesNothing)
{
    ScratchDir dir;
    const std::string bmp = dir.File("bad.bmp"), jpeg = dir.File("out.jpg"), good = dir.File("picture.bmp");
    EncodeGrey(10, 7, dir);
    const Bytes goodFile = avpost_test::ReadFile(good);
    Bytes bad[6] = {goodFile,
                    goodFile,
                    goodFile,
                    Bytes(goodFile.begin(), goodFile.begin() + 53),
                    Bytes(goodFile.begin(), goodFile.end() - 1),
                    Bytes(goodFile.begin(), goodFile.begin() + 54)};
    bad[0][28] = 8;
    bad[1][28] = 32;
    bad[2][0] = 'X';
    bad[5][18] = bad[5][19] = bad[5][22] = bad[5][23] = 0xFF;
    for (const Bytes& file : bad) {
        std::ofstream(bmp, std::ios::binary).write(reinterpret_cast<const char*>(file.data()), file.size());
        EXPECT_EQ(BMP2JPEG(bmp.c_str(), jpeg.c_str()), 0);
    }
    EXPECT_EQ(BMP2JPEG(nullptr, jpeg.c_str()), 0);

    const std::string folder = dir.File(std::string(200, 'd') + "/" + std::string(200, 'e') + "/");
    std::filesystem::create_directories(folder);
    const std::string longest = folder + std::string(511 - folder.size(), 'j');
    EXPECT_EQ(BMP2JPEG(good.c_str(), (longest + "j").c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(longest + "j"));
    std::filesystem::copy_file(good, longest + "b");
    EXPECT_EQ(BMP2JPEG((longest + "b").c_str(), jpeg.c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(jpeg));

    EXPECT_EQ(BMP2JPEG(good.c_str(), longest.c_str()), 0);
    EXPECT_TRUE(std::filesystem::exists(longest));
    EXPECT_EQ(BMP2JPEG(good.c_str(), dir.File("missing/out.jpg").c_str()), EOF);
    // A device that takes nothing: the failed write is reported, and the device left alone.
    EXPECT_EQ(BMP2JPEG(good.c_str(), "/dev/full"), EOF);
    EXPECT_TRUE(std::filesystem::exists("/dev/full"));
}

// Pictures large enough for the conversions to overlap.
TEST(JpegConcurrency, ConversionsOnTwoThreadsDoNotMix)
{
    ScratchDir dir;
    DibImage pictures[2];
    avpost_test::PaintNoise(pictures[0], 160, 96, 1);
    avpost_test::PaintGradient(pictures[1], 96, 160);
    const Bytes expected[2] = {EncodeJpeg(pictures[0], dir, "0"), EncodeJpeg(pictures[1], dir, "1")};
    auto convert = [&](int which) {
        const std::string name = dir.File(std::to_string(which));
        for (int i = 0; i < 10; ++i) {
            BMP2JPEG((name + ".bmp").c_str(), (name + "-again.jpg").c_str());
            EXPECT_EQ(avpost_test::ReadFile(name + "-again.jpg"), expected[which]);
        }
    };
    std::thread first(convert, 0), second(convert, 1);
    first.join();
    second.join();
}

}  // namespace
