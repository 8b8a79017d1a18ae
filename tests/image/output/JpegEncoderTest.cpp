#include "image/output/JpegEncoder.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>
#include <string>
#include <thread>

#include "OutputTestFiles.h"
#include "image/output/DibImage.h"
#include "image/output/JpegEncoderInternals.h"

namespace {

using avpost_test::Bytes;
using avpost_test::Picture;
using avpost_test::ScratchDir;

// Segments before the scan have fixed lengths: SOI 2, APP0 18, DQT 134, SOF0 19, DHT 420, SOS 14.
constexpr size_t kDqtOffset = 20;
constexpr size_t kSof0Offset = 154;
constexpr size_t kDhtOffset = 173;
constexpr size_t kSosOffset = 593;
constexpr size_t kScanOffset = 607;

Bytes Encode(const Picture& picture, const ScratchDir& dir, const std::string& name = "picture")
{
    avpost_test::SaveBmp(picture, dir.File(name + ".bmp"));
    EXPECT_EQ(BMP2JPEG(dir.File(name + ".bmp").c_str(), dir.File(name + ".jpg").c_str()), 0);
    return avpost_test::ReadFile(dir.File(name + ".jpg"));
}

// The entropy-coded data between SOS and EOI.
Bytes Scan(const Bytes& jpeg)
{
    EXPECT_GE(jpeg.size(), kScanOffset + 2);
    EXPECT_EQ(Bytes(jpeg.end() - 2, jpeg.end()), (Bytes{0xFF, 0xD9}));
    return Bytes(jpeg.begin() + kScanOffset, jpeg.end() - 2);
}

Bytes Slice(const Bytes& b, size_t offset, size_t count) { return Bytes(b.begin() + offset, b.begin() + offset + count); }

TEST(JpegFileLayout, SegmentsOfAOnePixelPicture)
{
    ScratchDir dir;
    const Bytes jpeg = Encode(avpost_test::FlatPicture(1, 1, 133, 133, 133), dir);
    EXPECT_EQ(Slice(jpeg, 0, 20), (Bytes{0xFF, 0xD8, 0xFF, 0xE0, 0, 16, 'J', 'F', 'I', 'F', 0, 1, 1, 0, 0, 1, 0, 1, 0, 0}));
    EXPECT_EQ(Slice(jpeg, kDqtOffset, 5), (Bytes{0xFF, 0xDB, 0, 132, 0x00}));
    EXPECT_EQ(jpeg[kDqtOffset + 69], 0x01);
    EXPECT_EQ(Slice(jpeg, kSof0Offset, 19),
              (Bytes{0xFF, 0xC0, 0, 17, 8, 0, 1, 0, 1, 3, 1, 0x11, 0, 2, 0x11, 1, 3, 0x11, 1}));
    EXPECT_EQ(Slice(jpeg, kDhtOffset, 5), (Bytes{0xFF, 0xC4, 0x01, 0xA2, 0x00}));
    EXPECT_EQ(jpeg[kDhtOffset + 4 + 17 + 12], 0x10);
    EXPECT_EQ(jpeg[kDhtOffset + 4 + 2 * 17 + 12 + 162], 0x01);
    EXPECT_EQ(jpeg[kDhtOffset + 4 + 3 * 17 + 24 + 162], 0x11);
    EXPECT_EQ(Slice(jpeg, kSosOffset, 14), (Bytes{0xFF, 0xDA, 0, 12, 3, 1, 0x00, 2, 0x11, 3, 0x11, 0, 63, 0}));
}

TEST(JpegFileLayout, QuantisationTablesAreTheStandardOnesHalvedInZigzagOrder)
{
    ScratchDir dir;
    const Bytes jpeg = Encode(avpost_test::FlatPicture(8, 8, 0, 0, 0), dir);
    // Zigzag order visits natural indexes 0, 1, 8, 16, 9, 2: luminance 16 11 12 14 12 10 halved.
    EXPECT_EQ(Slice(jpeg, kDqtOffset + 5, 6), (Bytes{8, 6, 6, 7, 6, 5}));
    EXPECT_EQ(jpeg[kDqtOffset + 5 + 63], 50);                                // 99 -> 50
    EXPECT_EQ(Slice(jpeg, kDqtOffset + 70, 6), (Bytes{9, 9, 9, 12, 11, 12}));  // 17 18 18 24 21 24
    EXPECT_EQ(jpeg[kDqtOffset + 70 + 63], 50);
}

// For a grey picture Y is the grey level minus 128 and both chroma blocks are 0, so a flat
// block is its DC code, the DC value's bits and an end-of-block code, and each chroma block
// the code of a zero difference and an end-of-block code.
TEST(JpegScan, FlatBlocksCodeTheirDcAndOneEndOfBlock)
{
    ScratchDir dir;
    // Y = 5: DC category 3 (100) and 101, EOB 1010; chroma 00 00 twice; six one-bits pad.
    const Bytes onePixel = Encode(avpost_test::FlatPicture(1, 1, 133, 133, 133), dir, "1x1");
    EXPECT_EQ(onePixel[kSof0Offset + 5] << 8 | onePixel[kSof0Offset + 6], 1);
    EXPECT_EQ(Scan(onePixel), (Bytes{0x96, 0x80, 0x3F}));

    // The 10 x 10 rows carry 2 padding bytes; repeating the last column and row keeps all four
    // blocks flat, so the three after the first code a zero DC difference.
    const Bytes tenByTen = Encode(avpost_test::FlatPicture(10, 10, 133, 133, 133), dir, "10x10");
    EXPECT_EQ(Scan(tenByTen), (Bytes{0x96, 0x80, 0x0A, 0x00, 0x28, 0x00, 0xA0, 0x0F}));
}

TEST(JpegScan, AByteAlignedScanStillGetsAByteOfOneBits)
{
    // Y = 1: 010 1 1010, chroma 00 00 00 00: exactly two bytes, then FF stuffed as FF 00.
    ScratchDir dir;
    EXPECT_EQ(Scan(Encode(avpost_test::FlatPicture(8, 8, 129, 129, 129), dir)), (Bytes{0x5A, 0x00, 0xFF, 0x00}));
}

TEST(JpegScan, EveryCodedFfIsFollowedByZero)
{
    ScratchDir dir;
    const Bytes scan = Scan(Encode(avpost_test::NoisePicture(48, 40, 7), dir));
    int stuffed = 0;
    for (size_t i = 0; i < scan.size(); ++i) {
        if (scan[i] == 0xFF) {
            ASSERT_LT(i + 1, scan.size());
            EXPECT_EQ(scan[i + 1], 0x00) << "at " << i;
            ++stuffed;
            ++i;
        }
    }
    EXPECT_GT(stuffed, 0);
}

// Pinned when the x86-64 and 32-bit builds agreed: the arithmetic must give the same bytes on
// every build.
TEST(JpegScan, EveryBuildWritesTheSameBytes)
{
    ScratchDir dir;
    uint64_t hash = 14695981039346656037ull;  // FNV-1a
    for (unsigned char b : Encode(avpost_test::NoisePicture(45, 29, 11), dir))
        hash = (hash ^ b) * 1099511628211ull;
    EXPECT_EQ(hash, 2173301848693968694ull);
}

TEST(JpegRefusals, BitmapsItCannotUseWriteNothing)
{
    ScratchDir dir;
    const std::string jpeg = dir.File("out.jpg");
    for (int bitCount : {8, 32}) {
        DibImage image;
        ASSERT_EQ(image.Create(8, 8, bitCount), 1);
        ASSERT_EQ(image.Save(dir.File("in.bmp").c_str()), 1);
        EXPECT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), jpeg.c_str()), 0) << bitCount;
        EXPECT_FALSE(std::filesystem::exists(jpeg)) << bitCount;
    }

    avpost_test::SaveBmp(avpost_test::FlatPicture(10, 10, 1, 2, 3), dir.File("good.bmp"));
    const Bytes good = avpost_test::ReadFile(dir.File("good.bmp"));
    Bytes notBm = good;
    notBm[0] = 'X';
    Bytes huge = Slice(good, 0, 54);
    huge[18] = huge[19] = huge[22] = huge[23] = 0xFF;  // 65535 x 65535 announced, no rows present
    for (const Bytes& bad : {Slice(good, 0, 53), Slice(good, 0, good.size() - 1), notBm, huge}) {
        avpost_test::WriteFile(dir.File("bad.bmp"), bad);
        EXPECT_EQ(BMP2JPEG(dir.File("bad.bmp").c_str(), jpeg.c_str()), 0);
        EXPECT_FALSE(std::filesystem::exists(jpeg));
    }
    EXPECT_EQ(BMP2JPEG(dir.File("absent.bmp").c_str(), jpeg.c_str()), 0);
    EXPECT_EQ(BMP2JPEG(nullptr, jpeg.c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(jpeg));
}

