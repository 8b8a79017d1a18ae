// The tool's command line, split from the input at zero bytes, parsed up to the point where
// files would open: every option, value and range check of the option table.
#include <cstdint>
#include <string>
#include <vector>

#include "FuzzSeeds.h"
#include "tools/avpost/cli/CommandLine.h"
#include "tools/avpost/common/ToolError.h"

namespace {

std::vector<std::string> Arguments(const uint8_t* data, size_t size)
{
    std::vector<std::string> arguments(1);
    for (size_t i = 0; i < size; ++i) {
        if (data[i] == 0)
            arguments.emplace_back();
        else
            arguments.back().push_back(static_cast<char>(data[i]));
    }
    if (size == 0)
        arguments.clear();
    return arguments;
}

std::vector<uint8_t> Joined(const std::vector<std::string>& arguments)
{
    std::vector<uint8_t> bytes;
    for (const std::string& argument : arguments) {
        if (!bytes.empty())
            bytes.push_back(0);
        bytes.insert(bytes.end(), argument.begin(), argument.end());
    }
    return bytes;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    try {
        avpost::tool::ParseCommandLine(Arguments(data, size));
    } catch (const avpost::tool::ToolError&) {
        // the one-line refusal the tool prints
    }
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    return {Joined({"video",
                    "in.mp4",
                    "out.y4m",
                    "--size",
                    "1280x720",
                    "--fps",
                    "25",
                    "--fit",
                    "16:9",
                    "--deinterlace",
                    "even-average",
                    "--filter",
                    "sepia,negative",
                    "--capture",
                    "0:00:02.500=still.jpg",
                    "--crop",
                    "10:10:300:200",
                    "--watermark",
                    "logo.bmp",
                    "--watermark-pos",
                    "top-right",
                    "--rotate",
                    "auto"}),
            Joined({"audio", "in.wav", "-", "--rate", "44100", "--channels", "2", "--volume", "80", "--continuous"}),
            Joined({"demo", "folder"}), Joined({"gallery", "folder"}), Joined({"--help"})};
}
