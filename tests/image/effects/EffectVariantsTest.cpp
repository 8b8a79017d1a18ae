// The picture effects give the same bytes at every instruction-set level: the adjustments are
// checked against the documented steps for every sample value over whole ranges of strengths,
// the other effects against the reference on random pictures of many sizes and alignments.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <climits>
#include <cstdint>
#include <string>
#include <vector>

#include "doubles/LevelComparison.h"
#include "image/effects/Deinterlace.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"

namespace {

using Bytes = std::vector<unsigned char>;

// The documented steps on one sample, in 64 bits as they are defined.
int Clamped(int64_t value, int low, int high) { return static_cast<int>(std::clamp<int64_t>(value, low, high)); }

int Stretched(int value, int64_t percent, int low, int high)
{
    return Clamped(value + (value - 128) * percent / 100, low, high);
}

// 67 x 17 pixels: every luma value appears, and every chroma value under full 2 x 2 blocks (33 x 8
// samples, wider than one 32-byte step); the last chroma column and row take other values.
struct AdjustPicture {
    static constexpr int kWidth = 67, kHeight = 17, kChroma = 34, kChromaRows = 9;
    Bytes y = Bytes(kWidth * kHeight), u = Bytes(kChroma * kChromaRows), v = u;

    AdjustPicture()
    {
        for (size_t i = 0; i < y.size(); ++i)
            y[i] = static_cast<unsigned char>(i * 7);
        for (size_t i = 0; i < u.size(); ++i) {
            u[i] = static_cast<unsigned char>(i);
            v[i] = static_cast<unsigned char>(255 - i * 3);
        }
    }

    // The documented sequence: brightness, contrast (all chroma), saturation (chroma under full
    // blocks only), each skipped at 0.
    void Model(int b, int c, int s)
    {
        for (unsigned char& sample : y) {
            int value = b != 0 ? Clamped(int64_t{sample} + b, 16, 235) : sample;
            sample = static_cast<unsigned char>(c != 0 ? Stretched(value, c, 16, 235) : value);
        }
        const int64_t saturation = s > 0 ? 3 * int64_t{s} : s;
        for (Bytes* plane : {&u, &v})
            for (int i = 0; i < kChroma * kChromaRows; ++i) {
                int value = (*plane)[i];
                if (c != 0)
                    value = Stretched(value, c, 16, 240);
                if (s != 0 && i % kChroma < kWidth / 2 && i / kChroma < kHeight / 2)
                    value = Stretched(value, saturation, 16, 240);
                (*plane)[i] = static_cast<unsigned char>(value);
            }
    }

    void Adjust(int b, int c, int s)
    {
        AdjustImage(y.data(), u.data(), v.data(), kWidth, kChroma, kChroma, kWidth, kHeight, b, c, s);
    }

