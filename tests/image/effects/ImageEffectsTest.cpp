// The effects worked in place on a picture: adjustments, colour filters and flips, deinterlacing,
// watermark blending, and the scaling of a user watermark.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <functional>
#include <tuple>
#include <vector>

#include "doubles/VideoFrames.h"
#include "image/effects/Deinterlace.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "image/effects/WatermarkResize.h"

namespace {

using Samples = std::vector<int>;

// A packed YUV 4:2:0 picture (with alpha when asked), black, neutral and opaque, whose planes lie
// in one buffer after guard bytes, with guard bytes at the end too, so that a write outside any
// plane shows. The pitch fields stay 0: the effects must not read them.
class GuardedPicture {
public:
    GuardedPicture(int width, int height, bool withAlpha = false)
        : width_{width, (width + 1) / 2, (width + 1) / 2, width}, frame_{0, 0, 0, {}, width, height, {}, {}, 0, 0, 0}
    {
        const int rows[4] = {height, (height + 1) / 2, (height + 1) / 2, withAlpha ? height : 0};
        const unsigned char initial[4] = {16, 128, 128, 255};
        for (int i = 0; i < 5; ++i) {
            bytes_.insert(bytes_.end(), kGuard, kMark);
            offset_[i] = bytes_.size();
            if (i < 4)
                bytes_.insert(bytes_.end(), static_cast<size_t>(width_[i] * rows[i]), initial[i]);
        }
    }

    // The plane pointers are set here, so that a copy of the picture has its own.
    MEDIA_FRAME* frame()
    {
        for (int i = 0; i < 4; ++i)
            frame_.plane[i] = Size(i) != 0 ? &bytes_[offset_[i]] : nullptr;
        return &frame_;
    }
    // Sample (x, y) of plane 0 (Y), 1 (U), 2 (V) or 3 (alpha), in that plane's own coordinates.
    unsigned char& At(int plane, int x, int y) { return bytes_[offset_[plane] + y * width_[plane] + x]; }
    Samples Plane(int i) const { return {&bytes_[offset_[i]], &bytes_[offset_[i]] + Size(i)}; }
    void SetPlane(int i, const Samples& values) { std::copy(values.begin(), values.end(), &At(i, 0, 0)); }
    bool GuardsIntact() const
    {
        return std::all_of(offset_, offset_ + 5, [this](size_t end) { return Intact(end); });
    }

private:
    size_t Size(int i) const { return offset_[i + 1] - kGuard - offset_[i]; }
    bool Intact(size_t end) const { return std::count(&bytes_[end - kGuard], &bytes_[end - 1] + 1, kMark) == kGuard; }

