#ifndef AVPOST_TOOLS_AVPOST_FORMATS_Y4MVIDEODECODER_H
#define AVPOST_TOOLS_AVPOST_FORMATS_Y4MVIDEODECODER_H

#include <memory>
#include <vector>

#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/formats/Y4m.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// A video source over a Y4M stream ("-" reads standard input). Picture i carries the time
// i / rate; a stream without a rate is taken as 25 frames per second. The display aspect
// follows from the pixel aspect of the header.
class Y4mVideoDecoder : public VideoSource {
public:
    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override;

    void Close() override;
    // Any position in a file; on standard input only forward.
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    MEDIA_FRAME* GetFrame() const override { return picture_.get(); }
    int Forward(int count) override;

private:
    void CheckFirstPictureFits() const;
    bool ReadNext();
    void StampCurrent();
    double TimeOf(long long index) const;

    std::unique_ptr<InputFile> input_;
    std::unique_ptr<Y4mReader> reader_;
    VideoFramePtr picture_;
    Ratio rate_;
    std::vector<long long> offsets_;  // byte position of every picture read so far
};

}  // namespace avpost::tool

#endif
