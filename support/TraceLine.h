#ifndef AVPOST_SUPPORT_TRACELINE_H
#define AVPOST_SUPPORT_TRACELINE_H

namespace avpost::detail {

// Prints one diagnostic line (printf format, the line ending included in the text) through the
// one sink every library diagnostic uses: the host's trace callback, or standard output.
void TraceLine(const char* format, ...) __attribute__((format(printf, 1, 2)));

}  // namespace avpost::detail

#endif
