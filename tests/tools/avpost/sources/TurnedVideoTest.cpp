#include <gtest/gtest.h>

#include <string>

#include "tools/avpost/sources/TurnedVideo.h"

namespace avpost::tool {
namespace {

// A picture whose every sample says where it is: luma 16 * y + x, chroma 100 + 10 * y + x
// (U) and 200 + 10 * y + x (V) on the chroma grid.
VideoFramePtr NumberedPicture(int width, int height)
{
    VideoFramePtr picture(CreateYV12Frame(width, height, false, false));
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            picture->plane[0][y * picture->pitch[0] + x] = static_cast<unsigned char>(16 * y + x);
    for (int y = 0; y < (height + 1) / 2; ++y)
        for (int x = 0; x < (width + 1) / 2; ++x) {
            picture->plane[1][y * picture->pitch[1] + x] = static_cast<unsigned char>(100 + 10 * y + x);
            picture->plane[2][y * picture->pitch[2] + x] = static_cast<unsigned char>(200 + 10 * y + x);
        }
    return picture;
}

std::string Plane(const MEDIA_FRAME& picture, int plane)
{
    const int width = plane == 0 ? picture.width : (picture.width + 1) / 2;
    const int height = plane == 0 ? picture.height : (picture.height + 1) / 2;
    std::string samples;
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            samples += std::to_string(picture.plane[plane][y * picture.pitch[plane] + x]) + (x + 1 < width ? " " : "/");
    return samples;
}

TEST(TurnedPictures, QuarterTurnsMoveEverySampleOfEveryPlane)
{
    // 4 x 2 luma (chroma 2 x 1):  0 1 2 3 / 16 17 18 19, U 100 101, V 200 201.
    const VideoFramePtr in = NumberedPicture(4, 2);
    const struct {
        int degrees;
        const char* luma;
        const char* u;
        const char* v;
    } cases[] = {
        {90, "16 0/17 1/18 2/19 3/", "100/101/", "200/201/"},
        {180, "19 18 17 16/3 2 1 0/", "101 100/", "201 200/"},
        {270, "3 19/2 18/1 17/0 16/", "101/100/", "201/200/"},
    };
    for (const auto& c : cases) {
        const bool quarter = c.degrees != 180;
        VideoFramePtr out(CreateYV12Frame(quarter ? 2 : 4, quarter ? 4 : 2, false, false));
        TurnPicture(*in, *out, c.degrees);
        EXPECT_EQ(Plane(*out, 0), c.luma) << c.degrees;
        EXPECT_EQ(Plane(*out, 1), c.u) << c.degrees;
        EXPECT_EQ(Plane(*out, 2), c.v) << c.degrees;
    }
}

}  // namespace
}  // namespace avpost::tool
