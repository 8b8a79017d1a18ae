#ifndef AVPOST_SUPPORT_BUNDLEURL_H
#define AVPOST_SUPPORT_BUNDLEURL_H

#include <cstddef>

namespace avpost::detail {

// Hosts packaged as application bundles report their location as a URL such as
// file://localhost/Applications/My%20Tool.app/. This turns such a URL into the directory that
// holds the executable: "%20" becomes a space (no other escape is decoded), the scheme and host
// are dropped when present, a bundle gets "Contents/MacOS" appended and a plain directory loses
// its trailing slash. path receives at most pathBytes bytes including the terminator; a result
// that does not fit gives an empty string.
void AppPathFromBundleUrl(const char* url, char* path, size_t pathBytes);

}  // namespace avpost::detail

#endif
