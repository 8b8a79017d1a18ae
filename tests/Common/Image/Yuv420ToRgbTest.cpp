#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <random>
#include <ostream>
#include <string>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::Bitmap;
using convert_test::Yuv420Planes;

constexpr unsigned char kFill = 0x5A;

struct Member {
    const char* name;
    int bytes;
    bool bottomUp;
    int fourthByte;  // -1: left as it was
    void (*convert)(Bitmap& rgb, Yuv420Planes& p, tagBITMAPINFOHEADER* header);
};

#define AVPOST_PLANES p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch()
const Member kMembers[] = {
    {"Yuv420_2_rgb24", 3, true, -1,
     [](Bitmap& rgb, Yuv420Planes& p, tagBITMAPINFOHEADER* h) { Yuv420_2_rgb24(h, rgb.plane.Data(), AVPOST_PLANES); }},
    {"Yuv420_2_rgb32", 4, true, -1,
     [](Bitmap& rgb, Yuv420Planes& p, tagBITMAPINFOHEADER* h) { Yuv420_2_rgb32(h, rgb.plane.Data(), AVPOST_PLANES); }},
    {"Yuv420_2_Argb", 4, false, 255,
     [](Bitmap& rgb, Yuv420Planes& p, tagBITMAPINFOHEADER* h) { Yuv420_2_Argb(h, rgb.plane.Data(), AVPOST_PLANES); }},
};

// Names the parameter in test listings instead of dumping its bytes.
void PrintTo(const Member& param, std::ostream* os)
{
    *os << param.name;
}

class YuvToRgbMembers : public ::testing::TestWithParam<Member> {};

// Every pixel is its luma with its block's chroma sample, unfiltered, for blocks, the edge column,
// the edge row and the corner; the row padding and the fourth bytes of rgb32 stay as they were.
// A 1 x 1 picture, its own corner, gives the expected colour of each pixel.
TEST_P(YuvToRgbMembers, ReplicateEachChromaSampleOverItsBlock)
{
    const Member& m = GetParam();
    std::mt19937 random(3);
    for (const auto& [w, h] : {std::pair{1, 1}, {2, 2}, {3, 3}, {5, 3}, {4, 5}, {7, 6}}) {
        SCOPED_TRACE(std::to_string(w) + " x " + std::to_string(h));
        Yuv420Planes yuv(w, h, 0);
        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c) {
                yuv.y.At(c, r) = static_cast<unsigned char>(random());
                yuv.u.At(c / 2, r / 2) = static_cast<unsigned char>(random());
                yuv.v.At(c / 2, r / 2) = static_cast<unsigned char>(random());
            }
        Bitmap rgb(w, h, m.bytes, m.bottomUp, kFill);
        tagBITMAPINFOHEADER header = BitmapHeader(w, h, m.bytes * 8);
        m.convert(rgb, yuv, &header);

        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c) {
                unsigned char one[4] = {};
                tagBITMAPINFOHEADER single = BitmapHeader(1, 1, 24);
                Yuv420_2_rgb24(&single, one, &yuv.y.At(c, r), &yuv.u.At(c / 2, r / 2), &yuv.v.At(c / 2, r / 2), 1, 1,
                               1);
                one[3] = m.fourthByte < 0 ? kFill : static_cast<unsigned char>(m.fourthByte);
                ASSERT_EQ(std::vector<unsigned char>(rgb.Pixel(c, r), rgb.Pixel(c, r) + m.bytes),
                          std::vector<unsigned char>(one, one + m.bytes))
                    << c << "," << r;
            }
        EXPECT_TRUE(rgb.plane.GuardsIntact());
    }
}

INSTANTIATE_TEST_SUITE_P(AllMembers, YuvToRgbMembers, ::testing::ValuesIn(kMembers),
                         [](const ::testing::TestParamInfo<Member>& info) { return std::string(info.param.name); });

TEST(YuvToRgbSimple, ConvertsTheEvenPartThroughThePerPixelPath)
{
    Yuv420Planes yuv(3, 3, 16);
    yuv.y.At(0, 0) = yuv.y.At(1, 1) = 235;
    yuv.u.At(0, 0) = yuv.v.At(0, 0) = 128;
    Bitmap rgb(3, 3, 3, true, kFill);
    tagBITMAPINFOHEADER header = BitmapHeader(3, 3, 24);
    Yuv420_2_rgb24Simple(&header, rgb.plane.Data(), yuv.y.Data(), yuv.u.Data(), yuv.v.Data(), yuv.y.Pitch(),
                         yuv.u.Pitch(), yuv.v.Pitch());
    using Bytes = std::vector<unsigned char>;
    EXPECT_EQ(Bytes(rgb.Pixel(0, 0), rgb.Pixel(0, 0) + 9), (Bytes{255, 255, 255, 0, 0, 0, kFill, kFill, kFill}));
    EXPECT_EQ(Bytes(rgb.Pixel(0, 1), rgb.Pixel(0, 1) + 9), (Bytes{0, 0, 0, 255, 255, 255, kFill, kFill, kFill}));
    EXPECT_EQ(Bytes(rgb.Pixel(0, 2), rgb.Pixel(0, 2) + 9), Bytes(9, kFill));
    EXPECT_TRUE(rgb.plane.GuardsIntact());
}

}  // namespace
