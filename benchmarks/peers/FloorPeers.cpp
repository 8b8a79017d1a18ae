// The floor every picture work is measured against: copying one 1080p I420 picture.
#include <cstring>
#include <vector>

#include "PeerBench.h"

namespace {

const bool registered = [] {
    peers::AddWork("copy_i420_1920x1080", "memcpy", [](benchmark::State& state) {
        const size_t size = 1920 * 1080 * 3 / 2;
        std::vector<unsigned char> from(size, 16), to(size);
        for (auto _ : state) {
            std::memcpy(to.data(), from.data(), size);
            benchmark::ClobberMemory();
        }
    });
    return true;
}();

}  // namespace
