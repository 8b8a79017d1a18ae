#ifndef AVPOST_IMAGE_OUTPUT_IJLIOCODES_H
#define AVPOST_IMAGE_OUTPUT_IJLIOCODES_H

// The operation codes of ijlRead/ijlWrite and their success result, shared by the wrapper and
// the library it loads.

namespace avpost::detail {

constexpr int kIjlOk = 0;
constexpr int kIjlReadParamsFromBuffer = 1;  // size and channels from JPGBytes
constexpr int kIjlReadImageFromBuffer = 3;   // the whole picture from JPGBytes into DIBBytes
constexpr int kIjlWriteImageToFile = 8;      // the whole picture from DIBBytes into JPGFile

}  // namespace avpost::detail

#endif
