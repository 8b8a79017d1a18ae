#include "support/TextEncoding.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

namespace {

using Bytes = std::vector<unsigned char>;
constexpr unsigned char kGuard = 0xCD;

struct Converted {
    int result;
    Bytes bytes;  // what was written, up to the first untouched guard byte
};

Converted Convert(const std::vector<unsigned long>& codePoints, size_t capacity, ConversionFlags flags)
{
    Bytes buffer(capacity + 4, kGuard);
    const int result = ConvertUTF32toUTF8(codePoints.data(), codePoints.data() + codePoints.size(),
                                          buffer.data(), buffer.data() + capacity, flags);
    buffer.erase(std::find(buffer.begin(), buffer.end(), kGuard), buffer.end());
    return {result, buffer};
}

TEST(ConvertUTF32toUTF8, EncodesEachSequenceLength)
{
    const struct {
        unsigned long codePoint;
        Bytes bytes;
        int result;
    } cases[] = {
        {0x41, {0x41}, 0}, {0x7F, {0x7F}, 0}, {0x80, {0xC2, 0x80}, 0}, {0xE9, {0xC3, 0xA9}, 0},
        {0x7FF, {0xDF, 0xBF}, 0}, {0x800, {0xE0, 0xA0, 0x80}, 0}, {0x20AC, {0xE2, 0x82, 0xAC}, 0},
        {0xFFFF, {0xEF, 0xBF, 0xBF}, 0}, {0x10000, {0xF0, 0x90, 0x80, 0x80}, 0},
        {0x1F600, {0xF0, 0x9F, 0x98, 0x80}, 0}, {0x10FFFF, {0xF4, 0x8F, 0xBF, 0xBF}, 0},
        {0xD800, {0xED, 0xA0, 0x80}, 0},       // lenient: encoded like any other
        {0x110000, {0xEF, 0xBF, 0xBD}, 3},     // out of range: U+FFFD
        {0xFFFFFFFFul, {0xEF, 0xBF, 0xBD}, 3},
    };
    for (const auto& c : cases) {
        const Converted out = Convert({c.codePoint}, 8, ConversionFlags::Lenient);
        EXPECT_EQ(out.result, c.result) << std::hex << c.codePoint;
        EXPECT_EQ(out.bytes, c.bytes) << std::hex << c.codePoint;
    }
}

TEST(ConvertUTF32toUTF8, StrictModeStopsAtSurrogatesKeepingEarlierBytes)
{
    for (unsigned long surrogate : {0xD800ul, 0xDBFFul, 0xDC00ul, 0xDFFFul}) {
        const Converted out = Convert({0x41, surrogate, 0x42}, 8, ConversionFlags::Strict);
        EXPECT_EQ(out.result, 3);
        EXPECT_EQ(out.bytes, Bytes{0x41});
    }
    const Converted replaced = Convert({0x110000, 0x41}, 8, ConversionFlags::Strict);
    EXPECT_EQ(replaced.result, 3);  // an out-of-range value does not stop the conversion
    EXPECT_EQ(replaced.bytes, (Bytes{0xEF, 0xBF, 0xBD, 0x41}));
}

TEST(ConvertUTF32toUTF8, StopsBeforeACodePointThatDoesNotFit)
{
    const Converted out = Convert({0xE9, 0x20AC, 0}, 3, ConversionFlags::Lenient);
    EXPECT_EQ(out.result, 2);
    EXPECT_EQ(out.bytes, (Bytes{0xC3, 0xA9}));
    EXPECT_EQ(Convert({0x1F600}, 4, ConversionFlags::Lenient).result, 0);
    EXPECT_EQ(Convert({0x1F600}, 3, ConversionFlags::Lenient).bytes, Bytes{});

    const unsigned long a = 0x41;
    EXPECT_EQ(ConvertUTF32toUTF8(nullptr, nullptr, nullptr, nullptr, ConversionFlags::Strict), 3);
    EXPECT_EQ(ConvertUTF32toUTF8(&a, &a + 1, nullptr, nullptr, ConversionFlags::Strict), 2);
}

TEST(WtoUTF8, ConvertsTheWholeStringOrTheGivenLength)
{
    char buffer[8] = {'x', 'x', 'x', 'x', 'x', 'x', 'x', 'x'};
    EXPECT_EQ(WtoUTF8(L"A", -1, buffer, sizeof buffer, true), 0);
    EXPECT_EQ(std::string(buffer, 3), std::string("A\0x", 3));  // the terminator is converted too
    EXPECT_EQ(WtoUTF8(L"\u00E9\u20AC", 1, buffer, sizeof buffer, true), 0);
    EXPECT_EQ(std::string(buffer, 3), std::string("\xC3\xA9x", 3));
}

TEST(WtoUTF8, StrictFlagAndWideCharactersOutOfRange)
{
    const wchar_t surrogate[] = {0xD800, 0};
    const wchar_t negative[] = {static_cast<wchar_t>(-1), 0};
    char buffer[8] = {};
    EXPECT_EQ(WtoUTF8(surrogate, -1, buffer, sizeof buffer, true), 3);
    EXPECT_EQ(buffer[0], 0);
    EXPECT_EQ(WtoUTF8(surrogate, -1, buffer, sizeof buffer, false), 0);
    EXPECT_EQ(std::string(buffer), "\xED\xA0\x80");
    EXPECT_EQ(WtoUTF8(negative, -1, buffer, sizeof buffer, false), 3);
    EXPECT_EQ(std::string(buffer), "\xEF\xBF\xBD");
}

TEST(WtoUTF8, RefusesWhatItCannotUse)
{
    char buffer[4] = {'x', 'x', 'x', 'x'};
    EXPECT_EQ(WtoUTF8(nullptr, -1, buffer, sizeof buffer, false), 3);
    EXPECT_EQ(WtoUTF8(L"abc", -7, buffer, sizeof buffer, false), 0);
    EXPECT_EQ(WtoUTF8(L"abc", -1, buffer, -5, false), 2);
    EXPECT_EQ(WtoUTF8(L"abc", -1, nullptr, 16, false), 2);
    EXPECT_EQ(std::string(buffer, 4), "xxxx");
}

}  // namespace
