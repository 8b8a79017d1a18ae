#ifndef AVPOST_TOOLS_AVPOST_JOBS_CAPTURES_H
#define AVPOST_TOOLS_AVPOST_JOBS_CAPTURES_H

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {

// The file name of thumbnail `number` (from 1): the pattern's one %d (or %03d ...) replaced
// by the number, %% by %.
std::string ThumbnailName(const std::string& pattern, int number);

// The pictures a video run saves as BMP or JPEG: those asked for at given times, and a
// thumbnail every so many seconds. Each file is written under a temporary name and put in
// place by Commit, once the main output is complete, so that a failed run leaves none of them.
class CaptureSchedule {
public:
    // Writes the picture to a path as JPEG (or BMP); true when it did.
    using Take = std::function<bool(const std::string& path, bool jpeg)>;

    // Makes the files of the timed captures and of the first thumbnail at once, so that an
    // impossible name fails before the run. Throws ToolError naming the file.
    CaptureSchedule(const std::vector<Capture>& captures, const Thumbnails& thumbnails);

    // Takes what is due at the output picture `seconds` from the start; at the end, every
    // timed capture still waiting (with a note that the output ended before its time).
    // Throws ToolError naming a file that could not be written.
    void Due(double seconds, bool atEnd, const Take& take, std::vector<std::string>& notes);
    // Puts every file in place.
    void Commit();

    // The thumbnails written so far.
    int thumbnailsTaken() const { return thumbnailsTaken_; }

private:
    void Shoot(const StagedPath& file, bool jpeg, const std::string& name, const Take& take);

    std::vector<Capture> captures_;
    std::vector<std::unique_ptr<StagedPath>> captureFiles_;
    std::vector<bool> captured_;
    Thumbnails thumbnails_;
    std::vector<std::unique_ptr<StagedPath>> thumbnailFiles_;
    int thumbnailsTaken_ = 0;
    double nextThumbnail_ = 0.0;
};

}  // namespace avpost::tool

#endif
