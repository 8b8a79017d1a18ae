#include "tools/avpost/output/OutputFile.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/InputFile.h"

namespace avpost::tool {
namespace {

std::string SystemError() { return std::strerror(errno); }

// "dir/name" -> "dir/.name.part-XXXXXX": hidden, and in the target's own folder.
std::string TemporaryTemplate(const std::string& target)
{
    const size_t slash = target.find_last_of('/');
    const std::string folder = slash == std::string::npos ? "" : target.substr(0, slash + 1);
    const std::string base = slash == std::string::npos ? target : target.substr(slash + 1);
    return folder + "." + base + ".part-XXXXXX";
}

// mkstemp makes files readable by the owner only; a finished output gets the usual mode.
void GiveUsualMode(int descriptor)
{
    const mode_t mask = umask(0);
    umask(mask);
    fchmod(descriptor, 0666 & ~mask);
}

}  // namespace

StagedPath::StagedPath(const std::string& target) : target_(target)
{
    if (target.empty() || target.back() == '/')
        Fail(target.empty() ? "output" : target, "needs a file name");
    struct stat status {};
    if (stat(target.c_str(), &status) == 0 && S_ISDIR(status.st_mode))
        Fail(target, "is a folder, not a file");

    std::string pattern = TemporaryTemplate(target);
    std::vector<char> name(pattern.begin(), pattern.end());
    name.push_back('\0');
    const int descriptor = mkstemp(name.data());
    if (descriptor < 0)
        Fail(target, "cannot create: " + SystemError());
    GiveUsualMode(descriptor);
    close(descriptor);
    temporary_ = name.data();
}

StagedPath::~StagedPath()
{
    if (!committed_)
        std::remove(temporary_.c_str());
}

bool StagedPath::HasContent() const
{
    struct stat status {};
    return stat(temporary_.c_str(), &status) == 0 && status.st_size > 0;
}

void StagedPath::Commit()
{
    if (std::rename(temporary_.c_str(), target_.c_str()) != 0)
        Fail(target_, "cannot put the finished file in place: " + SystemError());
    committed_ = true;
}

bool IsDevice(const std::string& path)
{
    struct stat status {};
    return stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode) && !S_ISDIR(status.st_mode);
}

OutputFile::OutputFile(const std::string& path)
{
    if (IsStandardStream(path)) {
        file_ = stdout;
        name_ = "standard output";
        return;
    }
    name_ = path;
    // Devices and pipes (/dev/null, a FIFO) cannot be replaced by a finished file: they are
    // written directly.
    if (!IsDevice(path))
        staged_ = std::make_unique<StagedPath>(path);
    owned_ = avpost::detail::OpenFile(staged_ ? staged_->temporary().c_str() : path.c_str(), "wb");
    if (!owned_)
        Fail(path, "cannot create: " + SystemError());
    file_ = owned_.get();
}

void OutputFile::Write(const void* data, size_t size)
{
    if (size != 0 && std::fwrite(data, 1, size, file_) != size)
        FailToWrite();
}

void OutputFile::FailToWrite() const
{
    if (errno == EPIPE) {
        NoteBrokenPipe();
        throw Interrupted(SIGPIPE);
    }
    Fail(name_, "write error: " + SystemError());
}

void OutputFile::Commit()
{
    if (std::fflush(file_) != 0 || std::ferror(file_))
        FailToWrite();
    if (!owned_)
        return;
    if (avpost::detail::CloseFile(owned_) != 0)
        FailToWrite();
    file_ = nullptr;
    if (staged_)
        staged_->Commit();
}

}  // namespace avpost::tool
