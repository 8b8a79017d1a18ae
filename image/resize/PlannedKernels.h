#ifndef AVPOST_IMAGE_RESIZE_PLANNEDKERNELS_H
#define AVPOST_IMAGE_RESIZE_PLANNEDKERNELS_H

#include "image/resize/ImgParam.h"
#include "image/resize/PlannedRows.h"
#include "image/resize/ResizeRows.h"

// The resize kernels walked with column plans and an instruction set's rows: the bytes of the
// reference kernels, found faster. Each horizontal pass of a source row is computed once; output
// rows blend two of them. The caller has checked the request as the reference kernel does.
namespace avpost::detail {

void PlannedNearY(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedBiLinerY(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedNearUV(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedBiLinerUV(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);

void PlannedNear(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedBiLiner(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedNear8(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);
void PlannedBiLiner8(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);

using ReferenceKernel = void (*)(const IMG_PARAM& src, const IMG_PARAM& dst);
using PlannedKernel = void (*)(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst);

// A kernel's result for an accepted request (1) after running the planned kernel with the row
// set of this CPU, or the reference at the scalar level; 0 without writing for a refused one.
inline int RunFastest(bool accepted, ReferenceKernel reference, PlannedKernel planned, const IMG_PARAM& src,
                      const IMG_PARAM& dst)
{
    if (!accepted)
        return 0;
    if (const ResizeRowSet* set = PlannedRowSet())
        planned(*set, src, dst);
    else
        reference(src, dst);
    return 1;
}

}  // namespace avpost::detail

#endif
