#include "tools/avpost/jobs/SampleWindow.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <vector>

namespace avpost::tool {
namespace {

// Mono sound at 1000 Hz, one sample frame a millisecond.
constexpr int kRate = 1000;
constexpr int64_t kUnitsPerMillisecond = 10000;

class Recorder : public SampleSink {
public:
    void Write(const unsigned char* samples, size_t bytes) override
    {
        std::vector<int16_t> values(bytes / 2);
        std::memcpy(values.data(), samples, bytes);
        received.insert(received.end(), values.begin(), values.end());
    }
    std::vector<int16_t> received;
};

struct Block {
    int64_t startMs;
    int first;  // value of its first sample; the others count up from it
    int frames;
};

TEST(SampleWindows, CutTheSoundToTheTrimFromWhereTheFirstBlockLies)
{
    const double kOpen = std::numeric_limits<double>::infinity();
    const struct {
        const char* what;
        Trim trim;
        bool align;
        std::vector<Block> blocks;
        std::vector<int16_t> expected;  // 0 for silence
        size_t blocksTaken;             // the window is full after this many
    } cases[] = {
        {"no trim: the blocks as they are", {0.0, kOpen}, false, {{7, 1, 3}, {10, 4, 2}}, {1, 2, 3, 4, 5}, 2},
        {"a seek landed before the start", {1.0, kOpen}, true, {{997, 1, 5}, {1002, 6, 2}}, {4, 5, 6, 7}, 2},
        {"the cut reaches into the next block", {1.0, kOpen}, true, {{995, 1, 3}, {998, 4, 4}}, {6, 7}, 2},
        {"the sound begins after the start", {1.0, kOpen}, true, {{1003, 1, 2}}, {0, 0, 0, 1, 2}, 1},
        {"the duration ends inside a block", {1.0, 0.004}, true, {{1000, 1, 3}, {1003, 4, 3}}, {1, 2, 3, 4}, 2},
        {"silence fills even a short window", {1.0, 0.002}, true, {{1005, 1, 3}}, {0, 0}, 1},
        {"later blocks follow whatever their stamps",
         {0.0, 0.006},
         false,
         {{0, 1, 2}, {50, 3, 2}, {20, 5, 9}},
         {1, 2, 3, 4, 5, 6},
         3},
    };
    for (const auto& c : cases) {
        SampleWindow window(c.trim, kRate, 2, c.align);
        Recorder sink;
        size_t taken = 0;
        for (const Block& block : c.blocks) {
            std::vector<int16_t> samples(static_cast<size_t>(block.frames));
            for (int i = 0; i < block.frames; ++i)
                samples[static_cast<size_t>(i)] = static_cast<int16_t>(block.first + i);
            ++taken;
            if (!window.Pass(reinterpret_cast<const unsigned char*>(samples.data()), samples.size() * 2,
                             block.startMs * kUnitsPerMillisecond, sink))
                break;
        }
        EXPECT_EQ(sink.received, c.expected) << c.what;
        EXPECT_EQ(taken, c.blocksTaken) << c.what;
        EXPECT_EQ(window.framesPassed(), static_cast<int64_t>(c.expected.size())) << c.what;
    }
}

}  // namespace
}  // namespace avpost::tool
