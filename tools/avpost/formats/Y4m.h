#ifndef AVPOST_TOOLS_AVPOST_FORMATS_Y4M_H
#define AVPOST_TOOLS_AVPOST_FORMATS_Y4M_H

#include <cstddef>
#include <string>

#include "media/MediaFrame.h"
#include "tools/avpost/common/Ratio.h"

namespace avpost::tool {

class ByteSource;
class OutputFile;

// YUV4MPEG2, the plain uncompressed stream that media tools exchange through pipes, in its
// 4:2:0 form: one header line ("YUV4MPEG2 W720 H576 F25:1 It A64:45 C420jpeg"), then per
// picture a "FRAME" line followed by the Y, Cb and Cr planes without padding; each chroma
// plane holds (height + 1) / 2 rows of (width + 1) / 2 samples.
struct Y4mFormat {
    int width = 0;
    int height = 0;
    Ratio frameRate;       // unknown when the header gives none or F0:0
    Ratio pixelAspect;     // unknown when the header gives none or A0:0
    char interlace = '?';  // p progressive, t top field first, b bottom first, m mixed, ? unknown
    // Where chroma samples sit: "420jpeg" (between the luma samples), "420mpeg2" (beside the
    // left one), "420paldv" (on the top-left one).
    std::string chroma = "420jpeg";

    size_t LumaBytes() const;
    size_t ChromaBytes() const;
    size_t PictureBytes() const { return LumaBytes() + 2 * ChromaBytes(); }
};

// The largest picture side the tool accepts; keeps every plane size far inside int32.
constexpr int kLargestPictureSide = 16384;

class Y4mReader {
public:
    // Reads and checks the header; throws ToolError naming the input for anything that is not a
    // 4:2:0 YUV4MPEG2 stream.
    explicit Y4mReader(ByteSource& input);

    const Y4mFormat& format() const { return format_; }
    // Reads the next picture into the planes of frame, which must have the stream's size (any
    // pitches). Returns false at the end of the stream; throws on a damaged or cut-off picture.
    bool ReadPicture(MEDIA_FRAME& frame);
    // Pictures read so far (the index of the next one).
    long long picturesRead() const { return picturesRead_; }
    // Byte position of the next picture, and a jump back to one, for seekable inputs.
    long long position() const;
    void Reposition(long long position, long long picturesRead);

private:
    bool ReadLine(std::string& line, size_t limit, const char* what);
    void ReadPlane(unsigned char* plane, int pitch, int width, int rows, const std::string& where);

    ByteSource& input_;
    Y4mFormat format_;
    long long picturesRead_ = 0;
};

class Y4mWriter {
public:
    // Writes the header. Streams of unknown rate are written as 25 frames per second, the
    // fallback players use too; an unknown pixel aspect is left out.
    Y4mWriter(OutputFile& output, const Y4mFormat& format);

    // Writes one picture; it must have the stream's size.
    void WritePicture(const MEDIA_FRAME& frame);

private:
    void WritePlane(const unsigned char* plane, int pitch, int width, int rows);

    OutputFile& output_;
    Y4mFormat format_;
};

}  // namespace avpost::tool

#endif
