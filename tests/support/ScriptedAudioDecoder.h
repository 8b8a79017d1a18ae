#ifndef AVPOST_TESTS_SUPPORT_SCRIPTEDAUDIODECODER_H
#define AVPOST_TESTS_SUPPORT_SCRIPTEDAUDIODECODER_H

#include <cstdint>
#include <cstring>
#include <vector>

#include "media/Decoder.h"
#include "media/MediaFrame.h"

// An audio source that plays a fixed list of blocks, each with its own time stamp, bytes and
// duration, then reports the end of data. Seek moves to the first block stamped at or after the
// requested time and reports that time as reached.
class ScriptedAudioDecoder : public AudioDecoder {
public:
    struct Block {
        int64_t time = 0;  // startTime and streamTime, 100 ns units
        std::vector<unsigned char> bytes;
        int32_t duration = 0;
    };

    ScriptedAudioDecoder(int rate, int channels, int bits)
    {
        std::memset(&info_, 0, sizeof(info_));
        info_.audio.sampleRate = rate;
        info_.audio.channels = channels;
        info_.audio.bitsPerSample = bits;
        info_.audio.bytesPerSecond = rate * channels * bits / 8;
    }

    // size bytes counting up from first (mod 256), so tests can tell which bytes they got.
    static std::vector<unsigned char> Counting(int size, int first = 0)
    {
        std::vector<unsigned char> bytes(static_cast<size_t>(size));
        for (int i = 0; i < size; ++i)
            bytes[static_cast<size_t>(i)] = static_cast<unsigned char>(first + i);
        return bytes;
    }

    // 16-bit samples as the bytes of a block.
    static std::vector<unsigned char> Samples(const std::vector<int16_t>& samples)
    {
        std::vector<unsigned char> bytes(samples.size() * 2);
        if (!samples.empty())
            std::memcpy(bytes.data(), samples.data(), bytes.size());
        return bytes;
    }

    // The time of `frames` sample frames into the stream, rounded to 100 ns.
    int64_t TimeOf(int64_t frames) const
    {
        return (frames * 10000000 * 2 / info_.audio.sampleRate + 1) / 2;
    }

    void Add(int64_t time, std::vector<unsigned char> bytes, int32_t duration = 0)
    {
        blocks_.push_back(Block{time, std::move(bytes), duration});
    }

    void Close() override { ++closeCalls; }
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    double Seek(double seconds) override
    {
        seekRequests.push_back(seconds);
        const auto target = static_cast<int64_t>(seconds * 10000000.0 + 0.5) + info_.firstTime;
        next_ = 0;
        while (next_ < blocks_.size() && blocks_[next_].time < target)
            ++next_;
        return seekReaches >= 0.0 ? seekReaches : seconds;
    }
    MEDIA_FRAME* GetNextFrame() override
    {
        ++pulls;
        if (next_ >= blocks_.size())
            return nullptr;
        Block& block = blocks_[next_++];
        frame_ = MEDIA_FRAME();
        frame_.type = 3;
        frame_.param1 = info_.audio.sampleRate;
        frame_.param2 = info_.audio.channels;
        frame_.bitsPerSample = info_.audio.bitsPerSample;
        frame_.data = block.bytes.data();
        frame_.dataSize = static_cast<int32_t>(block.bytes.size());
        frame_.bufferSize = frame_.dataSize;
        frame_.startTime = frame_.streamTime = block.time;
        frame_.duration = block.duration;
        return &frame_;
    }
    double GetOffset() const override { return 0.25; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

    STREAM_INFO& info() { return info_; }
    MEDIA_FRAME* lastFrame() { return &frame_; }

    int pulls = 0;
    int closeCalls = 0;
    std::vector<double> seekRequests;
    double seekReaches = -1.0;  // what Seek reports; negative: the time asked for

private:
    std::vector<Block> blocks_;
    STREAM_INFO info_;
    MEDIA_FRAME frame_ = MEDIA_FRAME();
    size_t next_ = 0;
};

#endif
