#include "tools/avpost/formats/Y4m.h"

#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {
namespace {

constexpr char kMagic[] = "YUV4MPEG2";
constexpr size_t kLongestHeader = 4096;
constexpr size_t kLongestFrameLine = 1024;
constexpr int kFallbackRate = 25;

// A decimal number of at most nine digits (so it fits int32); -1 when the text is anything else.
int ParseCount(const std::string& text)
{
    if (text.empty() || text.size() > 9 || text.find_first_not_of("0123456789") != std::string::npos)
        return -1;
    return std::atoi(text.c_str());
}

// "n:d" with two counts.
bool ParseFraction(const std::string& text, Ratio& ratio)
{
    const size_t colon = text.find(':');
    if (colon == std::string::npos)
        return false;
    const int num = ParseCount(text.substr(0, colon));
    const int den = ParseCount(text.substr(colon + 1));
    if (num < 0 || den < 0)
        return false;
    ratio = Ratio{num, den}.known() ? Ratio{num, den} : Ratio{};
    return true;
}

bool IsFourTwoZero(const std::string& chroma)
{
    return chroma == "420" || chroma == "420jpeg" || chroma == "420paldv" || chroma == "420mpeg2";
}

// Plain "420" sits its chroma like "420jpeg".
std::string ChromaSiting(const std::string& chroma) { return chroma == "420" ? "420jpeg" : chroma; }

std::vector<std::string> SplitAtSpaces(const std::string& line)
{
    std::vector<std::string> tokens;
    size_t start = 0;
    while (start < line.size()) {
        const size_t end = line.find(' ', start);
        const size_t stop = end == std::string::npos ? line.size() : end;
        if (stop > start)
            tokens.push_back(line.substr(start, stop - start));
        start = stop + 1;
    }
    return tokens;
}

int ParseSide(const std::string& value, const std::string& input, const char* which)
{
    const int side = ParseCount(value);
    if (side <= 0 || side > kLargestPictureSide)
        Fail(input, std::string("Y4M header has an invalid picture ") + which + " '" + value + "'");
    return side;
}

// Fills format from the header's parameters (everything after the magic word).
void ParseHeader(const std::vector<std::string>& tokens, const std::string& input, Y4mFormat& format)
{
    std::string chroma = "420jpeg";
    for (size_t i = 1; i < tokens.size(); ++i) {
        const char tag = tokens[i][0];
        const std::string value = tokens[i].substr(1);
        if (tag == 'W')
            format.width = ParseSide(value, input, "width");
        else if (tag == 'H')
            format.height = ParseSide(value, input, "height");
        else if (tag == 'F' && !ParseFraction(value, format.frameRate))
            Fail(input, "Y4M header has an invalid frame rate '" + value + "'");
        else if (tag == 'A' && !ParseFraction(value, format.pixelAspect))
            Fail(input, "Y4M header has an invalid pixel aspect '" + value + "'");
        else if (tag == 'I')
            format.interlace =
                value.size() == 1 && std::string("ptbm?").find(value[0]) != std::string::npos ? value[0] : '?';
        else if (tag == 'C')
            chroma = value;
    }
    if (format.width == 0 || format.height == 0)
        Fail(input, "Y4M header gives no picture size");
    if (!IsFourTwoZero(chroma))
        Fail(input, "unsupported chroma 'C" + chroma + "' (only 4:2:0 pictures are read)");
    format.chroma = ChromaSiting(chroma);
}

std::string FractionText(Ratio ratio) { return std::to_string(ratio.num) + ":" + std::to_string(ratio.den); }

}  // namespace

size_t Y4mFormat::LumaBytes() const { return static_cast<size_t>(width) * static_cast<size_t>(height); }

size_t Y4mFormat::ChromaBytes() const
{
    return static_cast<size_t>((width + 1) / 2) * static_cast<size_t>((height + 1) / 2);
}

Y4mReader::Y4mReader(ByteSource& input) : input_(input)
{
    std::string line;
    if (!ReadLine(line, kLongestHeader, "Y4M header"))
        Fail(input.name(), "empty input");
    const std::vector<std::string> tokens = SplitAtSpaces(line);
    if (tokens.empty() || tokens[0] != kMagic)
        Fail(input.name(), "not a Y4M (YUV4MPEG2) stream");
    ParseHeader(tokens, input.name(), format_);
}

