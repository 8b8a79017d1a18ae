#ifndef AVPOST_IMAGE_OUTPUT_IJLLOADER_H
#define AVPOST_IMAGE_OUTPUT_IJLLOADER_H

#include <string>
#include <vector>

class CIjlObj;

namespace avpost::detail {

// The file names tried for the JPEG library, in order (see CIjlObj).
std::vector<std::string> IjlLibraryCandidates();

// Loads the library file into obj when it opens and has all four entry points; otherwise
// leaves obj unloaded and returns false.
bool LoadIjlLibrary(CIjlObj& obj, const char* file);

// Closes obj's library, if any, and clears its entry points.
void UnloadIjlLibrary(CIjlObj& obj);

}  // namespace avpost::detail

#endif
