#ifndef AVPOST_MEDIA_VIDEOEXPORTS_H
#define AVPOST_MEDIA_VIDEOEXPORTS_H

#include "AvpostApi.h"
#include "Decoder.h"

// Flat functions a host uses to create, seek and destroy video stages. Every function
// accepts a null stage and then does nothing (returning null where it returns a value).

// A constant-frame-rate stage over an opened source; null when source is null or when
// no positive frame rate results (frameRate <= 0 and the source reports none).
AVPOST_API VideoDecoder* PEVideoCreate(VideoDecoder* source, double frameRate);
AVPOST_API void PEVideoDestroy(VideoDecoder* stage);

extern "C" {
// Seeks any video stage; the time reached is discarded.
AVPOST_API void PCVideoSeek(VideoDecoder* stage, double seconds, unsigned flags);
}

#endif
