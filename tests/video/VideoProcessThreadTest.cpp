#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "doubles/ScriptedVideoDecoder.h"
#include "media/VideoExports.h"

namespace {

// One thread pulls pictures while another changes every setting and the crop. Run under
// ThreadSanitizer, this proves the frame path and the setters share no unguarded state.
TEST(VideoThreads, PullingWhileSettingsAndCropChange)
{
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 400), 25.0, 48, 36);
    source.Paint(11);
    source.info().video.aspectX = 4;
    source.info().video.aspectY = 3;
    const RESIZE_PARAM request = {40, 30, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    for (const RESIZE_PARAM* req : {&request, static_cast<const RESIZE_PARAM*>(nullptr)}) {
        VideoDecoder* handle = PCVideoInit(&source, req, 0.0, true);
        std::atomic<bool> done{false};
        int pictures = 0;
        std::thread puller([&] {
            // Only counted: a picture may be retired by the other thread's crop changes.
            for (int i = 0; i < 300; ++i)
                pictures += handle->Forward(1) > 0 && handle->GetFrame() != nullptr;
            done = true;
        });
        const tagRECT crops[] = {{0, 0, 24, 18}, {0, 0, 48, 36}, {4, 2, 40, 30}, {-3, 0, 10, 0}};
        for (unsigned i = 0; !done; ++i) {
            PCSetVideoBrightness(handle, static_cast<int>(i % 3) * 10);
            PCSetContrast(handle, static_cast<int>(i % 5) - 2);
            PCSetVideoSaturation(handle, static_cast<int>(i % 7));
            PCSetExFilterFlag(handle, i % 64);
            PCSetFlipFlag(handle, i % 4);
            PCSetVideoDeintelace(handle, static_cast<DEINTERLACE_STYLE>(i % 6));
            PCDisableWatermark(handle, i % 2);
            PCSetCropRect(handle, &crops[i % 4]);
        }
        puller.join();
        EXPECT_EQ(pictures, 300);
        PCVideoRelease(handle);
        source.Seek(0.0, 0);
    }
}

}  // namespace
