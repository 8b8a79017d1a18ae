#include "support/TextEncoding.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

namespace {

using Bytes = std::vector<unsigned char>;
constexpr unsigned char kGuard = 0xCD;

struct Converted {
    int result;
    Bytes bytes;  // the whole destination, including untouched guard bytes
};

Converted Convert(const std::vector<unsigned long>& codePoints, size_t capacity, ConversionFlags flags)
{
    Bytes buffer(capacity + 4, kGuard);
    const int result = ConvertUTF32toUTF8(codePoints.data(), codePoints.data() + codePoints.size(),
                                          buffer.data(), buffer.data() + capacity, flags);
    return {result, buffer};
}

Bytes WithGuards(Bytes written, size_t total)
{
    written.resize(total, kGuard);
    return written;
}

struct CodePointCase {
    unsigned long codePoint;
    Bytes lenient;  // also the strict bytes unless the code point is a surrogate
    int lenientResult;
};

TEST(ConvertUTF32toUTF8, EncodesEachSequenceLength)
{
    const CodePointCase cases[] = {
        {0x41, {0x41}, 0},
        {0x7F, {0x7F}, 0},
        {0x80, {0xC2, 0x80}, 0},
        {0xE9, {0xC3, 0xA9}, 0},
        {0x7FF, {0xDF, 0xBF}, 0},
        {0x800, {0xE0, 0xA0, 0x80}, 0},
        {0x20AC, {0xE2, 0x82, 0xAC}, 0},
        {0xD800, {0xED, 0xA0, 0x80}, 0},
        {0xFFFF, {0xEF, 0xBF, 0xBF}, 0},
        {0x10000, {0xF0, 0x90, 0x80, 0x80}, 0},
        {0x1F600, {0xF0, 0x9F, 0x98, 0x80}, 0},
        {0x10FFFF, {0xF4, 0x8F, 0xBF, 0xBF}, 0},
        {0x110000, {0xEF, 0xBF, 0xBD}, 3},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.codePoint);
        const Converted out = Convert({c.codePoint}, 8, ConversionFlags::Lenient);
        EXPECT_EQ(out.result, c.lenientResult);
        EXPECT_EQ(out.bytes, WithGuards(c.lenient, 12));
    }
}

TEST(ConvertUTF32toUTF8, StrictModeStopsAtSurrogatesKeepingEarlierBytes)
{
    for (unsigned long surrogate : {0xD800ul, 0xDBFFul, 0xDC00ul, 0xDFFFul}) {
        const Converted out = Convert({0x41, surrogate, 0x42}, 8, ConversionFlags::Strict);
        EXPECT_EQ(out.result, 3);
        EXPECT_EQ(out.bytes, WithGuards({0x41}, 12));
    }
}

TEST(ConvertUTF32toUTF8, ValueAboveRangeIsReplacedAndTheRestConverted)
{
    const Converted out = Convert({0x110000, 0x41, 0xFFFFFFFFul}, 16, ConversionFlags::Strict);
    EXPECT_EQ(out.result, 3);
    EXPECT_EQ(out.bytes, WithGuards({0xEF, 0xBF, 0xBD, 0x41, 0xEF, 0xBF, 0xBD}, 20));
}

TEST(ConvertUTF32toUTF8, StopsBeforeACodePointThatDoesNotFit)
{
    // e-acute fits in 3 bytes, the euro sign behind it does not; nothing of it is written.
    const Converted out = Convert({0xE9, 0x20AC, 0}, 3, ConversionFlags::Lenient);
    EXPECT_EQ(out.result, 2);
    EXPECT_EQ(out.bytes, WithGuards({0xC3, 0xA9}, 7));

    const Converted exact = Convert({0x1F600}, 4, ConversionFlags::Lenient);
    EXPECT_EQ(exact.result, 0);
    EXPECT_EQ(Convert({0x1F600}, 3, ConversionFlags::Lenient).bytes, WithGuards({}, 7));
}

TEST(ConvertUTF32toUTF8, NullOrEmptyArguments)
{
    unsigned char byte = kGuard;
    EXPECT_EQ(ConvertUTF32toUTF8(nullptr, nullptr, &byte, &byte + 1, ConversionFlags::Strict), 3);
    const unsigned long a = 0x41;
    EXPECT_EQ(ConvertUTF32toUTF8(&a, &a + 1, nullptr, nullptr, ConversionFlags::Strict), 2);
    EXPECT_EQ(ConvertUTF32toUTF8(&a, &a, &byte, &byte + 1, ConversionFlags::Strict), 0);
    EXPECT_EQ(byte, kGuard);
}

TEST(WtoUTF8, WholeStringIncludesTheTerminator)
{
    char buffer[8];
    std::fill(std::begin(buffer), std::end(buffer), '\x7E');
    EXPECT_EQ(WtoUTF8(L"A", -1, buffer, sizeof buffer, true), 0);
    EXPECT_EQ(std::string(buffer, 3), std::string("A\0\x7E", 3));
}

TEST(WtoUTF8, ExplicitLengthConvertsOnlyThatMany)
{
    char buffer[8] = {};
    EXPECT_EQ(WtoUTF8(L"\u00E9\u20AC", 1, buffer, sizeof buffer, true), 0);
    EXPECT_EQ(std::string(buffer), "\xC3\xA9");
}

TEST(WtoUTF8, StrictFlagSelectsSurrogateHandling)
{
    const wchar_t surrogate[] = {0xD800, 0};
    char buffer[8] = {};
    EXPECT_EQ(WtoUTF8(surrogate, -1, buffer, sizeof buffer, true), 3);
    EXPECT_EQ(buffer[0], 0);
    EXPECT_EQ(WtoUTF8(surrogate, -1, buffer, sizeof buffer, false), 0);
    EXPECT_EQ(std::string(buffer), "\xED\xA0\x80");
}

TEST(WtoUTF8, NegativeWideCharacterIsOutOfRange)
{
    const wchar_t text[] = {static_cast<wchar_t>(-1), 0};
    char buffer[8] = {};
    EXPECT_EQ(WtoUTF8(text, -1, buffer, sizeof buffer, false), 3);
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
