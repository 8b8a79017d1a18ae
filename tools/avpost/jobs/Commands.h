#ifndef AVPOST_TOOLS_AVPOST_JOBS_COMMANDS_H
#define AVPOST_TOOLS_AVPOST_JOBS_COMMANDS_H

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// The commands; each throws ToolError when it fails and then leaves no output behind.
void RunConvertCommand(const Invocation& call);
void RunVideoCommand(const Invocation& call);
void RunAudioCommand(const Invocation& call);
void RunDemoCommand(const Invocation& call);
void RunGalleryCommand(const Invocation& call);

}  // namespace avpost::tool

#endif
