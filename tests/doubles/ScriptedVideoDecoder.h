#ifndef AVPOST_TESTS_DOUBLES_SCRIPTEDVIDEODECODER_H
#define AVPOST_TESTS_DOUBLES_SCRIPTEDVIDEODECODER_H

#include <cstdint>
#include <random>
#include <vector>

#include "media/Decoder.h"
#include "media/MediaFrame.h"

// A video source that plays a fixed list of picture times (100 ns units). Each picture is a
// small frame whose first luma byte holds its index, so tests can tell which one they got.
class ScriptedVideoDecoder : public VideoDecoder {
public:
    ScriptedVideoDecoder(std::vector<int64_t> times, double frameRate, int width = 4, int height = 4)
        : times_(std::move(times)), info_(), picture_(CreateYV12Frame(width, height, false, true))
    {
        info_.video.width = width;
        info_.video.height = height;
        info_.video.frameRate = frameRate;
        Show(0);
    }
    ~ScriptedVideoDecoder() override { ReleaseYV12Frame(picture_); }

    // Times i / rate for i in [0, count).
    static std::vector<int64_t> Regular(double rate, int count)
    {
        std::vector<int64_t> times;
        for (int i = 0; i < count; ++i)
            times.push_back(static_cast<int64_t>(i * 10000000.0 / rate + 0.5));
        return times;
    }

    void Close() override { ++closeCalls; }
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    // Lands on the first picture at or after the request, or on the last one.
    double Seek(double seconds, unsigned flags) override
    {
        lastSeekRequest = seconds;
        lastSeekFlags = flags;
        size_t i = 0;
        while (i + 1 < times_.size() &&
               static_cast<double>(times_[i]) < seconds * 10000000.0 + static_cast<double>(info_.firstTime))
            ++i;
        Show(i);
        return GetOffset();
    }
    double GetOffset() const override { return showing_ ? static_cast<double>(times_[index_]) / 10000000.0 : 0.0; }
    MEDIA_FRAME* GetFrame() const override { return showing_ ? picture_ : nullptr; }
    int Forward(int count) override
    {
        if (index_ + count < times_.size()) {
            Show(index_ + count);
            return 1;
        }
        showing_ = showing_ && !pictureGoneAtEnd;
        return 0;
    }

    // Fills Y, V and U (one block) with fixed-seed noise in studio range; keeps the index byte.
    void Paint(unsigned seed)
    {
        std::mt19937 random(seed);
        const int chroma = ((picture_->width + 1) / 2) * ((picture_->height + 1) / 2);
        for (int i = 1; i < picture_->width * picture_->height + 2 * chroma; ++i)
            picture_->plane[0][i] = static_cast<unsigned char>(16 + random() % 220);
    }

    static int IndexOf(const MEDIA_FRAME* frame) { return frame->plane[0][0]; }
    STREAM_INFO& info() { return info_; }

    double lastSeekRequest = -1.0;
    unsigned lastSeekFlags = 0;
    int closeCalls = 0;
    bool pictureGoneAtEnd = false;

private:
    void Show(size_t i)
    {
        index_ = i;
        showing_ = i < times_.size();
        if (showing_) {
            picture_->startTime = picture_->streamTime = times_[i];
            picture_->duration = 400000;
            picture_->plane[0][0] = static_cast<unsigned char>(i);
        }
    }

    std::vector<int64_t> times_;
    STREAM_INFO info_;
    MEDIA_FRAME* picture_;
    size_t index_ = 0;
    bool showing_ = false;
};

#endif