    static constexpr int kGuard = 32;             // bytes before each plane and at the end
    static constexpr unsigned char kMark = 0xA5;  // what they hold
    int width_[4];
    size_t offset_[5] = {};  // where each plane starts, and the end of the buffer
    std::vector<unsigned char> bytes_;
    MEDIA_FRAME frame_;
};

// Y, U and V of a picture `width` wide with these planes after `effect`; the guards must hold.
std::vector<Samples> After(const std::function<void(MEDIA_FRAME*)>& effect, int width,
                           const std::vector<Samples>& planes)
{
    GuardedPicture picture(width, static_cast<int>(planes[0].size()) / width);
    for (int i = 0; i < 3; ++i)
        picture.SetPlane(i, planes[i]);
    effect(picture.frame());
    EXPECT_TRUE(picture.GuardsIntact());
    return {picture.Plane(0), picture.Plane(1), picture.Plane(2)};
}

// A 2 x 4 picture with every luma sample y and chroma sample c, in rows of pitches 3, 2 and 3
// whose padding holds 7, which any adjustment would change.
std::vector<std::vector<unsigned char>> Planes(int luma, int chroma)
{
    const auto y = static_cast<unsigned char>(luma), c = static_cast<unsigned char>(chroma);
    return {{y, y, 7, y, y, 7, y, y, 7, y, y, 7}, {c, 7, c, 7}, {c, 7, 7, c, 7, 7}};
}

TEST(PictureAdjustments, DocumentedValuesClampsOrderAndChromaCoverage)
{
    // Brightness, contrast, saturation; luma before and after; chroma before and after.
    const int cases[][7] = {
        {10, 0, 0, 230, 235, 250, 250},     {-300, 0, 0, 200, 16, 128, 128},  // brightness leaves chroma
        {0, 100, 0, 200, 235, 200, 240},    {0, 100, 0, 100, 72, 100, 72},
        {0, 50, 0, 127, 127, 100, 86},      {0, -100, 0, 17, 128, 240, 128},   // -14 truncated toward 0
        {0, 0, 10, 250, 250, 160, 169},     {0, 0, -10, 50, 50, 160, 157},     // only positive ones tripled
        {0, 0, -100, 50, 50, 20, 128},      {0, 0, 0, 250, 250, 5, 5},         // zero: not even clamped
        {50, 100, 0, 100, 172, 100, 72},    {0, 100, 10, 128, 128, 140, 159},  // in that order
        {INT_MAX, 0, 0, 17, 235, 1, 1},     {INT_MIN, 0, 0, 234, 16, 1, 1},    // extremes saturate
        {0, INT_MAX, 0, 129, 235, 127, 16}, {0, 0, INT_MAX, 0, 0, 129, 240},
    };
    for (const auto& [b, c, s, yIn, yOut, cIn, cOut] : cases) {
        auto planes = Planes(yIn, cIn);
        AdjustImage(planes[0].data(), planes[1].data(), planes[2].data(), 3, 2, 3, 2, 4, b, c, s);
        EXPECT_EQ(planes, Planes(yOut, cOut)) << b << " " << c << " " << s;
    }
    // 5 x 5 has 3 x 3 chroma samples; saturation changes the 2 x 2 under two full luma rows and columns.
    const std::vector<Samples> picture = {Samples(25, 16), Samples(9, 200), Samples(9, 200)};
    EXPECT_EQ(After([](MEDIA_FRAME* f) { AdjustImage(f, 0, 100, 0); }, 5, picture)[1], Samples(9, 240));
    EXPECT_EQ(After([](MEDIA_FRAME* f) { AdjustImage(f, 0, 0, 10); }, 5, picture)[2],
              (Samples{221, 221, 200, 221, 221, 200, 200, 200, 200}));
    AdjustImage(nullptr, 10, 10, 10);
}

TEST(ColourFiltersAndFlips, PlanesAfterEach)
{
    // A 3 x 3 picture; the threshold is above 128. Relief adds 128 minus the neighbour one down
    // and right (128 outside), read before it is changed, and clamps. Each flip undoes itself.
    const Samples luma = {129, 128, 200, 16, 100, 150, 0, 255, 60}, u = {100, 101, 102, 103}, v = {0, 1, 2, 3};
    const std::pair<void (*)(MEDIA_FRAME*), std::vector<Samples>> cases[] = {
        {FilterGray, {luma, Samples(4, 128), Samples(4, 128)}},
        {FilterNegative, {luma, {156, 155, 154, 153}, {0, 255, 254, 253}}},
        {FilterOldPhoto, {luma, Samples(4, 116), Samples(4, 137)}},
        {FilterBlackWhite, {{235, 16, 235, 16, 16, 235, 16, 235, 16}, Samples(4, 128), Samples(4, 128)}},
        {FilterWhiteBlack, {{16, 235, 16, 235, 235, 16, 235, 16, 235}, Samples(4, 128), Samples(4, 128)}},
        {FilterEmboss, {{157, 106, 200, 16, 168, 150, 16, 235, 60}, Samples(4, 128), Samples(4, 128)}},
        {FlipImageHorz, {{200, 128, 129, 150, 100, 16, 60, 255, 0}, {101, 100, 103, 102}, {1, 0, 3, 2}}},
        {FlipImageVert, {{0, 255, 60, 16, 100, 150, 129, 128, 200}, {102, 103, 100, 101}, {2, 3, 0, 1}}},
    };
    for (const auto& [effect, after] : cases) {
        EXPECT_EQ(After(effect, 3, {luma, u, v}), after);
        effect(nullptr);
    }
    for (const auto& [flip, flipped] : {cases[6], cases[7]})
        EXPECT_EQ(After(flip, 3, flipped), (std::vector<Samples>{luma, u, v}));
}

// The planes of a picture 3 wide: luma row k holds luma[k] + column, U row k chroma[k] + column,
// and V one more.
std::vector<Samples> ThreeWide(const Samples& luma, const Samples& chroma)
{
    std::vector<Samples> planes(3);
    for (int i = 0; i < 3; ++i)
        for (int start : i == 0 ? luma : chroma)
            for (int x = 0; x < (i == 0 ? 3 : 2); ++x)
                planes[i].push_back(start + x + (i == 2));
    return planes;
}

TEST(Deinterlace, EachStyleOnOneToFiveRows)
{
    // Style, height and the luma and chroma rows afterwards.
    const Samples luma = {10, 200, 13, 220, 90}, chroma = {100, 7, 180};
    const std::tuple<int, int, Samples, Samples> cases[] = {
        {1, 4, {10, 10, 13, 13}, {100, 100}},
        {1, 5, {10, 10, 13, 13, 90}, {100, 100, 180}},
        {2, 4, {200, 200, 220, 220}, {7, 7}},
        {2, 5, {200, 200, 220, 220, 90}, {7, 7, 180}},
        {3, 4, {10, 11, 13, 220}, {100, 7}},
        {3, 5, {10, 11, 13, 51, 90}, {100, 140, 180}},  // truncating
        {4, 4, {10, 200, 210, 220}, {100, 7}},
        {4, 5, {10, 200, 210, 220, 90}, {100, 7, 180}},
        {0, 5, luma, chroma},
        {5, 5, luma, chroma},
        {-1, 5, luma, chroma},
        {1, 2, {10, 10}, {100}},  // one chroma row
        {4, 2, {10, 200}, {100}},
        {3, 1, {10}, {100}},
    };
    for (const auto& [style, height, lumaAfter, chromaAfter] : cases) {
        auto deinterlace = [style = style](MEDIA_FRAME* f) { DeinterlaceImage(f, DEINTERLACE_STYLE(style)); };
        const Samples lumaBefore(luma.begin(), luma.begin() + height);
        const Samples chromaBefore(chroma.begin(), chroma.begin() + (height + 1) / 2);
        EXPECT_EQ(After(deinterlace, 3, ThreeWide(lumaBefore, chromaBefore)), ThreeWide(lumaAfter, chromaAfter))
            << "style " << style << ", height " << height;
    }
    DeinterlaceImage(nullptr, DEINTERLACE_EVEN_DOUBLE);
}

// An opaque watermark with luma 100 + column + 20 x row and U 50 + column + 10 x row (of chroma).
GuardedPicture Gradient(int width, int height)
{
    GuardedPicture mark(width, height, true);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x) {
            mark.At(0, x, y) = static_cast<unsigned char>(100 + x + 20 * y);
            mark.At(1, x / 2, y / 2) = static_cast<unsigned char>(50 + x / 2 + 10 * (y / 2));
        }
    return mark;
}

