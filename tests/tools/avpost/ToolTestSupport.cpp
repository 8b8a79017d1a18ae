#include "ToolTestSupport.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>

namespace avpost::tool::testing {
namespace {

void RemoveTree(const std::string& path)
{
    if (DIR* dir = opendir(path.c_str())) {
        while (const dirent* entry = readdir(dir)) {
            const std::string name = entry->d_name;
            if (name != "." && name != "..")
                RemoveTree(path + "/" + name);
        }
        closedir(dir);
        rmdir(path.c_str());
    } else {
        unlink(path.c_str());
    }
}

}  // namespace

TempDir::TempDir()
{
    const char* base = std::getenv("TMPDIR");
    std::string pattern = std::string(base != nullptr && *base != '\0' ? base : "/tmp") + "/avpost-test-XXXXXX";
    if (mkdtemp(pattern.data()) == nullptr)
        throw std::runtime_error("cannot make a temporary folder");
    path_ = pattern;
}

TempDir::~TempDir()
{
    RemoveTree(path_);
}

std::vector<std::string> TempDir::List() const
{
    std::vector<std::string> names;
    if (DIR* dir = opendir(path_.c_str())) {
        while (const dirent* entry = readdir(dir)) {
            const std::string name = entry->d_name;
            if (name != "." && name != "..")
                names.push_back(name);
        }
        closedir(dir);
    }
    std::sort(names.begin(), names.end());
    return names;
}

RunResult RunProgram(const std::vector<std::string>& command, const std::string& stdinFile)
{
    TempDir capture;
    const std::string outPath = capture.File("out");
    const std::string errPath = capture.File("err");
    const pid_t child = fork();
    if (child == 0) {
        const int in = open(stdinFile.empty() ? "/dev/null" : stdinFile.c_str(), O_RDONLY);
        const int out = open(outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
        const int err = open(errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
        dup2(in, 0);
        dup2(out, 1);
        dup2(err, 2);
        std::vector<char*> argv;
        for (const std::string& word : command)
            argv.push_back(const_cast<char*>(word.c_str()));
        argv.push_back(nullptr);
        execvp(argv[0], argv.data());
        _exit(127);
    }
    RunResult result;
    int status = 0;
    if (child > 0 && waitpid(child, &status, 0) == child)
        result.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    result.out = ReadWholeFile(outPath);
    result.err = ReadWholeFile(errPath);
    return result;
}

bool HaveProgram(const std::string& name)
{
    return RunProgram({name, "-version"}).exitCode == 0;
}

std::string ReadWholeFile(const std::string& path)
{
    std::ifstream in(path, std::ios::binary);
    std::ostringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
}

void WriteWholeFile(const std::string& path, const std::string& bytes)
{
    std::ofstream(path, std::ios::binary) << bytes;
}

bool FileExists(const std::string& path)
{
    struct stat status {};
    return stat(path.c_str(), &status) == 0;
}

std::string Probe(const std::string& path, const std::string& streamType, const std::string& entry)
{
    const RunResult result = RunProgram({"ffprobe", "-v", "error", "-count_frames", "-select_streams", streamType + ":0",
                                  "-show_entries", "stream=" + entry, "-of", "default=noprint_wrappers=1:nokey=1",
                                  path});
    std::string value = result.exitCode == 0 ? result.out : "";
    while (!value.empty() && (value.back() == '\n' || value.back() == '\r'))
        value.pop_back();
    return value;
}

std::string LittleEndian(uint32_t value, int bytes)
{
    std::string out;
    for (int i = 0; i < bytes; ++i)
        out += static_cast<char>(value >> (8 * i) & 0xFF);
    return out;
}

TempDir* MediaSuite::media_ = nullptr;

bool MediaSuite::StartMedia()
{
    if (!HaveProgram("ffmpeg") || !HaveProgram("ffprobe"))
        return false;
    media_ = new TempDir;
    return true;
}

void MediaSuite::TearDownTestSuite()
{
    delete media_;
    media_ = nullptr;
}

void MediaSuite::SetUp()
{
    if (media_ == nullptr)
        GTEST_SKIP() << "FFmpeg's ffmpeg and ffprobe are not installed";
}

void MediaSuite::Make(const std::vector<std::string>& arguments)
{
    std::vector<std::string> command{"ffmpeg", "-hide_banner", "-loglevel", "error", "-y"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    ASSERT_EQ(RunProgram(command).exitCode, 0) << "making " << arguments.back();
}

}  // namespace avpost::tool::testing
