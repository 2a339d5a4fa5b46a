#pragma once

#include <cstdint>

namespace zkhw {

// The tool: builds the tree of the directory argv[1], or else of the parent of the executable's folder, writes the
// cache, and copies the device menus. Prints nothing. Further arguments are ignored.
// The result code is the exit status: 0, 0x80004005 or 0x8007000e. The tree is left standing; the process is about to
// end.
int32_t RunTool(int argc, char** argv);

// Takes down the tree that RunTool left standing. For a process that goes on after it.
void DiscardTreeOfTheRun();

}  // namespace zkhw
