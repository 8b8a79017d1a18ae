#ifndef AVPOST_TESTS_IMAGE_OUTPUT_LIBJPEGREADER_H
#define AVPOST_TESTS_IMAGE_OUTPUT_LIBJPEGREADER_H

// Reads JPEG files with libjpeg, as an independent check of the files we write.

#include <array>
#include <vector>

#include "OutputTestFiles.h"

namespace avpost_test {

// The decoded picture (empty when libjpeg failed) and the number of warnings it gave.
Picture DecodeJpeg(const Bytes& jpeg, int* warnings);

// Quantised coefficients of each component, block by block (row-major), natural order.
struct Coefficients {
    int blocksWide = 0;
    int blocksHigh = 0;
    std::vector<std::array<short, 64>> component[3];
};
Coefficients ReadCoefficients(const Bytes& jpeg);

// Quantisation tables 0 and 1 (natural order), then the counts and values of the Huffman
// tables DC 0, AC 0, DC 1, AC 1, as one list.
std::vector<int> TablesOf(const Bytes& jpeg);
// The same list for libjpeg's standard tables, the quantisers scaled linearly to 50 %.
std::vector<int> StandardTablesAtHalfScale();

}  // namespace avpost_test

#endif
