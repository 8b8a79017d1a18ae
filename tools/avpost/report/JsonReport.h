#ifndef AVPOST_TOOLS_AVPOST_REPORT_JSONREPORT_H
#define AVPOST_TOOLS_AVPOST_REPORT_JSONREPORT_H

#include <string>

#include "tools/avpost/report/Summary.h"

namespace avpost::tool {

// A JSON string literal of text (UTF-8 kept, control characters escaped).
std::string JsonString(const std::string& text);

// What avpost convert did, as one JSON object for programs: the input and output, the
// container, per kind the encoder, sizes, rates and counts (pictures in, out, repeated,
// dropped; seconds in and out, gaps filled, overlaps trimmed), the length, the time taken, the
// speed against real time and the notes.
std::string ConvertJson(const ConvertReport& report);

}  // namespace avpost::tool

#endif
