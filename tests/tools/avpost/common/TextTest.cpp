#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "tools/avpost/common/Ratio.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"

namespace avpost::tool {
namespace {

TEST(Ratios, FrameRatesAndAspectsBecomeTheFractionsFilesUse)
{
    const struct {
        double rate;
        int64_t num, den;
    } cases[] = {
        {25.0, 25, 1}, {30000.0 / 1001, 30000, 1001}, {24000.0 / 1001, 24000, 1001}, {12.5, 25, 2}, {0.0, 0, 0},
        {-3.0, 0, 0}};
    for (const auto& c : cases)
        EXPECT_EQ(std::tuple(RateFraction(c.rate).num, RateFraction(c.rate).den), std::tie(c.num, c.den)) << c.rate;

    const Ratio display = DisplayAspect(720, 576, {64, 45});
    const Ratio pixel = PixelAspect(720, 576, {16, 9});
    EXPECT_EQ(std::tie(display.num, display.den, pixel.num, pixel.den), std::make_tuple(16, 9, 64, 45));
    EXPECT_FALSE(DisplayAspect(720, 576, {0, 1}).known());
    EXPECT_FALSE(PixelAspect(0, 576, {16, 9}).known());
}

TEST(WidePaths, Utf8RoundTripsThroughWideStringsAndInvalidUtf8IsRefused)
{
    const std::string text = "caf\xC3\xA9/\xE2\x82\xAC/\xF0\x9F\x8E\xA5.y4m";  // é, €, a four-byte character
    const std::wstring wide = WideFromUtf8(text);
    EXPECT_EQ(wide, L"caf\u00E9/\u20AC/\U0001F3A5.y4m");  // one code point per character
    EXPECT_EQ(Utf8FromWide(wide.c_str()), text);
    EXPECT_EQ(Utf8FromWide(nullptr), "");
    // Cut short, a bad continuation, an overlong form, a surrogate, beyond U+10FFFF, a bad lead.
    for (const std::string bad : {"\xC3", "\xC3(", "\xC0\xAF", "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xFF"})
        EXPECT_THROW(WideFromUtf8(bad), ToolError) << bad;
}

}  // namespace
}  // namespace avpost::tool
