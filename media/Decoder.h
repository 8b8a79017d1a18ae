#ifndef AVPOST_MEDIA_DECODER_H
#define AVPOST_MEDIA_DECODER_H

#include <cwchar>

#include "AvpostApi.h"
#include "MediaFrame.h"
#include "StreamInfo.h"

// The source interfaces a host decoder implements and every stage implements over another
// source. The order of the virtual operations is part of the binary contract.

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
    // The current picture, owned by the source until its next Forward, Seek or Close; null = none.
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
    // The next block of samples, owned by the source until its next call; null = end of data.
    virtual MEDIA_FRAME* GetNextFrame() = 0;
    virtual double GetOffset() const = 0;
    virtual const STREAM_INFO* GetStreamInfo() const = 0;
};

#endif
