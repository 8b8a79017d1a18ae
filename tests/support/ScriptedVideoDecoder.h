#ifndef AVPOST_TESTS_SUPPORT_SCRIPTEDVIDEODECODER_H
#define AVPOST_TESTS_SUPPORT_SCRIPTEDVIDEODECODER_H

#include <cstdint>
#include <cstring>
#include <random>
#include <vector>

#include "media/Decoder.h"
#include "media/MediaFrame.h"

// A video source that plays a fixed list of picture times (100 ns units). Each picture is a
// small frame whose luma holds its index, so tests can tell which picture they were given.
class ScriptedVideoDecoder : public VideoDecoder {
public:
    ScriptedVideoDecoder(std::vector<int64_t> times, double frameRate, int width = 4, int height = 4)
        : times_(std::move(times))
    {
        std::memset(&info_, 0, sizeof(info_));
        info_.video.width = width;
        info_.video.height = height;
        info_.video.frameRate = frameRate;
        picture_ = CreateYV12Frame(width, height, false, true);
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
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return exDecodeResult; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double seconds, unsigned flags) override
    {
        lastSeekRequest = seconds;
        lastSeekFlags = flags;
        if (times_.empty())
            return 0.0;
        const auto target = static_cast<int64_t>(seconds * 10000000.0) + info_.firstTime;
        size_t i = 0;
        while (i + 1 < times_.size() && times_[i] < target)
            ++i;
        Show(i);
        return static_cast<double>(times_[i] - info_.firstTime) / 10000000.0;
    }
    double GetOffset() const override
    {
        return times_.empty() ? 0.0 : static_cast<double>(times_[index_]) / 10000000.0;
    }
    MEDIA_FRAME* GetFrame() const override { return showing_ ? picture_ : nullptr; }
    int Forward(int count) override
    {
        ++forwardCalls;
        if (index_ + count >= times_.size()) {
            if (pictureGoneAtEnd)
                showing_ = false;
            return 0;
        }
        Show(index_ + count);
        return 1;
    }

    // Fills the picture with fixed-seed noise in studio range; the first luma byte keeps the index.
    void Paint(unsigned seed)
    {
        std::mt19937 random(seed);
        const int lumaSize = picture_->width * picture_->height;
        const int chromaSize = ((picture_->width + 1) / 2) * ((picture_->height + 1) / 2);
        const unsigned char index = picture_->plane[0][0];
        for (int i = 0; i < lumaSize; ++i)
            picture_->plane[0][i] = static_cast<unsigned char>(16 + random() % 220);
        for (int i = 0; i < chromaSize; ++i) {
            picture_->plane[1][i] = static_cast<unsigned char>(16 + random() % 225);
            picture_->plane[2][i] = static_cast<unsigned char>(16 + random() % 225);
        }
        picture_->plane[0][0] = index;
    }

    // The index of the picture a frame shows (its first luma byte).
    static int IndexOf(const MEDIA_FRAME* frame) { return frame->plane[0][0]; }

    STREAM_INFO& info() { return info_; }
    size_t index() const { return index_; }

    double lastSeekRequest = -1.0;
    unsigned lastSeekFlags = 0;
    int forwardCalls = 0;
    int closeCalls = 0;
    bool pictureGoneAtEnd = false;
    int exDecodeResult = 0;

private:
    void Show(size_t i)
    {
        index_ = i;
        showing_ = !times_.empty();
        if (!showing_)
            return;
        picture_->startTime = picture_->streamTime = times_[i];
        picture_->duration = 400000;
        picture_->plane[0][0] = static_cast<unsigned char>(i);
    }

    std::vector<int64_t> times_;
    STREAM_INFO info_;
    MEDIA_FRAME* picture_ = nullptr;
    size_t index_ = 0;
    bool showing_ = false;
};

#endif