TEST(AddWaterMark, LevelsAlphaAndTheTwoRoundings)
{
    // Level, watermark alpha, frame and watermark sample, and the result through a rectangle (one
    // division for every plane), and by alignment: luma (two divisions) and chroma (one).
    const int cases[][7] = {
        {100, 255, 100, 200, 200, 200, 200}, {0, 255, 100, 200, 100, 100, 100},  {100, 0, 100, 200, 100, 100, 100},
        {50, 255, 100, 200, 149, 149, 149},  {50, 255, 1, 1, 1, 0, 1},           {45, 255, 99, 201, 144, 143, 144},
        {150, 255, 100, 200, 200, 200, 200}, {-20, 255, 100, 200, 100, 100, 100}};
    const tagRECT whole{0, 0, 4, 4};
    for (const auto& c : cases) {
        GuardedPicture mark(4, 4, true);  // Y, U and alpha
        for (int plane : {0, 1, 3})
            mark.SetPlane(plane, Samples(plane == 1 ? 4 : 16, plane == 3 ? c[1] : c[3]));
        const std::vector<Samples> frame = {Samples(16, c[2]), Samples(4, c[2]), Samples(4, 128)};
        const auto once = After([&](MEDIA_FRAME* f) { AddWaterMark(f, mark.frame(), &whole, c[0], 0); }, 4, frame);
        const auto aligned = After([&](MEDIA_FRAME* f) { AddWaterMark(f, mark.frame(), nullptr, c[0], 1); }, 4, frame);
        EXPECT_EQ(std::tuple(once[0][5], once[1][3], aligned[0][5], aligned[1][0]), std::tuple(c[4], c[4], c[5], c[6]))
            << "level " << c[0] << ", under " << c[2];
    }
}

