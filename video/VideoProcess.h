#ifndef AVPOST_VIDEO_VIDEOPROCESS_H
#define AVPOST_VIDEO_VIDEOPROCESS_H

#include <pthread.h>

#include <cstdint>

#include "../image/effects/Deinterlace.h"
#include "../image/resize/ImgParam.h"
#include "../media/AvpostApi.h"
#include "../media/Decoder.h"
#include "../media/WinTypes.h"
#include "ResizeParam.h"

// Turns each picture of a video source into the picture a consumer asked for: deinterlaced,
// cropped and resized into the requested size under a fit policy (black bars elsewhere),
// adjusted, filtered, mirrored and watermarked. With a positive frame rate the stage puts a
// VideoEvenProcess of its own between itself and the source. While nothing is to be done it
// hands the source's pictures through without copying, until it has made a picture of its own.
//
// The source is not owned: it is never opened, closed by the destructor, or destroyed here.
//
// Which calls take the stage's lock, and how long its pictures stay valid: media/Decoder.h.
class AVPOST_API VideoProcess : public VideoDecoder {
public:
    // request may be null: then the output keeps the source's format. A frameRate between
    // -0.001 and 0.001 takes the source's rate; a positive rate inserts the even stage.
    VideoProcess(VideoDecoder* source, const RESIZE_PARAM* request, double frameRate, bool keepLastFrame);
    ~VideoProcess() override;
    VideoProcess(const VideoProcess&) = delete;
    VideoProcess& operator=(const VideoProcess&) = delete;

    // Closes the input (the host's source only when no even stage sits between) and drops
    // the kept last picture.
    void Close() override;
    int Open(const wchar_t* path, const DecParam* param, int* result) override;
    int SetExDecodeParam(unsigned a, unsigned b, unsigned c) override;
    const STREAM_INFO* GetStreamInfo() const override;
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    // The processed picture, owned by the stage (valid as media/Decoder.h says); the input's own
    // picture while passing through; null when there is no picture or the input has no stream
    // information. When the input has no picture, a kept last picture (keepLastFrame) is drawn
    // anew in its place, resize included.
    MEDIA_FRAME* GetFrame() const override;
    int Forward(int count) override;

    void SetExFilterFlag(unsigned flags);
    void SetFlipFlag(unsigned flags);
    void SetDeintelace(DEINTERLACE_STYLE style);
    // 0 shows the fixed watermark again, anything else hides it; the image is kept.
    void DisableWatermark(unsigned disable);

    // Fixed watermark from a 32-bit bitmap with alpha (rows top-down) or a 20-bit planar one
    // (Y, V, U, alpha packed without gaps); bits null = the pixels follow the 40-byte header.
    // Placed by an alignment code and scaled to four fifths of the output width, aspect kept
    // within the output height. Replaces the previous one; a refused bitmap leaves none and
    // prints its reason on standard output. Takes no lock: call it between frames.
    void SetWatermarkImageAlign(tagBITMAPINFO* bitmap, unsigned char* bits, int align, int level);
    // The same placed by a rectangle in output pixels and scaled to it exactly (null rect: sized
    // as the aligned one). A placement below 2 x 2 keeps no watermark.
    void SetWatermarkImage(tagBITMAPINFO* bitmap, unsigned char* bits, tagRECT* rect, int level);
    // User watermark placed by fractions of the output size; bBottomUp != 0 reads a 32-bit
    // bitmap bottom-up. bitmap or bits equal to (void*)-1 only moves (rect) and re-levels the
    // current one; null removes it. Holds the stage's lock, so it may run beside GetFrame.
    void SetUserWatermarkImage(tagBITMAPINFO* bitmap, unsigned char* bits, tagFRECT* rect, int level, int bBottomUp);
    // Accepted for compatibility; they have no effect.
    void SetWatermarkSrcID(void* module, const wchar_t* id, tagRECT* rect, int level);
    void SetWatermarkSrcIDAlign(void* module, const wchar_t* id, int align, int level);

    // Writes the current output picture (or, before the stage made one, the input's picture) as
    // a BMP file, or as a JPEG file when jpeg != 0. Returns 1 when written, 0 otherwise.
    int CaptureImage(wchar_t* path, int jpeg, unsigned reserved);

    // Replaces outputFrame by a new black picture of the given size and returns it.
    MEDIA_FRAME* PrepareMemImage(int width, int height) const;
    // Resizes the current picture into outputFrame on a black background.
    void MakeResizeImage() const;
    // The same while a crop is set, drawing over what outputFrame already holds.
    void MakeCropImageEx() const;
    // Copies the crop rectangle of the current picture into outputFrame, unscaled.
    void MakeCropImage() const;
    // Sets (source pixels) or clears the crop and recomputes the output format and the resize
    // geometry. A rectangle that clamps to the whole picture (given from (0, 0)), or to no
    // rows or columns, or whose edges are reversed, clears the crop. Null does nothing.
    void SetCropRect(const tagRECT* rect);

    VideoDecoder* source;
    VideoDecoder* input;                     // source, or an owned VideoEvenProcess over it
    STREAM_INFO::VIDEO* outputFormat;        // owned
    const STREAM_INFO::VIDEO* sourceFormat;  // inside the source's record
    STREAM_INFO* streamInfo;                 // owned; video equals *outputFormat
    int32_t brightness;
    int32_t contrast;
    int32_t saturation;
    MEDIA_FRAME* watermarkFrame;  // owned
    int32_t watermarkEnabled;
    uint32_t filterFlags;
    uint32_t flipFlags;
    tagRECT* watermarkRect;  // owned; output pixels, moved by the crop
    int32_t watermarkLevel;
    int32_t watermarkAlign;
    MEDIA_FRAME* userWatermarkFrame;          // owned
    mutable MEDIA_FRAME* userWatermarkCache;  // owned; userWatermarkFrame at its placed size
    int32_t userWatermarkLevel;
    tagFRECT* userWatermarkRect;            // owned; fractions of the output size
    mutable MEDIA_FRAME* outputFrame;       // owned
    mutable MEDIA_FRAME* deinterlaceFrame;  // owned
    MEDIA_FRAME* retiredFrame;              // owned; the output before the last size change
    tagRECT* cropRect;                      // owned; source pixels; null = no crop
    RESIZE_PARAM* resizeParam;              // owned; null when no request was given
    mutable IMG_PARAM srcParam;
    mutable IMG_PARAM dstParam;
    mutable pthread_mutex_t mutex;
    DEINTERLACE_STYLE deinterlaceStyle;
    mutable MEDIA_FRAME* lastFrame;  // owned; copy of the input's last picture
    bool keepLastFrame;

private:
    bool NothingToDo() const;
    MEDIA_FRAME* InputPicture() const;
    MEDIA_FRAME* PictureForResize() const;
    void KeepCopy(const MEDIA_FRAME& picture) const;
    void DrawMainPicture(const MEDIA_FRAME& picture, bool copyAsIs, bool onBlack) const;
    void DrawScaled(bool onBlack) const;
    void DrawResized(MEDIA_FRAME* picture, bool onBlack) const;
    void ApplyEffects() const;
    void BlendUserWatermark() const;
    void BlendWatermark() const;
    void RetireOutputFrame();
    void ReleaseFixedWatermark();
    void PrepareFixedWatermark(tagBITMAPINFO* bitmap, unsigned char* bits, const tagRECT* rect);
};

#endif
