#ifndef AVPOST_MEDIA_AUDIOEXPORTS_H
#define AVPOST_MEDIA_AUDIOEXPORTS_H

#include "AvpostApi.h"
#include "Decoder.h"

// Flat functions a host uses to create, configure, seek and destroy audio stages. Every
// function accepts a null stage and then does nothing (returning null where it returns a value).

// A continuous-time-line stage (AudioEvenProcess) over an opened source; null for a null source.
AVPOST_API AudioDecoder* PEAudioCreate(AudioDecoder* source);
AVPOST_API void PEAudioDestroy(AudioDecoder* stage);

extern "C" {
// An audio stage (AudioProcess) over an opened source: sampleRate 0 keeps the format, otherwise
// the stage converts to sampleRate / channels / bitsPerSample; continuous nonzero makes the
// time line gapless first. Null for a null source.
AVPOST_API AudioDecoder* PCAudioInit(AudioDecoder* source, int sampleRate, int channels, int bitsPerSample,
                                     unsigned continuous);
// Destroys any audio stage; the source it was made over stays the host's.
AVPOST_API void PCAudioRelease(AudioDecoder* stage);
// Seeks any audio stage; the time reached is discarded.
AVPOST_API void PCAudioSeek(AudioDecoder* stage, double seconds);
// Sets the volume percentage (100 = unchanged) of a stage made by PCAudioInit; other stages
// are left alone.
AVPOST_API void PCSetVolum(AudioDecoder* stage, int volume);
}

#endif
