#include "support/TextEncoding.h"

#include <cstddef>
#include <cwchar>

namespace {

constexpr int kConversionOk = 0;
constexpr int kTargetExhausted = 2;
constexpr int kSourceIllegal = 3;

constexpr unsigned long kReplacementCharacter = 0xFFFD;
constexpr unsigned long kLastCodePoint = 0x10FFFF;
constexpr unsigned long kFirstSurrogate = 0xD800;
constexpr unsigned long kLastSurrogate = 0xDFFF;

// Lead-byte marks indexed by the length of the sequence.
constexpr unsigned char firstByteMark[7] = {0x00, 0x00, 0xC0, 0xE0, 0xF0, 0xF8, 0xFC};

int SequenceLength(unsigned long c)
{
    if (c <= 0x7F)
        return 1;
    if (c <= 0x7FF)
        return 2;
    if (c <= 0xFFFF)
        return 3;
    return 4;
}

// wchar_t is a signed 32-bit type and unsigned long may be wider, so every code unit is read
// through its own type and widened here; negative wide characters become values above U+10FFFF.
unsigned long CodePointOf(unsigned long unit) { return unit; }
unsigned long CodePointOf(wchar_t unit) { return static_cast<uint32_t>(unit); }

template <typename CodeUnit>
int ConvertCodePoints(const CodeUnit* source, const CodeUnit* sourceEnd, unsigned char* target,
                      const unsigned char* targetEnd, ConversionFlags flags)
{
    int result = kConversionOk;
    for (; source < sourceEnd; ++source) {
        unsigned long c = CodePointOf(*source);
        if (flags == ConversionFlags::Strict && c >= kFirstSurrogate && c <= kLastSurrogate)
            return kSourceIllegal;
        if (c > kLastCodePoint) {
            c = kReplacementCharacter;
            result = kSourceIllegal;
        }
        const int length = SequenceLength(c);
        if (targetEnd - target < length)
            return kTargetExhausted;
        for (int i = length - 1; i > 0; --i) {
            target[i] = static_cast<unsigned char>(0x80 | (c & 0x3F));
            c >>= 6;
        }
        target[0] = static_cast<unsigned char>(firstByteMark[length] | c);
        target += length;
    }
    return result;
}

}  // namespace

int ConvertUTF32toUTF8(const unsigned long* source, const unsigned long* sourceEnd, unsigned char* target,
                       unsigned char* targetEnd, ConversionFlags flags)
{
    if (source == nullptr)
        return kSourceIllegal;
    if (target == nullptr)
        targetEnd = target;
    return ConvertCodePoints(source, sourceEnd, target, targetEnd, flags);
}

int WtoUTF8(const wchar_t* text, int length, char* buffer, int bufferSize, bool strict)
{
    if (text == nullptr)
        return kSourceIllegal;
    size_t count = 0;
    if (length == -1)
        count = std::wcslen(text) + 1;
    else if (length > 0)
        count = static_cast<size_t>(length);
    const size_t capacity = (buffer != nullptr && bufferSize > 0) ? static_cast<size_t>(bufferSize) : 0;
    unsigned char* target = reinterpret_cast<unsigned char*>(buffer);
    return ConvertCodePoints(text, text + count, target, target + capacity,
                             strict ? ConversionFlags::Strict : ConversionFlags::Lenient);
}
