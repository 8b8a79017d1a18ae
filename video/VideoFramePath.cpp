#include "video/VideoProcess.h"

#include <iterator>
#include <limits>

#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "image/resize/YuvFrameResize.h"
#include "media/MediaFrame.h"
#include "media/Truncate.h"
#include "video/BlackBackground.h"
#include "video/SharedSetting.h"
#include "video/SingleLock.h"
#include "video/VideoProcessHelpers.h"

namespace {

using avpost::detail::ChromaSize;
using avpost::detail::ClearAround;
using avpost::detail::ClearToBlack;
using avpost::detail::ImageResizeYV12Coverage;
using avpost::detail::LoadSetting;
using avpost::detail::Release;
using avpost::detail::Saturate32;
using avpost::detail::SetWorkingRect;
using avpost::detail::TruncSaturate;

constexpr uint32_t kFlipHorz = 1;
constexpr uint32_t kFlipVert = 2;
constexpr int32_t kCentred = 0;

// The colour filters in the order they run; bit i of the filter flags selects entry i.
constexpr void (*const kFilters[])(MEDIA_FRAME*) = {FilterGray,       FilterEmboss,     FilterNegative,
                                                    FilterBlackWhite, FilterWhiteBlack, FilterOldPhoto};

bool Deinterlaces(DEINTERLACE_STYLE style)
{
    return style >= DEINTERLACE_EVEN_DOUBLE && style <= DEINTERLACE_ODD_INTERPOLATE;
}

// A host picture the stage may read: three planes, a size and pitches that cover its rows.
bool IsReadable(const MEDIA_FRAME* picture)
{
    return picture != nullptr && picture->plane[0] != nullptr && picture->plane[1] != nullptr &&
           picture->plane[2] != nullptr && picture->width >= 0 && picture->height >= 0 &&
           picture->pitch[0] >= picture->width && picture->pitch[1] >= ChromaSize(picture->width) &&
           picture->pitch[2] >= ChromaSize(picture->width);
}

// The geometry follows the stream information; a picture of another size must not be read or
// written outside its planes, so a rectangle is used only when it lies inside its picture.
bool Contains(const MEDIA_FRAME& picture, const IMG_PARAM& rect)
{
    return rect.x >= 0 && rect.y >= 0 && rect.cx >= 1 && rect.cy >= 1 && int64_t{rect.x} + rect.cx <= picture.width &&
           int64_t{rect.y} + rect.cy <= picture.height;
}

bool HasSize(const MEDIA_FRAME* frame, int64_t width, int64_t height)
{
    return frame != nullptr && frame->width == width && frame->height == height;
}

// Makes frame a picture of the given size, replacing one of another size; true when it made one.
bool EnsureFrame(MEDIA_FRAME*& frame, int32_t width, int32_t height, bool withAlpha, bool clear)
{
    if (HasSize(frame, width, height))
        return false;
    Release(frame);
    frame = CreateYV12Frame(width, height, withAlpha, clear);
    return true;
}

// One coordinate of a rectangle given in fractions of the output: the product in single
// precision, rounded in double.
int32_t ScaleFraction(int32_t size, float fraction)
{
    const float product = static_cast<float>(size) * fraction;
    return TruncSaturate<int32_t>(static_cast<double>(product) + 0.5);
}

// The bilinear kernels need at least two pixels each way on both sides and an alpha plane.
bool CanScaleWatermark(const MEDIA_FRAME& from, int64_t width, int64_t height)
{
    constexpr int64_t kLargest = std::numeric_limits<int32_t>::max();
    return from.plane[3] != nullptr && from.width >= 2 && from.height >= 2 && width >= 2 && height >= 2 &&
           width <= kLargest && height <= kLargest;
}

tagRECT MovedBy(const tagRECT& rect, int32_t dx, int32_t dy)
{
    return {Saturate32(int64_t{rect.left} + dx), Saturate32(int64_t{rect.top} + dy),
            Saturate32(int64_t{rect.right} + dx), Saturate32(int64_t{rect.bottom} + dy)};
}

}  // namespace

