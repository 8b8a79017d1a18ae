#ifndef AVPOST_IMAGE_EFFECTS_DEINTERLACE_H
#define AVPOST_IMAGE_EFFECTS_DEINTERLACE_H

#include <cstdint>

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"

// Which field of an interlaced picture is kept and how the other is rebuilt. Even rows are
// 0, 2, 4, ...; odd rows 1, 3, 5, ...
enum DEINTERLACE_STYLE : int32_t {
    DEINTERLACE_NONE = 0,              // picture untouched
    DEINTERLACE_EVEN_DOUBLE = 1,       // each odd row copies the row above
    DEINTERLACE_ODD_DOUBLE = 2,        // each even row copies the row below
    DEINTERLACE_EVEN_INTERPOLATE = 3,  // each odd row with a row below averages its neighbours
    DEINTERLACE_ODD_INTERPOLATE = 4,   // each even row from row 2 with a row below averages its neighbours
    DEINTERLACE_STYLE_5 = 5,           // accepted, picture untouched
};

// Makes an interlaced frame progressive in place, applying the style to the luma plane and,
// separately, to the rows of each chroma plane. The planes are taken as packed (the pitch
// fields are not read). A null frame and any style other than 1...4 do nothing.
AVPOST_API void DeinterlaceImage(MEDIA_FRAME* frame, DEINTERLACE_STYLE style);

#endif