    bool operator==(const AdjustPicture& other) const { return y == other.y && u == other.u && v == other.v; }
};

// Every level's AdjustImage against the documented sequence, for each strength triple.
void ExpectDocumentedAdjustments(const std::vector<std::array<int, 3>>& strengths)
{
    const std::vector<avpost::simd::Level> levels = AvailableSimdLevels();
    for (const auto& [b, c, s] : strengths) {
        AdjustPicture expected;
        expected.Model(b, c, s);
        for (avpost::simd::Level level : levels) {
            avpost::simd::ScopedLevel pin(level);
            AdjustPicture adjusted;
            adjusted.Adjust(b, c, s);
            ASSERT_TRUE(adjusted == expected) << avpost::simd::NameOf(level) << ": " << b << ", " << c << ", " << s;
        }
    }
}

std::vector<int> Range(int first, int last)
{
    std::vector<int> values;
    for (int value = first; value <= last; ++value)
        values.push_back(value);
    return values;
}

// Strengths around every boundary of the arithmetic: the percent's hundreds, the stretch factor's
// sign change at -100, the distances that reach the clamp, and the extremes.
const std::vector<int> kEdges = {INT_MIN, -1000000, -12901, -12900, -12899, -4301,   -4300,  -201, -200,
                                 -199,    -101,     -100,   -99,    -1,     1,       99,     100,  101,
                                 12699,   12700,    12701,  4233,   4234,   1000000, INT_MAX};

TEST(AdjustVariants, EachStrengthAloneOverItsRange)
{
    std::vector<std::array<int, 3>> strengths;
    for (int value : Range(-1000, 1000))
        strengths.push_back({value, 0, 0});
    for (int value : Range(-1500, 1500))
        strengths.push_back({0, value, 0});
    for (int value : Range(-1500, 1500))
        strengths.push_back({0, 0, value});
    for (int value : kEdges) {
        strengths.push_back({value, 0, 0});
        strengths.push_back({0, value, 0});
        strengths.push_back({0, 0, value});
    }
    ExpectDocumentedAdjustments(strengths);
}

// Each pair of strengths: one from around the boundaries, the other over a range.
std::vector<std::array<int, 3>> Pairs(int first, int second)
{
    const std::vector<int> some = {-256, -255, -130, -101, -100, -99, -37, -1, 1, 13, 99, 100, 101, 255, 256, 12800};
    std::vector<std::array<int, 3>> strengths;
    for (int a : some)
        for (int b : Range(-120, 120)) {
            std::array<int, 3> triple{};
            triple[first] = a;
            triple[second] = b;
            strengths.push_back(triple);
        }
    return strengths;
}

TEST(AdjustVariants, BrightnessWithContrast)
{
    ExpectDocumentedAdjustments(Pairs(0, 1));
    ExpectDocumentedAdjustments(Pairs(1, 0));
}

TEST(AdjustVariants, ContrastWithSaturation)
{
    ExpectDocumentedAdjustments(Pairs(1, 2));
    ExpectDocumentedAdjustments(Pairs(2, 1));
}

TEST(AdjustVariants, AllThreeAtTheEdges)
{
    std::vector<std::array<int, 3>> strengths;
    for (int b : kEdges)
        for (int c : kEdges)
            for (int s : {INT_MIN, -100, -33, 34, INT_MAX})
                strengths.push_back({b, c, s});
    ExpectDocumentedAdjustments(strengths);
}

// A frame whose packed planes, and alpha plane when asked for, are guarded buffers of a scene
// (destinations when the work writes them).
MEDIA_FRAME GuardedFrame(SceneBuffers& buffers, int width, int height, bool withAlpha, bool destination)
{
    auto plane = [&](size_t size) { return destination ? buffers.Destination(size) : buffers.Source(size); };
    MEDIA_FRAME frame{};
    frame.type = 2;
    frame.width = width;
    frame.height = height;
    const size_t luma = static_cast<size_t>(width) * height;
    const size_t chroma = static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
    frame.plane[0] = plane(luma);
    frame.plane[1] = plane(chroma);
    frame.plane[2] = plane(chroma);
    frame.plane[3] = withAlpha ? plane(luma) : nullptr;
    return frame;
}

struct Effect {
    const char* name;
    void (*apply)(MEDIA_FRAME*);
};

void PrintTo(const Effect& effect, std::ostream* os) { *os << effect.name; }
class InPlaceEffectVariants : public ::testing::TestWithParam<Effect> {};

// Taller pictures than the scenes', so that every deinterlacing style rebuilds chroma rows too.
TEST_P(InPlaceEffectVariants, GiveTheReferenceBytesAtEveryLevel)
{
    const auto apply = GetParam().apply;
    for (const Scene& scene : VariantScenes()) {
        const std::string difference = DifferenceFromReference(
            [apply](SceneBuffers& buffers, const Scene& s) {
                MEDIA_FRAME frame = GuardedFrame(buffers, s.width, s.height + 4, false, true);
                apply(&frame);
            },
            scene);
        ASSERT_TRUE(difference.empty()) << scene.width << " x " << scene.height + 4 << ", offset " << scene.offset
                                        << ": " << difference;
    }
}

const Effect kEffects[] = {
    {"FilterEmboss", FilterEmboss},
    {"FilterNegative", FilterNegative},
    {"FilterBlackWhite", FilterBlackWhite},
    {"FilterWhiteBlack", FilterWhiteBlack},
    {"FlipImageHorz", FlipImageHorz},
    {"FlipImageVert", FlipImageVert},
    {"EvenDouble", [](MEDIA_FRAME* f) { DeinterlaceImage(f, DEINTERLACE_EVEN_DOUBLE); }},
    {"OddDouble", [](MEDIA_FRAME* f) { DeinterlaceImage(f, DEINTERLACE_ODD_DOUBLE); }},
    {"EvenInterpolate", [](MEDIA_FRAME* f) { DeinterlaceImage(f, DEINTERLACE_EVEN_INTERPOLATE); }},
    {"OddInterpolate", [](MEDIA_FRAME* f) { DeinterlaceImage(f, DEINTERLACE_ODD_INTERPOLATE); }},
    {"AdjustImage", [](MEDIA_FRAME* f) { AdjustImage(f, -9, 33, 41); }},
};

INSTANTIATE_TEST_SUITE_P(Effects, InPlaceEffectVariants, ::testing::ValuesIn(kEffects),
                         [](const auto& test) { return std::string(test.param.name); });

// Watermarks of other sizes than the frame, at positions that vary with the seed (partly outside
// the frame, odd and even), through both blending paths, at levels that include the extremes.
TEST(WatermarkVariants, GiveTheReferenceBytesAtEveryLevel)
{
    for (const Scene& scene : VariantScenes()) {
        const std::string difference = DifferenceFromReference(
            [](SceneBuffers& buffers, const Scene& s) {
                // Wide enough for the chroma kernels' steps of 32 samples, narrow ones included.
                const int width = s.width + 64, height = s.height + 4;
                MEDIA_FRAME frame = GuardedFrame(buffers, width, height, false, true);
                const int markWidth = width - static_cast<int>(s.seed * 7 % 71);
                const int markHeight = 1 + static_cast<int>(s.seed % 9);
                MEDIA_FRAME mark = GuardedFrame(buffers, markWidth, markHeight, true, false);
                const int x = static_cast<int>(s.seed % 11) - 5;
                const int y = static_cast<int>(s.seed / 3 % 5) - 2;
                const int level = static_cast<int>(s.seed * 37 % 120);
                AddWaterMarkEx(&frame, &mark, x, y, -1, -1, static_cast<int>(s.seed % 3), 0, level);
                AddWaterMarkEx(&frame, &mark, x + 3, y, width / 2, height, 0, 1, 100);
                AddWaterMark(&frame, &mark, nullptr, level, static_cast<int>(s.seed % 10));
                const tagRECT rect{-x, y, width, height};
                AddWaterMark(&frame, &mark, &rect, 100 - level, 0);
            },
            scene);
        ASSERT_TRUE(difference.empty()) << scene.width + 64 << " x " << scene.height + 4 << ", offset " << scene.offset
                                        << ": " << difference;
    }
}

}  // namespace
