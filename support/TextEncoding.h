#ifndef AVPOST_SUPPORT_TEXTENCODING_H
#define AVPOST_SUPPORT_TEXTENCODING_H

#include <cstdint>

#include "../media/AvpostApi.h"

// UTF-32 to UTF-8 conversion for file names: the platform's file functions take UTF-8 while
// hosts hand in wide strings (one code point per wchar_t).
//
// Result codes of both functions:
//   0  everything converted
//   2  the destination was too small; the last code point that did not fit is not written
//   3  illegal input: a null source, a surrogate in strict mode, or a value above U+10FFFF
//      (which is written as U+FFFD while the conversion goes on)
// The converters never terminate the output themselves: convert the terminator too, or
// zero the buffer first.

// Whether surrogate code points (U+D800 ... U+DFFF) are refused or encoded like any other.
enum class ConversionFlags : int32_t {
    Strict = 0,
    Lenient = 1,
};

// Converts the code points of [source, sourceEnd) into bytes from target on, never writing at
// or beyond targetEnd. The caller learns neither how much was read nor how much was written.
AVPOST_API int ConvertUTF32toUTF8(const unsigned long* source, const unsigned long* sourceEnd, unsigned char* target,
                                  unsigned char* targetEnd, ConversionFlags flags);

// Converts length wide characters of text, or the whole string and its terminating zero when
// length is -1, into buffer (bufferSize bytes). A null text gives 3; any other negative length
// converts nothing; a null buffer or a negative size is a buffer of no bytes.
AVPOST_API int WtoUTF8(const wchar_t* text, int length, char* buffer, int bufferSize, bool strict);

#endif
