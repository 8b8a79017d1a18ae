#ifndef AVPOST_AUDIO_VOLUME_H
#define AVPOST_AUDIO_VOLUME_H

#include "../media/AvpostApi.h"

// Scales count 16-bit samples in place by volume percent: each becomes
// (sample * volume) / 100, rounded toward zero and limited to -32767..32767. A volume of 100
// touches nothing.
AVPOST_API void ChangeVolume16(short* samples, int count, int volume);

#endif
