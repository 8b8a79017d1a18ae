#ifndef AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H
#define AVPOST_TESTS_TOOLS_AVPOST_TOOLTESTSUPPORT_H

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "support/LittleEndian.h"
#include "tools/avpost/common/ToolError.h"

namespace avpost::tool::testing {

// A fresh folder under the system's temporary folder, removed with everything in it.
class TempDir {
public:
    TempDir() : path_((std::filesystem::temp_directory_path() / "avpost-test-XXXXXX").string())
    {
        if (mkdtemp(path_.data()) == nullptr)
            throw std::runtime_error("cannot make a temporary folder");
    }
    ~TempDir()
    {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    const std::string& path() const { return path_; }
    std::string File(const std::string& name) const { return path_ + "/" + name; }
    // Names in the folder, sorted.
    std::vector<std::string> List() const
    {
        std::vector<std::string> names;
        for (const auto& entry : std::filesystem::directory_iterator(path_))
            names.push_back(entry.path().filename().string());
        std::sort(names.begin(), names.end());
        return names;
    }

private:
    std::string path_;
};

inline std::string ReadWholeFile(const std::string& path)
{
    std::ifstream in(path, std::ios::binary);
    std::ostringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
}

inline void WriteWholeFile(const std::string& path, const std::string& bytes)
{
    std::ofstream(path, std::ios::binary) << bytes;
}

struct RunResult {
    int exitCode = -1;
    std::string out;
    std::string err;
};

// In a child process: becomes the program found on PATH (or by its path), no shell involved.
[[noreturn]] inline void Become(const std::vector<std::string>& command)
{
    std::vector<char*> argv;
    for (const std::string& word : command)
        argv.push_back(const_cast<char*>(word.c_str()));
    argv.push_back(nullptr);
    execvp(argv[0], argv.data());
    _exit(127);
}

// Runs a program with arguments; standard input is empty unless stdinFile names a file to
// read it from.
inline RunResult RunProgram(const std::vector<std::string>& command, const std::string& stdinFile = "")
{
    TempDir capture;
    const pid_t child = fork();
    if (child == 0) {
        dup2(open(stdinFile.empty() ? "/dev/null" : stdinFile.c_str(), O_RDONLY), 0);
        dup2(open(capture.File("out").c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600), 1);
        dup2(open(capture.File("err").c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600), 2);
        Become(command);
    }
    RunResult result;
    int status = 0;
    if (child > 0 && waitpid(child, &status, 0) == child)
        result.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    result.out = ReadWholeFile(capture.File("out"));
    result.err = ReadWholeFile(capture.File("err"));
    return result;
}

// avpost reading standard input from a pipe that the test feeds, so that the run is still
// going when the test sends its signal.
class FedRun {
public:
    explicit FedRun(const std::vector<std::string>& arguments)
    {
        int fds[2];
        EXPECT_EQ(pipe(fds), 0);
        child_ = fork();
        if (child_ == 0) {
            dup2(fds[0], 0);
            close(fds[1]);
            dup2(open("/dev/null", O_WRONLY), 2);
            Become(arguments);
        }
        close(fds[0]);
        feed_ = fds[1];
    }
    ~FedRun() { close(feed_); }
    FedRun(const FedRun&) = delete;
    FedRun& operator=(const FedRun&) = delete;

