#include "support/BundleUrl.h"

#include <cstring>
#include <string>
#include <vector>

#include "support/AppPath.h"

namespace avpost::detail {

namespace {

constexpr char kLocalFilePrefix[] = "file://localhost/";
constexpr size_t kDroppedPrefixBytes = 16;  // keeps the slash that starts the path
constexpr char kBundleSuffix[] = ".app/";
constexpr char kBundleExecutableFolder[] = "Contents/MacOS";

bool EndsWith(const std::string& text, const char* suffix)
{
    const size_t length = std::strlen(suffix);
    return text.size() >= length && text.compare(text.size() - length, length, suffix) == 0;
}

}  // namespace

void AppPathFromBundleUrl(const char* url, char* path, size_t pathBytes)
{
    if (path == nullptr || pathBytes == 0)
        return;
    path[0] = '\0';
    if (url == nullptr)
        return;

    std::vector<char> buffer(url, url + std::strlen(url) + 1);
    replace_str_2_char(buffer.data(), "%20", ' ');

    std::string result(buffer.data());
    if (std::strstr(buffer.data(), kLocalFilePrefix) != nullptr)
        result.erase(0, kDroppedPrefixBytes);

    if (EndsWith(result, kBundleSuffix))
        result += kBundleExecutableFolder;
    else if (!result.empty())
        result.pop_back();

    if (result.size() < pathBytes)
        std::memcpy(path, result.c_str(), result.size() + 1);
}

}  // namespace avpost::detail
