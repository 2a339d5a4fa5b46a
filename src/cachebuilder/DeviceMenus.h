#pragma once

#include <cstdint>

namespace zkhw {

class ResTreeNode;

// Copies into the folder of each target of `root` the menu folder of its device family: virtex5, virtex6 or spartan6.
// Other targets are passed over, so are those whose family has no folder and those that lie inside it. Changes files,
// not the tree.
// 0, or 0x80004005 with nothing copied if the root has no "FpgaDeviceSpecs" or that lacks one of the families.
// An entry of the root that is no child node, such as the reports of a broken resource file, and a "FPGACompilation"
// that is none end the process (DebugTrap) when their turn comes. The exceptions of NormalizePath, AppendSeparator and
// CopyDirectoryTree pass; what was copied so far stays.
int32_t InstallDeviceMenus(ResTreeNode& root);

}  // namespace zkhw
