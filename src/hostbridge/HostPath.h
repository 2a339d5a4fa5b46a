#pragma once

// Paths of the host. Only where there is a host: every operation calls its run-time (HostFunctions.h).

#include <cstdint>

#include "hostbridge/HostFunctions.h"
#include "qn/dsc/StringBase.h"

namespace zkhw {

// Owns an empty path of the host, to be written to, and the host's text of it.
class HostPath {
  public:
    HostPath();
    ~HostPath();
    HostPath(const HostPath&) = delete;
    HostPath& operator=(const HostPath&) = delete;

    HostPathReference Get() const { return path; }

    // The text of the path in the system's form. False, and `result` is untouched, if the host can't give it.
    bool GetText(qn::dsc::String& result);

  private:
    HostPathReference path;     // Never null.
    HostHandle text = nullptr;  // Null until it is asked for.
};

// A folder of the host by its number in this system's own table (24: where the targets are); empty if the table or the
// host has none of that number. Without a host, 24 is "Targets" beside the executable, and there is no other.
qn::dsc::String GetHostSpecialDir(uint32_t number);

}  // namespace zkhw
