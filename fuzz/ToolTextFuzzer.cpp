// File names through the tool: any bytes as a UTF-8 argument into the wide string the library
// takes, and back. Text the tool accepts must come back byte for byte.
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "FuzzSeeds.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string text(reinterpret_cast<const char*>(data), size);
    std::wstring wide;
    try {
        wide = avpost::tool::WideFromUtf8(text);
    } catch (const avpost::tool::ToolError&) {
        return 0;  // refused as not UTF-8
    }
    if (text.find('\0') == std::string::npos && avpost::tool::Utf8FromWide(wide.c_str()) != text)
        std::abort();
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    const std::string names[] = {"capture.jpg", "caf\xC3\xA9/\xE6\x97\xA5\xE6\x9C\xAC.bmp", "\xF0\x9F\x8E\xA5 clip.y4m",
                                 "\xED\xA0\x80", "\xC0\xAF"};
    std::vector<std::vector<uint8_t>> seeds;
    for (const std::string& name : names)
        seeds.emplace_back(name.begin(), name.end());
    return seeds;
}
