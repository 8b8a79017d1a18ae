#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <functional>
#include <ostream>
#include <string>

#include "Common/Image/ConvertTestSupport.h"

namespace {


// The whole of standard error: one line naming the module, a line number and the expression.
std::string FailureLine(const std::string& expression)
{
    std::string escaped;
    for (char ch : expression) {
        if (std::string("\\.*+?()[]{}|^$").find(ch) != std::string::npos)
            escaped += '\\';
        escaped += ch;
    }
    return "^Common/Image/ImageConvert:[0-9]+: failed assertion `" + escaped + "'\n$";
}

unsigned char g_bytes[64];
unsigned char* const b = g_bytes;
tagBITMAPINFOHEADER g_rgb24 = BitmapHeader(2, 2, 24);
tagBITMAPINFOHEADER g_rgb32 = BitmapHeader(2, 2, 32);

struct Case {
    const char* name;
    std::function<void()> call;
    const char* expression;
};

const char* const kSrc24 = "lpSrcBmi && lpSrcBmi->biBitCount == 24";
const char* const kSrc32 = "lpSrcBmi && lpSrcBmi->biBitCount == 32";
const char* const kDst24 = "lpDstBmi && lpDstBmi->biBitCount == 24";
const char* const kDst32 = "lpDstBmi && lpDstBmi->biBitCount == 32";
const char* const kSrcBuffers = "lpSrcBits && pY && pU && pV";
const char* const kDstBuffers = "lpDstBits && pY && pU && pV";
const char* const kPackedBuffers = "lpBitsDst && lpBitsSrc";

// Where both checks of a member would fail, the first one is reported.
const Case kCases[] = {
    {"Rgb24NullHeader", [] { Rgb24_2_yuv420(b, b, b, 2, 1, 1, nullptr, nullptr); }, kSrc24},
    {"Rgb24WrongDepth", [] { Rgb24_2_yuv420(b, b, b, 2, 1, 1, &g_rgb32, nullptr); }, kSrc24},
    {"Rgb24NullV", [] { Rgb24_2_yuv420(b, b, nullptr, 2, 1, 1, &g_rgb24, b); }, kSrcBuffers},
    {"Rgb32WrongDepth", [] { Rgb32_2_yuv420(b, b, b, 2, 1, 1, &g_rgb24, nullptr); }, kSrc32},
    {"Rgb32NullBits", [] { Rgb32_2_yuv420(b, b, b, 2, 1, 1, &g_rgb32, nullptr); }, kSrcBuffers},
    {"ToRgb24WrongDepth", [] { Yuv420_2_rgb24(&g_rgb32, nullptr, b, b, b, 2, 1, 1); }, kDst24},
    {"ToRgb24NullY", [] { Yuv420_2_rgb24(&g_rgb24, b, nullptr, b, b, 2, 1, 1); }, kDstBuffers},
    {"ToRgb32NullHeader", [] { Yuv420_2_rgb32(nullptr, b, b, b, b, 2, 1, 1); }, kDst32},
    {"ToRgb32NullU", [] { Yuv420_2_rgb32(&g_rgb32, b, b, nullptr, b, 2, 1, 1); }, kDstBuffers},
    {"ArgbWrongDepth", [] { Argb_2_yuv420(b, b, b, 2, 1, 1, &g_rgb24, b); }, kSrc32},
    {"ArgbNullBits", [] { Argb_2_yuv420(b, b, b, 2, 1, 1, &g_rgb32, nullptr); }, kSrcBuffers},
    {"ExNullY", [] { Rgb32_2_yuv420_Ex(nullptr, b, b, 2, 1, 1, b, 2, 2, 8); }, kSrcBuffers},
    {"AlphaBottomUpWrongDepth", [] { Rgb32_2_yuv420A(b, b, b, b, 2, 1, 1, &g_rgb24, b, 1); }, kSrc32},
    {"AlphaBottomUpNullBits", [] { Rgb32_2_yuv420A(b, b, b, b, 2, 1, 1, &g_rgb32, nullptr, 1); }, kSrcBuffers},
    {"AlphaRNullHeader", [] { Rgb32_2_yuv420A_R(b, b, b, b, 2, 1, 1, nullptr, b); }, kSrc32},
    {"AlphaRNullU", [] { Rgb32_2_yuv420A_R(b, nullptr, b, b, 2, 1, 1, &g_rgb32, b); }, kSrcBuffers},
    {"ToArgbWrongDepth", [] { Yuv420_2_Argb(&g_rgb24, b, b, b, b, 2, 1, 1); }, kDst32},
    {"ToArgbNullBits", [] { Yuv420_2_Argb(&g_rgb32, nullptr, b, b, b, 2, 1, 1); }, kDstBuffers},
    // V samples at chroma column 5 lie beyond pV + (0 + 2) * 1.
    {"PackedToPlanarBeyondV", [] { YUY2_2_Yuv420(b, b, b, 16, 1, 1, 10, 0, 2, 2, b, 4, 1, 0, 0); },
     "(char*)V <= ((char*)pV + (ySrc + cy) * nPt_V)"},
    // With rows going down in memory the first chroma row holds the highest V address.
    {"PackedToPlanarUpwardV", [] { YUY2_2_Yuv420(b, b, b + 32, 16, 1, -1, 0, 0, 2, 4, b, 4, 1, 0, -3); },
     "(char*)V <= ((char*)pV + (ySrc + cy) * nPt_V)"},
    {"PackedToRgbNullDst", [] { YUY2_2_Rgb24(nullptr, 2, 8, 0, 0, 2, 2, b, 4, 1, 0, 0); }, kPackedBuffers},
    {"RgbToPackedNullSrc", [] { Rgb24_2_YUY2(b, 8, 0, 0, 2, 2, 1, nullptr, 2, 8, 0, 0); }, kPackedBuffers},
    {"RgbToPackedNarrowDst", [] { Rgb24_2_YUY2(b, 8, 1, 0, 4, 1, 1, b, 1, 30, 0, 0); },
     "(xDst + cxDst) * 2 <= nPitchDst"},
    {"RgbToPackedNarrowSrc", [] { Rgb24_2_YUY2(b, 32, 0, 0, 9, 1, 1, b, 1, 30, 2, 0); },
     "nPitchSrc / 3 - xSrc >= cxDst"},
};

// Names the parameter in test listings instead of dumping its bytes.
void PrintTo(const Case& param, std::ostream* os)
{
    *os << param.name;
}

class FailedPreconditions : public ::testing::TestWithParam<Case> {};

TEST_P(FailedPreconditions, PrintTheExpressionAndAbort)
{
    EXPECT_DEATH(GetParam().call(), FailureLine(GetParam().expression));
}

INSTANTIATE_TEST_SUITE_P(AllChecks, FailedPreconditions, ::testing::ValuesIn(kCases),
                         [](const ::testing::TestParamInfo<Case>& info) { return std::string(info.param.name); });

TEST(PassedPreconditions, BoundaryValuesConvert)
{
    unsigned char dst[32] = {};
    unsigned char src[30] = {};
    // (1 + 3) * 2 == 8 and 30 / 3 - 2 == 8 >= 8: both limits met exactly.
    Rgb24_2_YUY2(dst, 8, 1, 0, 3, 1, 1, src, 1, 30, 2, 0);
    Rgb24_2_YUY2(dst, 16, 0, 0, 8, 1, 1, src, 1, 30, 2, 0);
    EXPECT_EQ(dst[0], 16);
    // The last V sample lands exactly on pV + (ySrc + cy) * nPitchV.
    unsigned char packed[8] = {};
    YUY2_2_Yuv420(dst, dst + 8, dst + 16, 4, 1, 1, 4, 0, 2, 2, packed, 4, 1, 0, 0);
}

}  // namespace
