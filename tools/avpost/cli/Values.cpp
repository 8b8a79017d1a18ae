#include "tools/avpost/cli/Values.h"

#include <cctype>
#include <cerrno>
#include <cmath>
#include <cstdlib>

#include "tools/avpost/formats/Y4m.h"

namespace avpost::tool {
namespace {

constexpr double kHighestFrameRate = 200.0;

void Expect(bool condition, const std::string& what)
{
    if (!condition)
        throw Expected{what};
}

double Decimal(const std::string& text, const std::string& what)
{
    char* end = nullptr;
    const double value = std::strtod(text.c_str(), &end);
    Expect(!text.empty() && *end == '\0' && std::isfinite(value), what);
    return value;
}

std::string LowerCase(std::string text)
{
    for (char& c : text)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return text;
}

// The ending of a file name that says BMP or JPEG; false for other endings.
bool IsJpegName(const std::string& path, const std::string& what)
{
    const size_t dot = path.find_last_of('.');
    const std::string extension = dot == std::string::npos ? "" : LowerCase(path.substr(dot));
    Expect(extension == ".bmp" || extension == ".jpg" || extension == ".jpeg", what);
    return extension != ".bmp";
}

// True when pattern holds exactly one number conversion (%d, %3d, %03d) and no % otherwise
// but %%.
bool HasOneNumber(const std::string& pattern)
{
    int numbers = 0;
    for (size_t at = pattern.find('%'); at != std::string::npos; at = pattern.find('%', at)) {
        size_t end = at + 1;
        if (end < pattern.size() && pattern[end] == '%') {
            at = end + 1;
            continue;
        }
        while (end < pattern.size() && std::isdigit(static_cast<unsigned char>(pattern[end])) && end - at < 3)
            ++end;
        if (end >= pattern.size() || pattern[end] != 'd')
            return false;
        ++numbers;
        at = end + 1;
    }
    return numbers == 1;
}

}  // namespace

std::vector<std::string> Split(const std::string& text, char separator)
{
    std::vector<std::string> parts;
    size_t start = 0;
    for (size_t at; (at = text.find(separator, start)) != std::string::npos; start = at + 1)
        parts.push_back(text.substr(start, at - start));
    parts.push_back(text.substr(start));
    return parts;
}

int WholeNumber(const std::string& text, int low, int high, const std::string& what)
{
    char* end = nullptr;
    errno = 0;
    const long value = std::strtol(text.c_str(), &end, 10);
    Expect(!text.empty() && *end == '\0' && errno == 0 && value >= low && value <= high, what);
    return static_cast<int>(value);
}

void ParseSize(const std::string& text, int& width, int& height)
{
    const std::string what = "WIDTHxHEIGHT such as 1280x720 (2 to " + std::to_string(kLargestPictureSide) + " each)";
    const std::vector<std::string> parts = Split(text, 'x');
    Expect(parts.size() == 2, what);
    width = WholeNumber(parts[0], 2, kLargestPictureSide, what);
    height = WholeNumber(parts[1], 2, kLargestPictureSide, what);
}

double ParseFrameRate(const std::string& text)
{
    static const std::string what = "a rate such as 25, 29.97 or 30000/1001 (at most 200), or 'source'";
    if (text == "source")
        return 0.0;
    const std::vector<std::string> parts = Split(text, '/');
    Expect(parts.size() <= 2, what);
    double rate = Decimal(parts[0], what);
    if (parts.size() == 2)
        rate /= WholeNumber(parts[1], 1, 1000000, what);
    Expect(rate >= 0.01 && rate <= kHighestFrameRate, what);
    return rate;
}

double ParseSeconds(const std::string& text, const std::string& what)
{
    const std::vector<std::string> parts = Split(text, ':');
    Expect(parts.size() <= 3, what);
    double seconds = 0.0;
    for (size_t i = 0; i < parts.size(); ++i) {
        const bool last = i + 1 == parts.size();
        // Hours and minutes are whole; minutes and seconds after a colon stay below 60.
        const double part = last ? Decimal(parts[i], what) : WholeNumber(parts[i], 0, 1000000, what);
        Expect(part >= 0.0 && (i == 0 || part < 60.0), what);
        Expect(last || parts[i].find_first_not_of("0123456789") == std::string::npos, what);
        seconds = seconds * 60.0 + part;
    }
    return seconds;
}

namespace {

// "SECONDS=NAME" where NAME ends in .bmp, .jpg or .jpeg.
Capture ParseTimeAndPicture(const std::string& text, const std::string& what)
{
    const size_t equals = text.find('=');
    Expect(equals != std::string::npos, what);
    Capture capture;
    capture.seconds = ParseSeconds(text.substr(0, equals), what);
    capture.path = text.substr(equals + 1);
    capture.jpeg = IsJpegName(capture.path, what);
    return capture;
}

}  // namespace

Capture ParseCapture(const std::string& text)
{
    return ParseTimeAndPicture(text, "TIME=FILE such as 2.5=shot.jpg or 1:02.5=shot.bmp (a .bmp, .jpg or .jpeg file)");
}

TimeRange ParseTimeRange(const std::string& text)
{
    static const std::string what =
        "FROM-UNTIL in seconds or h:mm:ss.mmm, such as 3-4.5 or 1:00-1:30 (UNTIL may "
        "be left out)";
    const size_t dash = text.find('-');
    Expect(dash != std::string::npos, what);
    TimeRange range;
    range.from = ParseSeconds(text.substr(0, dash), what);
    if (dash + 1 < text.size())
        range.until = ParseSeconds(text.substr(dash + 1), what);
    Expect(range.until > range.from, what);
    return range;
}

Thumbnails ParseThumbnails(const std::string& text)
{
    static const std::string what =
        "SECONDS=PATTERN such as 10=thumb%03d.jpg (one %d for the number; a .bmp, .jpg "
        "or .jpeg name)";
    const Capture every = ParseTimeAndPicture(text, what);
    Expect(every.seconds >= 0.001 && HasOneNumber(every.path), what);
    return {every.seconds, every.path, every.jpeg};
}

int64_t ParseBitRate(const std::string& text)
{
    static const std::string what = "a bit rate such as 128k, 2.5M or 800000 (1k to 1000M)";
    Expect(!text.empty(), what);
    const char unit = static_cast<char>(std::tolower(static_cast<unsigned char>(text.back())));
    const double scale = unit == 'k' ? 1e3 : unit == 'm' ? 1e6 : 1.0;
    const double bits = Decimal(scale == 1.0 ? text : text.substr(0, text.size() - 1), what) * scale;
    Expect(bits >= 1e3 && bits <= 1e9, what);
    return static_cast<int64_t>(std::llround(bits));
}

double DecimalNumber(const std::string& text, double low, double high, const std::string& what)
{
    const double value = Decimal(text, what);
    Expect(value >= low && value <= high, what);
    return value;
}

tagRECT ParsePixelRect(const std::string& text, const std::string& what)
{
    const std::vector<std::string> parts = Split(text, ':');
    Expect(parts.size() == 4, what);
    const int width = WholeNumber(parts[0], 2, kLargestPictureSide, what);
    const int height = WholeNumber(parts[1], 2, kLargestPictureSide, what);
    const int x = WholeNumber(parts[2], 0, kLargestPictureSide, what);
    const int y = WholeNumber(parts[3], 0, kLargestPictureSide, what);
    return {x, y, x + width, y + height};
}

tagFRECT ParseFractionRect(const std::string& text)
{
    static const std::string what = "W:H:X:Y in fractions of the output, such as 0.25:0.1:0.7:0.85";
    const std::vector<std::string> parts = Split(text, ':');
    Expect(parts.size() == 4, what);
    double v[4];
    for (size_t i = 0; i < 4; ++i) {
        v[i] = Decimal(parts[i], what);
        Expect(v[i] >= 0.0 && v[i] <= 1.0, what);
    }
    Expect(v[0] > 0.0 && v[1] > 0.0 && v[0] + v[2] <= 1.0 && v[1] + v[3] <= 1.0, what);
    return {static_cast<float>(v[2]), static_cast<float>(v[3]), static_cast<float>(v[2] + v[0]),
            static_cast<float>(v[3] + v[1])};
}

}  // namespace avpost::tool