TEST(AddWaterMark, RectangleClipsWithoutScalingAndChromaFollowsTheFrame)
{
    // A 16 x 4 watermark in the rectangle (-9, -1) 12 x 100 of an 8 x 4 frame: its columns 9...11
    // of rows 1...3 land. Chroma goes where the frame's column and row are even, from the
    // watermark pixel there.
    GuardedPicture frame(8, 4), mark = Gradient(16, 4);
    const tagRECT rect{-9, -1, 3, 99};
    AddWaterMark(frame.frame(), mark.frame(), &rect, 100, 0);
    EXPECT_EQ(frame.Plane(0), (Samples{129, 130, 131, 16, 16, 16, 16, 16, 149, 150, 151, 16, 16, 16, 16, 16,
                                       169, 170, 171, 16, 16, 16, 16, 16, 16,  16,  16,  16, 16, 16, 16, 16}));
    EXPECT_EQ(frame.Plane(1), (Samples{54, 55, 128, 128, 64, 65, 128, 128}));
    EXPECT_TRUE(frame.GuardsIntact());
    // A negative start inside the watermark, or no watermark, draws nothing.
    const Samples before = frame.Plane(0);
    AddWaterMarkEx(frame.frame(), mark.frame(), 0, 0, -1, -1, -1, 0, 100);
    AddWaterMarkEx(frame.frame(), nullptr, 0, 0, -1, -1, 0, 0, 100);
    EXPECT_EQ(frame.Plane(0), before);
}

TEST(AddWaterMark, AlignmentCodesPlaceTheWatermarkSkipItsLastRowAndClip)
{
    // Frame 10 x 8, watermark 4 x 3: centre (3, 2), right column 6, bottom row 5 (chroma row 3).
    const int positions[][3] = {{0, 3, 2}, {1, 0, 0}, {2, 3, 0}, {3, 6, 0}, {4, 0, 2},  {5, 3, 2},
                                {6, 6, 2}, {7, 0, 5}, {8, 3, 5}, {9, 6, 5}, {42, 0, 0}, {-3, 0, 0}};
    GuardedPicture mark = Gradient(4, 3), large = Gradient(9, 7);
    for (const auto& [align, left, top] : positions) {
        SCOPED_TRACE(testing::Message() << "align " << align);
        GuardedPicture frame(10, 8), small(6, 4);
        AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, align);
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 10; ++x) {
                const int c = x - left, r = y - top;
                const bool drawn = c >= 0 && c < 4 && r >= 0 && r < 2;
                EXPECT_EQ(frame.At(0, x, y), drawn ? 100 + c + 20 * r : 16) << x << "," << y;
                const bool row = y / 2 == (top + 1) / 2, first = x / 2 == left / 2, second = x / 2 == (left + 2) / 2;
                EXPECT_EQ(frame.At(1, x / 2, y / 2), row && first ? 50 : row && second ? 51 : 128) << x << "," << y;
            }
        AddWaterMark(small.frame(), large.frame(), nullptr, 100, align);  // larger than the frame
        EXPECT_TRUE(small.GuardsIntact());
    }
}

TEST(ResizeUserWaterImage, ScalesEveryPlaneAndTakesTheFrameOnlyOnSuccess)
{
    MEDIA_FRAME* original = CreateYV12Frame(8, 6, true, true);
    std::fill_n(original->plane[0], 48 + 12 + 12 + 48, 90);  // Y, V, U and alpha
    FramePtr noAlpha(CreateYV12Frame(8, 6, false, true));
    // A refusal leaves the frame with the caller (it is used again below).
    EXPECT_TRUE(!ResizeUserWaterImage(1, 4, original) && !ResizeUserWaterImage(4, 4, noAlpha.get()) &&
                !ResizeUserWaterImage(4, 4, nullptr));
    FramePtr resized(ResizeUserWaterImage(5, 3, original));
    ASSERT_TRUE(resized && resized->width == 5 && resized->height == 3);
    EXPECT_EQ(Samples(resized->plane[0], resized->plane[0] + 15 + 6 + 6 + 15), Samples(42, 90));
}

}  // namespace
