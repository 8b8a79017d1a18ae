// Once the stage has its pictures, drawing the next one allocates nothing: the output and the
// deinterlace work picture are reused, and the resize keeps its tables from picture to picture.
// The global allocator is replaced here to count, so this test is an executable of its own.
#include <gtest/gtest.h>

#include <cstdlib>
#include <new>

#include "doubles/ScriptedVideoDecoder.h"
#include "video/VideoProcess.h"

namespace {
long allocations = 0;

void* Counted(size_t size)
{
    ++allocations;
    if (void* memory = std::malloc(size != 0 ? size : 1))
        return memory;
    throw std::bad_alloc();
}
}  // namespace

void* operator new(size_t size) { return Counted(size); }
void* operator new[](size_t size) { return Counted(size); }
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, size_t) noexcept { std::free(memory); }

namespace {

TEST(VideoFrameAllocation, NoneOncePicturesAreDrawn)
{
    const RESIZE_PARAM letterbox = {1280, 720, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    const RESIZE_PARAM nearest = {352, 288, INTERPOLATION_NEAREST, RESIZE_STRETCH};
    for (const RESIZE_PARAM* request : {&letterbox, &nearest})
        for (bool adjusted : {false, true}) {
            ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 2), 25.0, 720, 576);
            source.info().video.aspectX = 4;
            source.info().video.aspectY = 3;
            VideoProcess stage(&source, request, -1.0, false);
            if (adjusted) {
                stage.brightness = 10;
                stage.SetDeintelace(DEINTERLACE_EVEN_INTERPOLATE);
            }
            stage.GetFrame();
            const long before = allocations;
            for (int picture = 0; picture < 10; ++picture)
                stage.GetFrame();
            EXPECT_EQ(allocations - before, 0) << request->width << " adjusted " << adjusted;
        }
}

}  // namespace
