#ifndef AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H
#define AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H

#include <gtest/gtest.h>

#include <cstdint>
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

// value as `bytes` little-endian bytes.
std::string LittleEndian(uint32_t value, int bytes);

// A suite whose media files FFmpeg's command-line tool makes once, in SetUpTestSuite of the
// derived suite through Make; every test is skipped when ffmpeg or ffprobe is missing.
class MediaSuite : public ::testing::Test {
protected:
    // Makes the media folder; false (and every test skipped) without FFmpeg's tools.
    static bool StartMedia();
    static void TearDownTestSuite();
    void SetUp() override;

    static std::string Media(const std::string& name) { return media_->File(name); }
    // Runs ffmpeg quietly with these arguments, the last being the file it makes.
    static void Make(const std::vector<std::string>& arguments);

private:
    static TempDir* media_;
};

}  // namespace avpost::tool::testing

#endif