bool VideoProcess::NothingToDo() const
{
    return LoadSetting(brightness) == 0 && LoadSetting(contrast) == 0 && LoadSetting(saturation) == 0 &&
           LoadSetting(filterFlags) == 0 && LoadSetting(flipFlags) == 0 &&
           LoadSetting(deinterlaceStyle) == DEINTERLACE_NONE && LoadSetting(watermarkFrame) == nullptr &&
           userWatermarkFrame == nullptr;
}

MEDIA_FRAME* VideoProcess::InputPicture() const
{
    MEDIA_FRAME* picture = input != nullptr ? input->GetFrame() : nullptr;
    return IsReadable(picture) ? picture : nullptr;
}

MEDIA_FRAME* VideoProcess::PictureForResize() const
{
    MEDIA_FRAME* picture = InputPicture();
    return picture != nullptr ? picture : lastFrame;
}

void VideoProcess::KeepCopy(const MEDIA_FRAME& picture) const
{
    EnsureFrame(lastFrame, picture.width, picture.height, false, true);
    CopyVideoFrame(lastFrame, &picture, true);
}

MEDIA_FRAME* VideoProcess::GetFrame() const
{
    CSingleLock lock(&mutex);
    MEDIA_FRAME* picture = InputPicture();
    if (picture != nullptr && keepLastFrame)
        KeepCopy(*picture);
    if (picture == nullptr)
        picture = lastFrame;
    if (picture == nullptr)
        return nullptr;

    // A closed even stage has no stream information, and without it there is no geometry.
    const STREAM_INFO* info = input->GetStreamInfo();
    if (info == nullptr)
        return nullptr;
    const int32_t inWidth = info->video.width, inHeight = info->video.height;
    const bool sameSize = outputFormat->width == inWidth && outputFormat->height == inHeight;
    bool forceResize = !sameSize;
    if (resizeParam != nullptr && sameSize) {
        // Fitting into a fixed shape redraws even a picture of unchanged size.
        const auto method = static_cast<uint32_t>(resizeParam->method);
        forceResize = method > RESIZE_KEEP_ASPECT && method != RESIZE_METHOD_4;
    } else if (resizeParam == nullptr && cropRect != nullptr) {
        forceResize = false;
    }

    if (outputFrame == nullptr) {
        if (cropRect == nullptr && !forceResize && NothingToDo())
            return picture;
        if (PrepareMemImage(outputFormat->width, outputFormat->height) == nullptr)
            return nullptr;
    }
    outputFrame->startTime = picture->startTime;
    outputFrame->streamTime = picture->streamTime;
    outputFrame->duration = picture->duration;
    // Brightness asks for a black background; the drawing clears only what it leaves.
    DrawMainPicture(*picture, sameSize && !forceResize, LoadSetting(brightness) != 0);
    ApplyEffects();
    BlendUserWatermark();
    BlendWatermark();
    return outputFrame;
}

void VideoProcess::DrawMainPicture(const MEDIA_FRAME& picture, bool copyAsIs, bool onBlack) const
{
    if (copyAsIs && cropRect == nullptr) {
        IMG_PARAM whole = {};
        SetWorkingRect(whole, 0, 0, outputFrame->width, outputFrame->height);
        if (Contains(picture, whole))
            CopyVideoFrame(outputFrame, &picture, true);  // every byte, pitch included
        else if (onBlack)
            ClearToBlack(*outputFrame);
        const DEINTERLACE_STYLE style = LoadSetting(deinterlaceStyle);
        if (Deinterlaces(style))
            DeinterlaceImage(outputFrame, style);
    } else {
        DrawScaled(onBlack);
    }
}

// What MakeResizeImage draws (on black), or MakeCropImageEx while a crop is set (over the previous
// picture); with onBlack both draw on black, and the frame turns black even without a picture.
void VideoProcess::DrawScaled(bool onBlack) const
{
    MEDIA_FRAME* picture = PictureForResize();
    if (picture != nullptr)
        DrawResized(picture, onBlack || cropRect == nullptr);
    else if (onBlack)
        ClearToBlack(*outputFrame);
}

void VideoProcess::MakeResizeImage() const
{
    MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || picture == nullptr)
        return;
    DrawResized(picture, true);
}

