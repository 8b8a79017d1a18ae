#ifndef AVPOST_TESTS_DOUBLES_SCRIPTEDAUDIODECODER_H
#define AVPOST_TESTS_DOUBLES_SCRIPTEDAUDIODECODER_H

#include <cmath>
#include <cstdint>
#include <utility>
#include <vector>

#include "media/Decoder.h"
#include "media/MediaFrame.h"

// An audio source that plays a fixed list of stamped blocks, then reports the end of data. Seek
// moves to the first block stamped at or after the requested time and reports that time (or
// seekReaches when set) as reached.
class ScriptedAudioDecoder : public AudioDecoder {
public:
    using Bytes = std::vector<unsigned char>;

    ScriptedAudioDecoder(int rate, int channels, int bits) : info()
    {
        info.audio = {rate, channels, bits, rate * channels * bits / 8, 0.0, 0};
    }
    static Bytes Samples(const std::vector<int16_t>& samples)
    {
        const auto* first = reinterpret_cast<const unsigned char*>(samples.data());
        return Bytes(first, first + 2 * samples.size());
    }
    // The time of `frames` sample frames into the stream, rounded to 100 ns.
    int64_t TimeOf(int64_t frames) const { return (frames * 20000000 / info.audio.sampleRate + 1) / 2; }
    // Adds a block stamped time (startTime and streamTime); add every block before the first pull.
    void Add(int64_t time, Bytes bytes, int32_t duration = 0)
    {
        MEDIA_FRAME block = MEDIA_FRAME();
        block.type = 3;
        block.param1 = info.audio.sampleRate;
        block.param2 = info.audio.channels;
        block.bitsPerSample = info.audio.bitsPerSample;
        block.data = bytes.data();  // a moved vector keeps its buffer
        block.dataSize = static_cast<int32_t>(bytes.size());
        block.startTime = block.streamTime = time;
        block.duration = duration;
        blocks.emplace_back(block, std::move(bytes));
    }

    void Close() override { ++closeCalls; }
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    double Seek(double seconds) override
    {
        seekRequests.push_back(seconds);
        // In doubles, so that any first time and request compare without overflow.
        const double target = std::trunc(seconds * 10000000.0 + 0.5) + static_cast<double>(info.firstTime);
        for (next = 0; next < blocks.size() && static_cast<double>(blocks[next].first.startTime) < target;)
            ++next;
        return seekReaches >= 0.0 ? seekReaches : seconds;
    }
    // Hands out the scripted frame itself, so a stage that writes into it shows in blocks.
    MEDIA_FRAME* GetNextFrame() override { return next < blocks.size() ? &blocks[next++].first : nullptr; }
    double GetOffset() const override { return 0.25; }
    const STREAM_INFO* GetStreamInfo() const override { return &info; }

    STREAM_INFO info;
    std::vector<std::pair<MEDIA_FRAME, Bytes>> blocks;
    size_t next = 0;  // the block handed out next
    int closeCalls = 0;
    std::vector<double> seekRequests;
    double seekReaches = -1.0;
};

#endif
