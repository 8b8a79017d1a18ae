#include "Common/Image/ImageConvert.h"

// Each table holds K * i for i = 0...255, spelled out by the preprocessor so that the tables are
// constant data from the start and no converter depends on start-up order.
#define AVPOST_MULTIPLES_4(k, i) (k) * ((i) + 0), (k) * ((i) + 1), (k) * ((i) + 2), (k) * ((i) + 3)
#define AVPOST_MULTIPLES_16(k, i)                                                                   \
    AVPOST_MULTIPLES_4(k, (i) + 0), AVPOST_MULTIPLES_4(k, (i) + 4), AVPOST_MULTIPLES_4(k, (i) + 8), \
        AVPOST_MULTIPLES_4(k, (i) + 12)
#define AVPOST_MULTIPLES_64(k, i)                                                                        \
    AVPOST_MULTIPLES_16(k, (i) + 0), AVPOST_MULTIPLES_16(k, (i) + 16), AVPOST_MULTIPLES_16(k, (i) + 32), \
        AVPOST_MULTIPLES_16(k, (i) + 48)
#define AVPOST_MULTIPLES_256(k)                                                             \
    {                                                                                       \
        AVPOST_MULTIPLES_64(k, 0), AVPOST_MULTIPLES_64(k, 64), AVPOST_MULTIPLES_64(k, 128), \
            AVPOST_MULTIPLES_64(k, 192)                                                     \
    }

const int mul_8258[256] = AVPOST_MULTIPLES_256(8258);
const int mul_1606[256] = AVPOST_MULTIPLES_256(1606);
const int mul_7193[256] = AVPOST_MULTIPLES_256(7193);
const int mul_4768[256] = AVPOST_MULTIPLES_256(4768);
const int mul_1163[256] = AVPOST_MULTIPLES_256(1163);
const int mul_6660[256] = AVPOST_MULTIPLES_256(6660);
const int mul_9536[256] = AVPOST_MULTIPLES_256(9536);
