#ifndef AVPOST_MEDIA_DECODER_H
#define AVPOST_MEDIA_DECODER_H

#include <cwchar>

#include "AvpostApi.h"
#include "MediaFrame.h"
#include "StreamInfo.h"

// The source interfaces a host decoder implements and every stage implements over another
// source. The order of the virtual operations is part of the binary contract.
//
// Frames and threads (the one place this is said; the other headers and the README refer here):
// - A frame returned by GetFrame or GetNextFrame belongs to the object that returned it. A video
//   picture stays valid until that object's next Forward, Seek, GetFrame or Close; an audio
//   block until its next GetNextFrame, Seek or Close. A stage with nothing to do hands out its
//   source's own frame, which then lives by the source's terms. A VideoProcess picture also
//   outlives one change of output size made by SetCropRect. To keep a picture longer, copy it
//   (CreateYV12Frame, then CopyVideoFrame).
// - Each stage is pulled from one thread. A VideoProcess may be configured from another thread
//   meanwhile: GetFrame, SetCropRect, SetUserWatermarkImage and CaptureImage hold the stage's
//   lock; brightness, contrast, saturation, filters, flips, deinterlacing and DisableWatermark
//   are single words written and read atomically without the lock, so a change may show
//   part-way through a picture; the fixed-watermark setters take no lock: call them between
//   pictures.
// - Audio stages and JPEG captures share process-wide state: drive them from one thread at a time.

class AVPOST_API VideoDecoder {
public:
    virtual ~VideoDecoder() {}
    virtual void Close() = 0;
    virtual int Open(const wchar_t* path, const DecParam* param, int* result) = 0;
    // Three decoder-specific values; 0 = not handled.
    virtual int SetExDecodeParam(unsigned, unsigned, unsigned) = 0;
    // Valid while the source lives.
    virtual const STREAM_INFO* GetStreamInfo() const = 0;
    // Returns the time reached in seconds; flags are decoder-specific and passed on unchanged.
    virtual double Seek(double seconds, unsigned flags) = 0;
    virtual double GetOffset() const = 0;
    // The current picture (how long it stays valid: above); null = none.
    virtual MEDIA_FRAME* GetFrame() const = 0;
    // Advances by count pictures; >= 1 on success, < 1 when no further picture could be produced.
    virtual int Forward(int count) = 0;
};

class AVPOST_API AudioDecoder {
public:
    virtual ~AudioDecoder() {}
    virtual void Close() = 0;
    virtual int Open(const wchar_t* path, const DecParam* param, int* result) = 0;
    virtual double Seek(double seconds) = 0;
    // The next block of samples (how long it stays valid: above); null = end of data.
    virtual MEDIA_FRAME* GetNextFrame() = 0;
    virtual double GetOffset() const = 0;
    virtual const STREAM_INFO* GetStreamInfo() const = 0;
};

#endif