bool Y4mReader::ReadLine(std::string& line, size_t limit, const char* what)
{
    line.clear();
    for (;;) {
        char c = 0;
        if (input_.Read(&c, 1) == 0) {
            if (line.empty())
                return false;
            Fail(input_.name(), std::string("truncated ") + what);
        }
        if (c == '\n')
            return true;
        if (line.size() == limit)
            Fail(input_.name(), std::string(what) + " is too long; not a Y4M stream?");
        line.push_back(static_cast<char>(c));
    }
}

bool Y4mReader::ReadPicture(MEDIA_FRAME& frame)
{
    if (frame.width != format_.width || frame.height != format_.height)
        Fail(input_.name(), "picture buffer does not match the stream's size");
    std::string line;
    if (!ReadLine(line, kLongestFrameLine, "FRAME line"))
        return false;
    const std::string where = "picture " + std::to_string(picturesRead_);
    if (line.compare(0, 5, "FRAME") != 0 || (line.size() > 5 && line[5] != ' '))
        Fail(input_.name(), where + " does not start with FRAME");
    const int chromaWidth = (format_.width + 1) / 2;
    const int chromaRows = (format_.height + 1) / 2;
    ReadPlane(frame.plane[0], frame.pitch[0], format_.width, format_.height, where);
    ReadPlane(frame.plane[1], frame.pitch[1], chromaWidth, chromaRows, where);
    ReadPlane(frame.plane[2], frame.pitch[2], chromaWidth, chromaRows, where);
    ++picturesRead_;
    return true;
}

void Y4mReader::ReadPlane(unsigned char* plane, int pitch, int width, int rows, const std::string& where)
{
    const size_t rowBytes = static_cast<size_t>(width);
    for (int row = 0; row < rows; ++row)
        if (input_.Read(plane + static_cast<size_t>(row) * pitch, rowBytes) != rowBytes)
            Fail(input_.name(), "truncated data in " + where);
}

long long Y4mReader::position() const { return input_.Tell(); }

void Y4mReader::Reposition(long long position, long long picturesRead)
{
    input_.SeekTo(position);
    picturesRead_ = picturesRead;
}

Y4mWriter::Y4mWriter(OutputFile& output, const Y4mFormat& format) : output_(output), format_(format)
{
    const Ratio rate = format.frameRate.known() ? Reduced(format.frameRate) : Ratio{kFallbackRate, 1};
    std::string header = std::string(kMagic) + " W" + std::to_string(format.width) + " H" +
                         std::to_string(format.height) + " F" + FractionText(rate) + " I" + format.interlace;
    if (format.pixelAspect.known())
        header += " A" + FractionText(Reduced(format.pixelAspect));
    header += " C" + format.chroma + "\n";
    output_.Write(header.data(), header.size());
}

void Y4mWriter::WritePicture(const MEDIA_FRAME& frame)
{
    if (frame.width != format_.width || frame.height != format_.height)
        Fail(output_.name(), "picture of " + std::to_string(frame.width) + "x" + std::to_string(frame.height) +
                                 " in a " + std::to_string(format_.width) + "x" + std::to_string(format_.height) +
                                 " stream");
    static const char kFrameLine[] = "FRAME\n";
    output_.Write(kFrameLine, sizeof(kFrameLine) - 1);
    const int chromaWidth = (format_.width + 1) / 2;
    const int chromaRows = (format_.height + 1) / 2;
    WritePlane(frame.plane[0], frame.pitch[0], format_.width, format_.height);
    WritePlane(frame.plane[1], frame.pitch[1], chromaWidth, chromaRows);
    WritePlane(frame.plane[2], frame.pitch[2], chromaWidth, chromaRows);
}

void Y4mWriter::WritePlane(const unsigned char* plane, int pitch, int width, int rows)
{
    for (int row = 0; row < rows; ++row)
        output_.Write(plane + static_cast<size_t>(row) * pitch, static_cast<size_t>(width));
}

}  // namespace avpost::tool
