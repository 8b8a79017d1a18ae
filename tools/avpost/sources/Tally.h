#ifndef AVPOST_TOOLS_AVPOST_SOURCES_TALLY_H
#define AVPOST_TOOLS_AVPOST_SOURCES_TALLY_H

#include <cstdint>

#include "media/Decoder.h"
#include "media/MediaFrame.h"

namespace avpost::tool {

// Sits between a decoder and the stages and counts what passes, for the summary of a run.
// Every operation is passed on unchanged.

// Counts the pictures the decoder delivers and numbers them, so that the consumer can tell
// which source picture each output picture shows (repeats and drops of a constant rate).
class VideoTally : public VideoDecoder {
public:
    explicit VideoTally(VideoDecoder& source) : source_(source) {}

    void Close() override { source_.Close(); }
    int Open(const wchar_t* path, const DecParam* param, int* result) override
    {
        return source_.Open(path, param, result);
    }
    int SetExDecodeParam(unsigned a, unsigned b, unsigned c) override { return source_.SetExDecodeParam(a, b, c); }
    const STREAM_INFO* GetStreamInfo() const override { return source_.GetStreamInfo(); }
    double Seek(double seconds, unsigned flags) override { return source_.Seek(seconds, flags); }
    double GetOffset() const override { return source_.GetOffset(); }
    MEDIA_FRAME* GetFrame() const override { return source_.GetFrame(); }
    int Forward(int count) override;

    // Number of the decoder's current picture, counted from 0 (Seek does not renumber).
    int64_t current() const { return current_; }
    // Pictures delivered so far.
    int64_t delivered() const { return current_ + 1; }

private:
    VideoDecoder& source_;
    int64_t current_ = 0;
};

// Measures where the decoder's blocks leave gaps on the consumer's time line (from its start,
// or from where a seek landed) or overlap the blocks before them: what a continuous audio
// stage has to fill and to trim.
class AudioTally : public AudioDecoder {
public:
    explicit AudioTally(AudioDecoder& source) : source_(source) {}

    void Close() override { source_.Close(); }
    int Open(const wchar_t* path, const DecParam* param, int* result) override
    {
        return source_.Open(path, param, result);
    }
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override { return source_.GetOffset(); }
    const STREAM_INFO* GetStreamInfo() const override { return source_.GetStreamInfo(); }

    // Totals in seconds.
    double received() const { return Seconds(received_); }
    double gaps() const { return Seconds(gaps_); }
    double overlaps() const { return Seconds(overlaps_); }

private:
    static double Seconds(int64_t units) { return static_cast<double>(units) / kUnitsPerSecond; }

    AudioDecoder& source_;
    int64_t end_ = 0;  // furthest point of the consumer's time line covered so far, 100 ns units
    int64_t received_ = 0;
    int64_t gaps_ = 0;
    int64_t overlaps_ = 0;
};

}  // namespace avpost::tool

#endif