void VideoProcess::MakeCropImageEx() const
{
    MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || picture == nullptr || cropRect == nullptr)
        return;
    DrawResized(picture, false);
}

// With onBlack, everything the resize does not draw ends black, as if cleared before it.
void VideoProcess::DrawResized(MEDIA_FRAME* picture, bool onBlack) const
{
    srcParam.lpBits = picture->plane[0];
    dstParam.lpBits = outputFrame->plane[0];
    if (!Contains(*picture, srcParam) || !Contains(*outputFrame, dstParam)) {
        if (onBlack)
            ClearToBlack(*outputFrame);
        return;
    }
    const DEINTERLACE_STYLE style = LoadSetting(deinterlaceStyle);
    if (Deinterlaces(style)) {
        EnsureFrame(deinterlaceFrame, picture->width, picture->height, false, false);
        CopyVideoFrame(deinterlaceFrame, picture, true);
        DeinterlaceImage(deinterlaceFrame, style);
        picture = deinterlaceFrame;
    }
    const IMAGE_INTERPOLATION interpolation =
        resizeParam != nullptr ? resizeParam->interpolation : INTERPOLATION_BILINEAR;
    if (onBlack)
        ClearAround(*outputFrame, ImageResizeYV12Coverage(srcParam, dstParam, interpolation));
    ImageResizeYUV(srcParam, picture, dstParam, outputFrame, interpolation);
}

void VideoProcess::ApplyEffects() const
{
    AdjustImage(outputFrame, LoadSetting(brightness), LoadSetting(contrast), LoadSetting(saturation));
    const uint32_t filters = LoadSetting(filterFlags);
    for (size_t bit = 0; bit < std::size(kFilters); ++bit) {
        if (filters & (1u << bit))
            kFilters[bit](outputFrame);
    }
    const uint32_t flips = LoadSetting(flipFlags);
    if (flips & kFlipHorz)
        FlipImageHorz(outputFrame);
    if (flips & kFlipVert)
        FlipImageVert(outputFrame);
}

void VideoProcess::BlendUserWatermark() const
{
    if (userWatermarkFrame == nullptr || userWatermarkRect == nullptr)
        return;
    const tagFRECT fractions = *userWatermarkRect;
    const int32_t width = outputFormat->width, height = outputFormat->height;
    const tagRECT place = {ScaleFraction(width, fractions.left), ScaleFraction(height, fractions.top),
                           ScaleFraction(width, fractions.right), ScaleFraction(height, fractions.bottom)};
    const int64_t placedWidth = int64_t{place.right} - place.left;
    const int64_t placedHeight = int64_t{place.bottom} - place.top;

    const MEDIA_FRAME* mark = userWatermarkFrame;
    if (!HasSize(mark, placedWidth, placedHeight)) {
        if (!CanScaleWatermark(*mark, placedWidth, placedHeight))
            return;
        if (EnsureFrame(userWatermarkCache, static_cast<int32_t>(placedWidth), static_cast<int32_t>(placedHeight), true,
                        true))
            ImageResizeYUV_Ex(userWatermarkFrame, userWatermarkCache, INTERPOLATION_BILINEAR);
        mark = userWatermarkCache;
    }
    AddWaterMark(outputFrame, mark, &place, userWatermarkLevel, kCentred);
}

void VideoProcess::BlendWatermark() const
{
    const MEDIA_FRAME* mark = LoadSetting(watermarkFrame);
    if (mark == nullptr || LoadSetting(watermarkEnabled) == 0)
        return;
    const int32_t level = LoadSetting(watermarkLevel);
    const tagRECT* rect = LoadSetting(watermarkRect);
    if (rect == nullptr) {
        AddWaterMark(outputFrame, mark, nullptr, level, LoadSetting(watermarkAlign));
        return;
    }
    // The rectangle is in output pixels of the uncropped picture: follow the crop's corner.
    const tagRECT place = cropRect != nullptr ? MovedBy(*rect, -cropRect->left, -cropRect->top) : *rect;
    AddWaterMark(outputFrame, mark, &place, level, kCentred);
}
