#include "tools/avpost/InputFile.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstring>

#include "tools/avpost/ToolError.h"

namespace avpost::tool {

InputFile::InputFile(const std::string& path)
{
    if (IsStandardStream(path)) {
        file_ = stdin;
        name_ = "standard input";
    } else {
        name_ = path;
        owned_.reset(std::fopen(path.c_str(), "rb"));
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
    const size_t got = std::fread(buffer, 1, count, file_);
    if (got < count && std::ferror(file_))
        Fail(name_, std::string("read error: ") + std::strerror(errno));
    return got;
}

bool InputFile::ReadExactly(void* buffer, size_t count, const std::string& what)
{
    const size_t got = Read(buffer, count);
    if (got == count)
        return true;
    if (got == 0)
        return false;
    Fail(name_, "truncated " + what + " (" + std::to_string(got) + " of " + std::to_string(count) +
                    " bytes)");
}

}  // namespace avpost::tool
