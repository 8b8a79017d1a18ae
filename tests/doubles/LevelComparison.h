#ifndef AVPOST_TESTS_DOUBLES_LEVELCOMPARISON_H
#define AVPOST_TESTS_DOUBLES_LEVELCOMPARISON_H

#include <algorithm>
#include <functional>
#include <list>
#include <memory>
#include <string>
#include <vector>

#include "doubles/GuardedBuffer.h"
#include "doubles/SimdLevels.h"
#include "support/CpuFeatures.h"

// Runs one piece of picture work at every instruction-set level on the same random buffers and
// reports where a level's bytes first differ from the scalar reference's.

// One picture size and buffer placement; `seed` makes the content.
struct Scene {
    int width;
    int height;
    size_t offset;
    unsigned seed;
};

// The buffers of one run: sources filled with noise, destinations (which in-place work also
// reads) with other noise, so that a byte written where the reference leaves it alone shows too.
// Destinations are fenced by guard bytes; sources end where the heap block ends, so that a
// sanitizer sees a read past them.
class SceneBuffers {
public:
    explicit SceneBuffers(const Scene& scene) : scene_(scene) {}

    unsigned char* Source(size_t size)
    {
        const size_t offset = (scene_.offset + 13 * Count()) % 64;
        sources_.emplace_back(offset + size);
        GuardedBuffer noise(size);
        noise.Randomise(scene_.seed + static_cast<unsigned>(Count()));
        std::copy(noise.data(), noise.data() + size, sources_.back().data() + offset);
        return sources_.back().data() + offset;
    }
    unsigned char* Destination(size_t size)
    {
        GuardedBuffer* buffer = Add(size);
        destinations_.push_back(buffer);
        return buffer->data();
    }

    // The destinations' bytes, or nothing when a guard was overwritten.
    std::vector<std::vector<unsigned char>> Outputs() const
    {
        std::vector<std::vector<unsigned char>> outputs;
        for (const GuardedBuffer* buffer : destinations_) {
            if (!buffer->GuardsIntact())
                return {};
            outputs.push_back(buffer->Contents());
        }
        return outputs;
    }

private:
    size_t Count() const { return sources_.size() + buffers_.size(); }

    GuardedBuffer* Add(size_t size)
    {
        // Each buffer starts at its own distance from a 64-byte boundary.
        const size_t offset = (scene_.offset + 13 * Count()) % 64;
        buffers_.push_back(std::make_unique<GuardedBuffer>(size, offset));
        buffers_.back()->Randomise(scene_.seed + static_cast<unsigned>(Count()));
        return buffers_.back().get();
    }

    Scene scene_;
    std::list<std::vector<unsigned char>> sources_;
    std::vector<std::unique_ptr<GuardedBuffer>> buffers_;
    std::vector<const GuardedBuffer*> destinations_;
};

using SceneWork = std::function<void(SceneBuffers&, const Scene&)>;

inline std::vector<std::vector<unsigned char>> OutputsOf(const SceneWork& work, const Scene& scene)
{
    SceneBuffers buffers(scene);
    work(buffers, scene);
    return buffers.Outputs();
}

// Where the first level whose bytes differ from the reference's differs; empty when none does.
inline std::string DifferenceFromReference(const SceneWork& work, const Scene& scene)
{
    std::vector<std::vector<unsigned char>> reference;
    {
        avpost::simd::ScopedLevel pin(avpost::simd::Level::kScalar);
        reference = OutputsOf(work, scene);
    }
    if (reference.empty())
        return "the reference writes outside its buffers";
    for (avpost::simd::Level level : AvailableSimdLevels()) {
        avpost::simd::ScopedLevel pin(level);
        const auto outputs = OutputsOf(work, scene);
        const std::string at = std::string(avpost::simd::NameOf(level)) + ": ";
        if (outputs.size() != reference.size())
            return at + "a write outside the destination buffers";
        for (size_t i = 0; i < outputs.size(); ++i)
            for (size_t k = 0; k < outputs[i].size(); ++k)
                if (outputs[i][k] != reference[i][k])
                    return at + "destination " + std::to_string(i) + ", byte " + std::to_string(k) + ": " +
                           std::to_string(outputs[i][k]) + " instead of " + std::to_string(reference[i][k]);
    }
    return {};
}

// Widths 1...67 cover every remainder of the widest kernels' 32-byte and 64-byte steps; the
// offsets move the buffers through every alignment; one picture is wider than full HD.
inline std::vector<Scene> VariantScenes()
{
    std::vector<Scene> scenes;
    for (int width = 1; width <= 67; ++width)
        scenes.push_back({width, 1 + width % 4, static_cast<size_t>(width) % 64, static_cast<unsigned>(width)});
    for (size_t offset = 0; offset < 64; offset += 3)
        scenes.push_back({45, 5, offset, static_cast<unsigned>(100 + offset)});
    scenes.push_back({1923, 6, 7, 999});
    return scenes;
}

#endif
