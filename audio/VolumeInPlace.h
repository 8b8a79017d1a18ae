#ifndef AVPOST_AUDIO_VOLUMEINPLACE_H
#define AVPOST_AUDIO_VOLUMEINPLACE_H

namespace avpost::detail {

// The 16-bit volume rule of ChangeVolume16 on samples at any address. A source's block may start
// at an odd byte (a 24-bit stream trimmed by whole samples), so samples are loaded and stored
// without assuming alignment; the bytes are the same as ChangeVolume16's.
void ChangeVolume16At(unsigned char* bytes, int count, int volume);

}  // namespace avpost::detail

#endif
