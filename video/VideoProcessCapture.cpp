#include <memory>

#include "image/output/SaveYUVImage.h"
#include "video/SingleLock.h"
#include "video/VideoProcess.h"

int VideoProcess::CaptureImage(wchar_t* path, int jpeg, unsigned /*reserved*/)
{
    if (path == nullptr || input == nullptr)
        return 0;
    CSingleLock lock(&mutex);

    const MEDIA_FRAME* picture = outputFrame != nullptr ? outputFrame : input->GetFrame();
    if (picture == nullptr)
        return 0;

    // A compact copy, so the converter sees tightly packed planes whatever the picture's pitches.
    std::unique_ptr<MEDIA_FRAME, void (*)(MEDIA_FRAME*)> copy(
        CreateYV12Frame(picture->width, picture->height, false, true), ReleaseYV12Frame);
    CopyVideoFrame(copy.get(), picture, true);
    return SaveYUVImage(path, jpeg, copy->width, copy->height, copy->plane[0], copy->plane[1], copy->plane[2],
                        copy->pitch[0], copy->pitch[1], copy->pitch[2]);
}
