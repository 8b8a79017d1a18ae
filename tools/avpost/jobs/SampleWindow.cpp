#include "tools/avpost/jobs/SampleWindow.h"

#include <algorithm>
#include <climits>
#include <cmath>
#include <vector>

#include "media/MediaFrame.h"

namespace avpost::tool {

SampleWindow::SampleWindow(const Trim& trim, int sampleRate, int bytesPerFrame, bool align)
    : start_(trim.start), limit_(std::isfinite(trim.duration) ? std::llround(trim.duration * sampleRate) : INT64_MAX),
      sampleRate_(sampleRate), bytesPerFrame_(bytesPerFrame), placed_(!align)
{
}

void SampleWindow::PassSilence(int64_t frames, SampleSink& sink)
{
    static const std::vector<unsigned char> kSilence(1 << 16, 0);
    const int64_t chunk = static_cast<int64_t>(kSilence.size()) / bytesPerFrame_;
    while (frames > 0 && passed_ < limit_) {
        const int64_t now = std::min({frames, chunk, limit_ - passed_});
        sink.Write(kSilence.data(), static_cast<size_t>(now * bytesPerFrame_));
        passed_ += now;
        frames -= now;
    }
}

bool SampleWindow::Pass(const unsigned char* samples, size_t bytes, int64_t startTime, SampleSink& sink)
{
    int64_t frames = static_cast<int64_t>(bytes) / bytesPerFrame_;
    if (!placed_) {
        placed_ = true;
        const int64_t lead = std::llround((static_cast<double>(startTime) / kUnitsPerSecond - start_) * sampleRate_);
        if (lead > 0)
            PassSilence(lead, sink);
        else
            skip_ = -lead;
    }
    const int64_t cut = std::min(skip_, frames);
    skip_ -= cut;
    frames -= cut;
    const int64_t taken = std::min(frames, limit_ - passed_);
    if (taken > 0) {
        sink.Write(samples + cut * bytesPerFrame_, static_cast<size_t>(taken * bytesPerFrame_));
        passed_ += taken;
    }
    return passed_ < limit_;
}

}  // namespace avpost::tool