TEST(JpegRefusals, OutputThatCannotBeCreatedStopsTheConversion)
{
    ScratchDir dir;
    avpost_test::SaveBmp(avpost_test::FlatPicture(8, 8, 1, 2, 3), dir.File("in.bmp"));
    EXPECT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), dir.File("missing/out.jpg").c_str()), EOF);
    EXPECT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), nullptr), 0);
}

TEST(JpegRefusals, NamesLongerThan511BytesAreRefused)
{
    ScratchDir dir;
    std::string folder = dir.File(std::string(200, 'd'));
    std::filesystem::create_directories(folder + "/" + std::string(200, 'e'));
    folder += "/" + std::string(200, 'e') + "/";
    const std::string bmp = folder + "in.bmp";
    avpost_test::SaveBmp(avpost_test::FlatPicture(8, 8, 1, 2, 3), bmp);

    const std::string longest = folder + std::string(511 - folder.size(), 'j');
    const std::string tooLong = longest + "j";
    EXPECT_EQ(BMP2JPEG(bmp.c_str(), tooLong.c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(tooLong));
    EXPECT_EQ(BMP2JPEG(bmp.c_str(), longest.c_str()), 0);
    EXPECT_TRUE(std::filesystem::exists(longest));

    const std::string longBmp = folder + std::string(512 - folder.size(), 'b');
    std::filesystem::copy_file(bmp, longBmp);
    EXPECT_EQ(BMP2JPEG(longBmp.c_str(), dir.File("out.jpg").c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(dir.File("out.jpg")));
}

TEST(JpegConcurrency, ConversionsOnTwoThreadsDoNotMix)
{
    ScratchDir dir;
    const Picture pictures[2] = {avpost_test::NoisePicture(40, 24, 1), avpost_test::GradientPicture(24, 40)};
    const Bytes expected[2] = {Encode(pictures[0], dir, "a"), Encode(pictures[1], dir, "b")};
    auto convert = [&](int which) {
        const std::string bmp = dir.File(which == 0 ? "a.bmp" : "b.bmp");
        for (int i = 0; i < 15; ++i) {
            const std::string out = dir.File("t" + std::to_string(which) + "-" + std::to_string(i) + ".jpg");
            BMP2JPEG(bmp.c_str(), out.c_str());
            EXPECT_EQ(avpost_test::ReadFile(out), expected[which]);
        }
    };
    std::thread first(convert, 0);
    std::thread second(convert, 1);
    first.join();
    second.join();
}

TEST(JpegSteps, StepsOutsideAConversionLeaveTheNextOneUnaffected)
{
    writebits({3, 0x5});
    main_encoder();
    ScratchDir dir;
    avpost_test::SaveBmp(avpost_test::FlatPicture(3, 2, 1, 2, 3), dir.File("in.bmp"));
    unsigned short width = 0, height = 0;
    EXPECT_EQ(load_bitmap(dir.File("in.bmp").c_str(), &width, &height), 1);
    EXPECT_EQ(width * 100 + height, 302);
    init_all();
    main_encoder();
    EXPECT_EQ(Scan(Encode(avpost_test::FlatPicture(1, 1, 133, 133, 133), dir)), (Bytes{0x96, 0x80, 0x3F}));
}

TEST(FetchMatrix, CopiesABlockAndFillsOutsideThePlane)
{
    unsigned char plane[5 * 3];
    for (int i = 0; i < 15; ++i)
        plane[i] = static_cast<unsigned char>(200 + i);
    signed char block[64];
    ASSERT_EQ(FetchMatrix(3, 5, plane, block, 2, 1, -7), 1);
    for (int r = 0; r < 8; ++r)
        for (int c = 0; c < 8; ++c) {
            const bool inside = 2 + c < 5 && 1 + r < 3;
            EXPECT_EQ(block[8 * r + c], inside ? static_cast<signed char>(plane[(1 + r) * 5 + 2 + c]) : -7);
        }
    EXPECT_EQ(FetchMatrix(3, 5, plane, block, 5, 0, 0), 0);
    EXPECT_EQ(FetchMatrix(3, 5, plane, block, 0, 3, 0), 0);
    ASSERT_EQ(FetchMatrix(3, 5, plane, block, -6, -7, 1), 1);
    EXPECT_EQ(block[63], static_cast<signed char>(plane[1]));  // (1, 0)
    EXPECT_EQ(block[62], static_cast<signed char>(plane[0]));
    EXPECT_EQ(block[61], 1);
    EXPECT_EQ(block[55], 1);
}

TEST(JpegKernels, QuantisationRoundsHalvesUpward)
{
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(2.5f, 1.0f), 3);
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(-2.5f, 1.0f), -2);
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(-2.51f, 1.0f), -3);
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(-0.5f, 1.0f), 0);
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(100.0f, 0.125f), 13);
    EXPECT_EQ(avpost::detail::QuantizeCoefficient(-1000.0f, 0.0625f), -62);
}

}  // namespace
