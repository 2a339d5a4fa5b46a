#pragma once

// The files that are being read inside each other, from the innermost outward. A resource file that includes itself,
// over however many others, is thereby not read again.

#include <cstdint>
#include <optional>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace zkhw {

class LoadChain {
  public:
    static constexpr uint32_t maximalDepth = 256;

    // A load on its own: of a file in code page 0, or (null) of text. `includer` is the load whose ":Include" asks for
    // this one, or null. All three outlive the chain.
    LoadChain(const qn::dsc::NarrowString* path, const LoadChain* includer);
    ~LoadChain();
    LoadChain(const LoadChain&) = delete;
    LoadChain& operator=(const LoadChain&) = delete;

    // True if an ":Include" of this load may not be read: its file is being read further up the chain of includes, or
    // the chain is too long.
    bool IsIncludeRefused(const qn::dsc::NarrowString& path) const;

    // True if the file is being read by any load under way on this thread.
    static bool IsBeingRead(const qn::dsc::NarrowString& path);

  private:
    using Identity = std::optional<qn::dsc::osdep::FileIdentity>;

    static Identity IdentityOf(const qn::dsc::NarrowString& path);
    bool IsReading(const Identity& file) const;

    const qn::dsc::NarrowString* path;
    const LoadChain* includer;
    const LoadChain* outer;  // The next load out on this thread, also where that one didn't ask by an ":Include".
    uint32_t depth;
    // That of `path`, from the first question on: every include asks all loads further out.
    mutable Identity ownIdentity;
};

}  // namespace zkhw
