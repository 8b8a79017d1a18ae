#ifndef AVPOST_TOOLS_AVPOST_CLI_VALUES_H
#define AVPOST_TOOLS_AVPOST_CLI_VALUES_H

#include <cstdint>
#include <string>
#include <vector>

#include "media/WinTypes.h"
#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// The forms option values take. Each parser throws Expected, saying what the value should
// look like; the command line adds the option's name and the value given.
struct Expected {
    std::string what;
};

std::vector<std::string> Split(const std::string& text, char separator);

// A whole number in [low, high].
int WholeNumber(const std::string& text, int low, int high, const std::string& what);

// "WIDTHxHEIGHT".
void ParseSize(const std::string& text, int& width, int& height);
// 25, 29.97, 30000/1001, or "source" (0: the input's own rate).
double ParseFrameRate(const std::string& text);
// Seconds as 2.5, 1:02.5 or 00:01:02.500.
double ParseSeconds(const std::string& text, const std::string& what);
// "SECONDS=FILE" where FILE ends in .bmp, .jpg or .jpeg.
Capture ParseCapture(const std::string& text);
// "FROM-UNTIL" in seconds or h:mm:ss.mmm; UNTIL may be left out (to the end).
TimeRange ParseTimeRange(const std::string& text);
// "SECONDS=PATTERN" where PATTERN holds one %d (or %03d and the like) and ends in .bmp, .jpg
// or .jpeg; a literal % is written %%.
Thumbnails ParseThumbnails(const std::string& text);
// A bit rate in bits per second: 128000, 128k, 2.5M.
int64_t ParseBitRate(const std::string& text);
// A decimal number in [low, high].
double DecimalNumber(const std::string& text, double low, double high, const std::string& what);

// "W:H:X:Y" in whole pixels; the result as left, top, right, bottom.
tagRECT ParsePixelRect(const std::string& text, const std::string& what);
// "W:H:X:Y" in fractions of the output, inside it.
tagFRECT ParseFractionRect(const std::string& text);

}  // namespace avpost::tool

#endif
