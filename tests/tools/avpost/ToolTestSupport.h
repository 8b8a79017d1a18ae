#ifndef AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H
#define AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H

#include <string>
#include <vector>

namespace avpost::tool::testing {

// A fresh folder under the system's temporary folder, removed with everything in it.
class TempDir {
public:
    TempDir();
    ~TempDir();
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    const std::string& path() const { return path_; }
    std::string File(const std::string& name) const { return path_ + "/" + name; }
    // Names in the folder, sorted.
    std::vector<std::string> List() const;

private:
    std::string path_;
};

struct RunResult {
    int exitCode = -1;
    std::string out;
    std::string err;
};

// Runs a program found on PATH (or by its path) with arguments, no shell involved; standard
// input is empty unless stdinFile names a file to read it from.
RunResult RunProgram(const std::vector<std::string>& command, const std::string& stdinFile = "");

// True when a program is on PATH.
bool HaveProgram(const std::string& name);

std::string ReadWholeFile(const std::string& path);
void WriteWholeFile(const std::string& path, const std::string& bytes);
bool FileExists(const std::string& path);

// One value from ffprobe about a file's first stream of a type ("v" or "a"), such as
// "width", "nb_read_frames" or "duration"; empty when ffprobe cannot tell.
std::string Probe(const std::string& path, const std::string& streamType, const std::string& entry);

}  // namespace avpost::tool::testing

#endif
