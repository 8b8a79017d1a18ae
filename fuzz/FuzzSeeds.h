#ifndef AVPOST_FUZZ_FUZZSEEDS_H
#define AVPOST_FUZZ_FUZZSEEDS_H

#include <cstdint>
#include <vector>

// Each target's starting inputs: small valid cases of what it reads, from which the fuzzer
// mutates. Defined beside the target's LLVMFuzzerTestOneInput.
std::vector<std::vector<uint8_t>> FuzzSeeds();

#endif
