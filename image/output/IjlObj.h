#ifndef AVPOST_IMAGE_OUTPUT_IJLOBJ_H
#define AVPOST_IMAGE_OUTPUT_IJLOBJ_H

#include "../../media/AvpostApi.h"
#include "DibImage.h"
#include "JpegCoreProperties.h"

// JPEG decoding from memory and encoding to a file through the JPEG library "IJL15.DLL",
// loaded at run time and never linked. The library is looked for, in this order:
//   1. beside the module that holds this code (the directory of libavpost.so),
//   2. in the directory of the running program,
//   3. by its plain name through the dynamic loader's search path.
// A file that cannot be loaded or lacks one of the four entry points is passed over.
// The library is installed beside libavpost.so, so step 1 finds an installed copy.
class AVPOST_API CIjlObj {
public:
    // Loads the library when it is not loaded yet.
    void Init();

    // Decodes the JPEG data (size bytes) into image as a 24-bit bitmap. 1 on success, else 0.
    int ProcessBuffer(unsigned char* buffer, unsigned long size, DibImage& image);

    // Encodes a 24-bit image into the JPEG file path at the library's default quality;
    // quality is not used. 1 on success, else 0 (also for images of another depth).
    int Save(DibImage& image, const char* path, unsigned long quality);

    void* handle = nullptr;  // of the loaded library; null while none is loaded
    int (*ijlInit)(JPEG_CORE_PROPERTIES*) = nullptr;
    int (*ijlFree)(JPEG_CORE_PROPERTIES*) = nullptr;
    int (*ijlRead)(JPEG_CORE_PROPERTIES*, int) = nullptr;
    int (*ijlWrite)(JPEG_CORE_PROPERTIES*, int) = nullptr;
};

// The process-wide instance, loaded on the first call (safe against concurrent first calls)
// and unloaded at process exit; null when the library is not available.
AVPOST_API CIjlObj* GetIjlObj();

#endif
