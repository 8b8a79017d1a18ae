#include "support/TextEncoding.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using Bytes = std::vector<unsigned char>;
constexpr auto kStrict = ConversionFlags::Strict, kLenient = ConversionFlags::Lenient;

TEST(ConvertUTF32toUTF8, SequenceLengthsReplacementsAndTruncation)
{
    const struct {
        std::vector<unsigned long> in;
        size_t room;
        ConversionFlags flags;
        int result;
        Bytes out;
    } cases[] = {
        {{0x7F, 0x80, 0x7FF, 0x800}, 8, kStrict, 0, {0x7F, 0xC2, 0x80, 0xDF, 0xBF, 0xE0, 0xA0, 0x80}},
        {{0xFFFF, 0x10000}, 8, kStrict, 0, {0xEF, 0xBF, 0xBF, 0xF0, 0x90, 0x80, 0x80}},
        {{0xD800, 0x10FFFF}, 8, kLenient, 0, {0xED, 0xA0, 0x80, 0xF4, 0x8F, 0xBF, 0xBF}},
        {{0x41, 0xD800, 0x42}, 8, kStrict, 3, {0x41}},  // strict stops at a surrogate
        {{0xD7FF, 0xE000, 0xDFFF}, 8, kStrict, 3, {0xED, 0x9F, 0xBF, 0xEE, 0x80, 0x80}},
        {{0x110000, 0x41}, 8, kStrict, 3, {0xEF, 0xBF, 0xBD, 0x41}},  // replaced, conversion goes on
        {{0xE9, 0x1F600}, 6, kStrict, 0, {0xC3, 0xA9, 0xF0, 0x9F, 0x98, 0x80}},
        {{0xE9, 0x1F600}, 5, kStrict, 2, {0xC3, 0xA9}},  // what does not fit is not begun
    };
    for (const auto& c : cases) {
        Bytes out(c.room + 4, 0xCD), expected = c.out;  // guard bytes beyond the room given
        expected.resize(out.size(), 0xCD);
        EXPECT_EQ(ConvertUTF32toUTF8(c.in.data(), c.in.data() + c.in.size(), out.data(), out.data() + c.room, c.flags),
                  c.result)
            << std::hex << c.in[0];
        EXPECT_EQ(out, expected) << std::hex << c.in[0];
    }
    const unsigned long a = 0x41;
    unsigned char room[4];
    EXPECT_EQ(ConvertUTF32toUTF8(nullptr, nullptr, room, room + 4, kLenient), 3);
    EXPECT_EQ(ConvertUTF32toUTF8(&a, &a + 1, nullptr, room + 4, kLenient), 2);  // no target: no room
}

TEST(WtoUTF8, LengthStrictnessAndRefusals)
{
    char buffer[8] = "xxxxxxx";
    EXPECT_EQ(WtoUTF8(L"\u00E9\u20AC", 1, buffer, 8, true), 0);
    EXPECT_EQ(std::string(buffer), "\xC3\xA9xxxxx");
    EXPECT_EQ(WtoUTF8(L"A", -1, buffer, 8, true), 0);  // the terminator is converted too
    EXPECT_EQ(std::string(buffer), "A");
    const wchar_t odd[] = {0xD800, static_cast<wchar_t>(-1), 0};
    EXPECT_EQ(WtoUTF8(odd, -1, buffer, 8, true), 3);
    EXPECT_EQ(WtoUTF8(odd, -1, buffer, 8, false), 3);  // a negative wide character is out of range
    EXPECT_EQ(std::string(buffer), "\xED\xA0\x80\xEF\xBF\xBD");
    EXPECT_EQ(WtoUTF8(nullptr, -1, buffer, 8, false), 3);
    EXPECT_EQ(WtoUTF8(L"abc", -7, buffer, 8, false), 0);
    EXPECT_EQ(WtoUTF8(L"abc", -1, buffer, -5, false), 2);
    EXPECT_EQ(WtoUTF8(L"abc", -1, nullptr, 16, false), 2);
    EXPECT_EQ(std::string(buffer), "\xED\xA0\x80\xEF\xBF\xBD");  // none of the refused calls wrote
}

}  // namespace
