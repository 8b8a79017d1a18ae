#include "tools/avpost/formats/InputFile.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstring>

#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {

InputFile::InputFile(const std::string& path)
{
    if (IsStandardStream(path)) {
        file_ = stdin;
        name_ = "standard input";
    } else {
        name_ = path;
        owned_ = avpost::detail::OpenFile(path.c_str(), "rb");
        if (!owned_)
            Fail(path, std::strerror(errno));
        file_ = owned_.get();
    }
    struct stat status {};
    if (fstat(fileno(file_), &status) != 0)
        Fail(name_, std::strerror(errno));
    if (S_ISDIR(status.st_mode))
        Fail(name_, "is a folder, not a file");
    seekable_ = S_ISREG(status.st_mode);
    size_ = seekable_ ? static_cast<long long>(status.st_size) : 0;
}

size_t InputFile::Read(void* buffer, size_t count)
{
    // Once a signal asked the run to stop, a read that could wait for a pipe must not start.
    if (PendingInterruption() != 0)
        Fail(name_, "interrupted");
    const size_t got = std::fread(buffer, 1, count, file_);
    if (got < count && std::ferror(file_))
        Fail(name_, std::string("read error: ") + std::strerror(errno));
    return got;
}

long long InputFile::Tell() const { return ftello(file_); }

void InputFile::SeekTo(long long position)
{
    if (!seekable_ || fseeko(file_, position, SEEK_SET) != 0)
        Fail(name_, "cannot seek");
}

}  // namespace avpost::tool
