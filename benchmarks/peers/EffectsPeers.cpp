// The in-place picture effects on a 1080p picture of noise, each beside a memcpy of the same
// planes (1920 x 1080 luma and two 960 x 540 chroma planes): the floor such a pass can reach.
#include <cstring>
#include <functional>
#include <memory>
#include <random>
#include <string>

#include "PeerBench.h"
#include "image/effects/Deinterlace.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "media/MediaFrame.h"

namespace {

constexpr int kWidth = 1920;
constexpr int kHeight = 1080;
constexpr size_t kPictureBytes = kWidth * kHeight * 3 / 2;

struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// Every plane noise, the alpha plane included, so that no branch is always taken.
FramePtr NoisyFrame(bool withAlpha)
{
    FramePtr frame(CreateYV12Frame(kWidth, kHeight, withAlpha, false));
    const size_t total = kPictureBytes + (withAlpha ? kWidth * kHeight : 0);
    std::mt19937 random(3);
    for (size_t i = 0; i < total; ++i)
        frame->plane[0][i] = static_cast<unsigned char>(random());
    return frame;
}

void AddEffect(const std::string& work, std::function<void(MEDIA_FRAME*)> effect)
{
    peers::AddWork(work, peers::kOurs, [effect](benchmark::State& state) {
        FramePtr frame = NoisyFrame(false);
        for (auto _ : state) {
            effect(frame.get());
            benchmark::ClobberMemory();
        }
    });
    peers::AddWork(work, "memcpy", [](benchmark::State& state) {
        FramePtr from = NoisyFrame(false);
        FramePtr to = NoisyFrame(false);
        for (auto _ : state) {
            std::memcpy(to->plane[0], from->plane[0], kPictureBytes);
            benchmark::ClobberMemory();
        }
    });
}

const bool registered = [] {
    AddEffect("adjust_image_all_three", [](MEDIA_FRAME* f) { AdjustImage(f, 10, 20, 30); });
    AddEffect("adjust_image_brightness", [](MEDIA_FRAME* f) { AdjustImage(f, -12, 0, 0); });
    AddEffect("filter_gray", FilterGray);
    AddEffect("filter_emboss", FilterEmboss);
    AddEffect("filter_negative", FilterNegative);
    AddEffect("filter_black_white", FilterBlackWhite);
    AddEffect("filter_white_black", FilterWhiteBlack);
    AddEffect("filter_old_photo", FilterOldPhoto);
    AddEffect("flip_horizontal", FlipImageHorz);
    AddEffect("flip_vertical", FlipImageVert);
    const std::pair<const char*, DEINTERLACE_STYLE> styles[] = {
        {"deinterlace_even_double", DEINTERLACE_EVEN_DOUBLE},
        {"deinterlace_odd_double", DEINTERLACE_ODD_DOUBLE},
        {"deinterlace_even_interpolate", DEINTERLACE_EVEN_INTERPOLATE},
        {"deinterlace_odd_interpolate", DEINTERLACE_ODD_INTERPOLATE}};
    for (const auto& [name, style] : styles)
        AddEffect(name, [style = style](MEDIA_FRAME* f) { DeinterlaceImage(f, style); });
    // A watermark as large as the picture, so that the blend covers the planes memcpy copies.
    static const FramePtr mark = NoisyFrame(true);
    static const tagRECT whole{0, 0, kWidth, kHeight};
    AddEffect("watermark_in_rectangle", [](MEDIA_FRAME* f) { AddWaterMark(f, mark.get(), &whole, 70, 0); });
    AddEffect("watermark_by_alignment", [](MEDIA_FRAME* f) { AddWaterMark(f, mark.get(), nullptr, 70, 9); });
    return true;
}();

}  // namespace
