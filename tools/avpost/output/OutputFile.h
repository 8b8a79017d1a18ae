#ifndef AVPOST_TOOLS_AVPOST_OUTPUT_OUTPUTFILE_H
#define AVPOST_TOOLS_AVPOST_OUTPUT_OUTPUTFILE_H

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>

#include "support/FileHandle.h"

namespace avpost::tool {

// A file that appears under its name only once it is complete. It is written under a temporary
// name in the same folder (so the final rename cannot cross file systems) and Commit renames it
// over the target. Destroyed without Commit, the temporary file is removed and an existing
// target is left exactly as it was.
class StagedPath {
public:
    // Creates the empty temporary file; throws ToolError naming the target when it cannot.
    explicit StagedPath(const std::string& target);
    ~StagedPath();
    StagedPath(const StagedPath&) = delete;
    StagedPath& operator=(const StagedPath&) = delete;

    const std::string& target() const { return target_; }
    // Where writers that take a path put the content.
    const std::string& temporary() const { return temporary_; }
    // True once something wrote at least one byte into the temporary file.
    bool HasContent() const;
    void Commit();

private:
    std::string target_;
    std::string temporary_;
    bool committed_ = false;
};

// Where a result is written: a named file (staged, see above), a device or pipe written
// directly (/dev/null), or standard output for "-".
class OutputFile {
public:
    explicit OutputFile(const std::string& path);

    std::FILE* get() const { return file_; }
    // The path as given, or "standard output".
    const std::string& name() const { return name_; }
    // True for named files: a writer may go back and patch what it wrote before Commit.
    // Standard output never counts, even when redirected to a file it may be appending to.
    bool patchable() const { return staged_ != nullptr; }
    // Throws ToolError on a write failure (a full disk), Interrupted when the reader of a pipe
    // went away.
    void Write(const void* data, size_t size);
    // Flushes everything and puts a named output in place.
    void Commit();

private:
    [[noreturn]] void FailToWrite() const;

    std::unique_ptr<StagedPath> staged_;
    avpost::detail::FileHandle owned_;
    std::FILE* file_ = nullptr;
    std::string name_;
};

// True when path names an existing device or pipe (/dev/null, a FIFO), which an OutputFile
// writes directly.
bool IsDevice(const std::string& path);

}  // namespace avpost::tool

#endif
