// The video stages over a source whose picture size, rate, time stamps and time base come from
// the input: the constant-rate stage alone or under a VideoProcess with any request, then up to
// 48 steps of Forward, GetFrame, Seek and every setting a host can change between pictures.
// Every picture handed out is read whole, so a plane shorter than its size shows.
#include <cstdint>
#include <vector>

#include "FuzzInput.h"
#include "FuzzSeeds.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "media/VideoExports.h"

namespace {

constexpr int kMaxSide = 160;
constexpr int kMaxPictures = 24;
constexpr int kMaxSteps = 48;
constexpr int kMaxAspectTerm = 16;

enum Step : uint8_t {
    kForward,
    kSeek,
    kBrightness,
    kContrast,
    kSaturation,
    kDeinterlace,
    kFlip,
    kFilter,
    kCrop,
    kStepCount
};

void ReadWhole(const MEDIA_FRAME* picture)
{
    if (picture == nullptr)
        return;
    volatile unsigned char sink = 0;
    const int chromaRows = (picture->height + 1) / 2;
    for (int row = 0; row < picture->height; ++row)
        for (int x = 0; x < picture->width; ++x)
            sink = sink ^ picture->plane[0][static_cast<ptrdiff_t>(row) * picture->pitch[0] + x];
    for (int plane = 1; plane < 3; ++plane)
        for (int row = 0; row < chromaRows; ++row)
            for (int x = 0; x < (picture->width + 1) / 2; ++x)
                sink = sink ^ picture->plane[plane][static_cast<ptrdiff_t>(row) * picture->pitch[plane] + x];
}

void RunStep(FuzzInput& input, VideoDecoder* stage, bool settable)
{
    const auto step = static_cast<Step>(input.Take<uint8_t>() % (settable ? kStepCount : kBrightness));
    switch (step) {
    case kForward:
        stage->Forward(input.InRange(-1, 4));
        ReadWhole(stage->GetFrame());
        break;
    case kSeek:
        PCVideoSeek(stage, input.InRange(-1000, 100000) / 10.0, input.Take<uint32_t>());
        ReadWhole(stage->GetFrame());
        break;
    case kBrightness:
        PCSetVideoBrightness(stage, input.Take<int32_t>());
        break;
    case kContrast:
        PCSetContrast(stage, input.Take<int32_t>());
        break;
    case kSaturation:
        PCSetVideoSaturation(stage, input.Take<int32_t>());
        break;
    case kDeinterlace:
        PCSetVideoDeintelace(stage, static_cast<DEINTERLACE_STYLE>(input.InRange(-1, 6)));
        break;
    case kFlip:
        PCSetFlipFlag(stage, input.Take<uint32_t>());
        break;
    case kFilter:
        PCSetExFilterFlag(stage, input.Take<uint32_t>());
        break;
    default: {
        const tagRECT crop{input.Take<int32_t>(), input.Take<int32_t>(), input.Take<int32_t>(), input.Take<int32_t>()};
        PCSetCropRect(stage, &crop);
        break;
    }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzInput input(data, size);
    const int width = input.InRange(1, kMaxSide), height = input.InRange(1, kMaxSide);
    const double sourceRate = input.Take<double>();
    std::vector<int64_t> times(static_cast<size_t>(input.InRange(1, kMaxPictures)));
    for (int64_t& time : times)
        time = input.Take<int64_t>();
    ScriptedVideoDecoder source(times, sourceRate, width, height);
    source.info().firstTime = input.Take<int64_t>();
    source.info().startOffset = input.Take<int64_t>();
    // Display aspects as hosts report them; a lopsided one makes a picture of that shape, and
    // 1:16 of a 160-line picture is already a 2560-column picture.
    source.info().video.aspectX = input.InRange(0, kMaxAspectTerm);
    source.info().video.aspectY = input.InRange(0, kMaxAspectTerm);
    source.Paint(input.Take<uint8_t>());

    const double rate = input.Take<double>();
    const bool process = input.Flag();
    const RESIZE_PARAM request{input.InRange(0, kMaxSide), input.InRange(0, kMaxSide),
                               static_cast<IMAGE_INTERPOLATION>(input.InRange(-1, 4)),
                               static_cast<IMAGE_RESIZE_METHOD>(input.InRange(-1, 6))};
    const bool withRequest = input.Flag(), keepLast = input.Flag();
    VideoDecoder* stage =
        process ? PCVideoInit(&source, withRequest ? &request : nullptr, rate, keepLast) : PEVideoCreate(&source, rate);
    if (stage == nullptr)
        return 0;
    ReadWhole(stage->GetFrame());
    for (int i = 0; i < kMaxSteps && !input.Empty(); ++i)
        RunStep(input, stage, process);
    if (process)
        PCVideoRelease(stage);
    else
        PEVideoDestroy(stage);
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    // A 64 x 48 source at 25/s into a 40 x 30 letterboxed picture at 30/s with every setting.
    FuzzOutput letterbox;
    letterbox.PutInRange(64, 1).PutInRange(48, 1).Put(25.0).PutInRange(6, 1);
    for (int i = 0; i < 6; ++i)
        letterbox.Put<int64_t>(i * 400000);
    letterbox.Put<int64_t>(0).Put<int64_t>(0).PutInRange(16, 0).PutInRange(9, 0).Put<uint8_t>(7);
    letterbox.Put(30.0).Put<uint8_t>(1).PutInRange(40, 0).PutInRange(30, 0).PutInRange(2, -1).PutInRange(1, -1);
    letterbox.Put<uint8_t>(1).Put<uint8_t>(1);
    const std::vector<std::pair<Step, int32_t>> steps = {{kBrightness, 10}, {kContrast, 20}, {kSaturation, -30},
                                                         {kDeinterlace, 2}, {kFlip, 3},      {kFilter, 33}};
    for (const auto& [step, value] : steps)
        letterbox.Put<uint8_t>(step).Put<int32_t>(value + (step == kDeinterlace ? 1 : 0));
    for (int i = 0; i < 4; ++i)
        letterbox.Put<uint8_t>(kForward).PutInRange(1, -1);
    letterbox.Put<uint8_t>(kCrop).Put<int32_t>(8).Put<int32_t>(4).Put<int32_t>(40).Put<int32_t>(44);
    letterbox.Put<uint8_t>(kForward).PutInRange(2, -1).Put<uint8_t>(kSeek).PutInRange(1, -1000).Put<uint32_t>(0);
    // The constant-rate stage alone, repeating and dropping irregular pictures.
    FuzzOutput even;
    even.PutInRange(8, 1).PutInRange(6, 1).Put(0.0).PutInRange(4, 1);
    for (int64_t time : {0, 1000000, 1100000, 5000000})
        even.Put<int64_t>(time);
    even.Put<int64_t>(0).Put<int64_t>(0).PutInRange(0, 0).PutInRange(0, 0).Put<uint8_t>(1);
    even.Put(10.0).Put<uint8_t>(0).PutInRange(0, 0).PutInRange(0, 0).PutInRange(0, -1).PutInRange(0, -1);
    even.Put<uint8_t>(0).Put<uint8_t>(0);
    for (int i = 0; i < 8; ++i)
        even.Put<uint8_t>(kForward).PutInRange(1, -1);
    return {letterbox.bytes(), even.bytes()};
}
