#pragma once

// An installation that is as small as one can be and still has a bit of everything: two targets, a host set, an
// include, a prototype, copies, a link, a localised text, a file that feeds another's node, and menus.

#include <cstdint>
#include <string>

#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace zkhw {

class SmallInstallation {
  public:
    SmallInstallation();

    // Runs the tool inside this process, through `files`, as if it stood in its place. The result code, as unsigned.
    // What the run throws comes out. The tree of the run is taken down in any case.
    uint32_t Run();
    // The same with the working directory's argument given to it.
    uint32_t Run(const char* argument);

    // The bytes of the cache; "none" if there is none.
    std::string Cache() const;
    void RemoveOutput() const;

    qn::dsc::osdep::FaultyFileSystem files;
    qn::dsc::osdep::TemporaryFolder folder;
};

}  // namespace zkhw
