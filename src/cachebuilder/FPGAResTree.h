#pragma once

// The process-wide tree of FPGA targets: made from an installation's resource files, or from their cache. The one of
// the process is that of gFPGAResTree (zkfpga/exports.h).

#include <cstdint>

#include "qn/dsc/StringBase.h"
#include "restree/ResTreeOwner.h"

namespace zkhw {

using qn::dsc::String;

class FPGAResTree : public ResTreeOwner {
  public:
    // Makes a root and fills it from the resource files below `directory`, which may be relative to the working folder.
    // With `useCache` a "resource_cache.xml" there that is no older than any of them is read in their place; otherwise
    // it is written anew.
    // 0; 0x8007000e, and `root` is null, if there is no memory for the root; 0x80004005 if there is no such folder or
    // the cache can't be written. Except for the first failure `root` is set, also by a failure or an exception, and
    // belongs to the caller from then on. Exceptions of the foundation and bad_alloc pass.
    int32_t BuildResourceTree(String directory, bool useCache, ResTreeNode*& root);

    // BuildResourceTree with the cache, in "QN\FPGA" below the host's special directory 24.
    int32_t CreateRootNode(ResTreeNode*& root) override;

    // Reads every "*resource.xml" below `directory` into a child of `root`, the hosts file first, and notes on the
    // child where it came from. What can't be opened or isn't well formed is passed over. Always 0.
    int32_t ScanTargets(const String& directory, ResTreeNode& root);

    // Writes the summary of `root` to the file `cachePath`, in one write. 0, or 0x80004005 if the text has no UTF-8
    // form or the file can't be opened for writing, which leave an old file as it was, or if the write fails.
    // The tree is loaded where the host set is written, otherwise untouched.
    int32_t WriteResourceCache(ResTreeNode& root, const String& cachePath);

    // If no resource file below `directory` is newer than the file `cachePath`, reads that into `root`, and lets each
    // node load the rest from its own file at the first look that misses. 0: the tree is in place. 1: the cache is
    // stale or holds no target, and `root` is empty.
    int32_t ReadResourceCache(const String& directory, const String& cachePath, ResTreeNode& root);
};

}  // namespace zkhw