    void Feed(const std::string& bytes) { EXPECT_EQ(write(feed_, bytes.data(), bytes.size()), ssize_t(bytes.size())); }
    // Sends the signal until the run ends (one that comes between two reads is noticed at the
    // next; the next signal interrupts that read), and returns the exit status.
    int Interrupt(int signal)
    {
        int status = 0;
        for (int tries = 0; tries < 50 && waitpid(child_, &status, WNOHANG) == 0; ++tries) {
            kill(child_, signal);
            std::this_thread::sleep_for(std::chrono::milliseconds(100));
        }
        return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    }

private:
    pid_t child_ = -1;
    int feed_ = -1;
};

// Waits until a file other than those named appears in the folder (the staged output).
inline bool SomethingAppears(const TempDir& dir, size_t already)
{
    for (int i = 0; i < 500; ++i) {
        if (dir.List().size() > already)
            return true;
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return false;
}

// Values from ffprobe about a file's first stream of a type ("v" or "a"), such as
// "width,nb_read_frames", comma-separated in ffprobe's own order (codec_name, width, height,
// pix_fmt, r_frame_rate, nb_read_frames; sample_rate, channels, duration); empty when ffprobe
// cannot tell.
inline std::string Probe(const std::string& path, const std::string& streamType, const std::string& entries)
{
    const RunResult run = RunProgram({"ffprobe", "-v", "error", "-count_frames", "-select_streams", streamType + ":0",
                                      "-show_entries", "stream=" + entries, "-of", "csv=p=0", path});
    return run.exitCode == 0 ? run.out.substr(0, run.out.find('\n')) : "";
}

// A value from ffprobe about a file's container, such as "duration"; empty when it cannot tell.
inline std::string ProbeFormat(const std::string& path, const std::string& entry)
{
    const RunResult run =
        RunProgram({"ffprobe", "-v", "error", "-show_entries", "format=" + entry, "-of", "csv=p=0", path});
    return run.exitCode == 0 ? run.out.substr(0, run.out.find('\n')) : "";
}

// Words joined by spaces, for messages about a command line.
inline std::string JoinedWords(const std::vector<std::string>& words)
{
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : " ") + word;
    return text;
}

inline double ProbeSeconds(const std::string& path, const std::string& streamType)
{
    return std::atof(Probe(path, streamType, "duration").c_str());
}

// value as two or four little-endian bytes.
inline std::string Le16(uint32_t value)
{
    std::string out;
    avpost::detail::AppendLe16(out, value);
    return out;
}

inline std::string Le32(uint32_t value)
{
    std::string out;
    avpost::detail::AppendLe32(out, value);
    return out;
}

// The message of the ToolError that action throws; empty when it throws none.
template <typename Action>
std::string ToolErrorOf(Action action)
{
    try {
        action();
    } catch (const ToolError& error) {
        return error.what();
    }
    return "";
}

// Expects error to name path and then give reason; an empty reason expects no error at all.
inline void ExpectNamedError(const std::string& error, const std::string& path, const std::string& reason)
{
    if (reason.empty()) {
        EXPECT_EQ(error, "");
        return;
    }
    EXPECT_EQ(error.rfind(path + ": ", 0), 0u) << error;
    EXPECT_NE(error.find(reason), std::string::npos) << reason << " -> " << error;
}

// A suite whose media files FFmpeg's command-line tool makes once, in SetUpTestSuite of the
// derived suite through Make; every test is skipped when ffmpeg or ffprobe is missing.
class MediaSuite : public ::testing::Test {
protected:
    // Makes the media folder; false (and every test skipped) without FFmpeg's tools.
    static bool StartMedia()
    {
        for (const char* program : {"ffmpeg", "ffprobe"})
            if (RunProgram({program, "-version"}).exitCode != 0)
                return false;
        media_ = std::make_unique<TempDir>();
        return true;
    }
    void SetUp() override
    {
        if (!media_)
            GTEST_SKIP() << "FFmpeg's ffmpeg and ffprobe are not installed";
    }

    static std::string Media(const std::string& name) { return media_->File(name); }
    // A media file made on first use (each test runs in a process of its own and needs few):
    // ffmpeg's arguments for it come from recipe(name), without the file.
    template <typename Recipe>
    static std::string MadeOnce(const std::string& name, Recipe recipe)
    {
        if (!std::filesystem::exists(Media(name))) {
            std::vector<std::string> arguments = recipe(name);
            arguments.push_back(Media(name));
            Make(arguments);
        }
        return Media(name);
    }
    // Runs ffmpeg quietly with these arguments, the last being the file it makes.
    static void Make(std::vector<std::string> arguments)
    {
        arguments.insert(arguments.begin(), {"ffmpeg", "-hide_banner", "-loglevel", "error", "-y"});
        ASSERT_EQ(RunProgram(arguments).exitCode, 0) << "making " << arguments.back();
    }
    // "clip.mp4": 2 s of 320x240 pictures at 25/s with 44.1 kHz stereo AAC sound; "late-sound.mkv":
    // 1 s of anamorphic 16:9 720x576 pictures, with 48 kHz mono PCM sound starting 0.5 s after them.
    static void MakeContainers()
    {
        Make({"-f", "lavfi", "-i", "testsrc2=size=320x240:rate=25:duration=2", "-f", "lavfi", "-i",
              "sine=frequency=440:sample_rate=44100:duration=2", "-c:v", "mpeg4", "-c:a", "aac", "-ac", "2",
              "-shortest", Media("clip.mp4")});
        Make({"-f", "lavfi", "-i", "testsrc2=size=720x576:rate=25:duration=1", "-itsoffset", "0.5", "-f", "lavfi", "-i",
              "sine=sample_rate=48000:duration=1", "-aspect", "16:9", "-c:v", "mpeg4", "-c:a", "pcm_s16le",
              Media("late-sound.mkv")});
    }

private:
    static inline std::unique_ptr<TempDir> media_;
};

}  // namespace avpost::tool::testing

#endif
