#pragma once

// Paths of the host. Only where there is a host: every operation but GetHostSpecialDir calls its run-time whatever the
// setting, and so may end the process (HostFunctions.h).

#include <cstdint>

#include "hostbridge/HostFunctions.h"
#include "qn/dsc/StringBase.h"

namespace zkhw {

enum class HostPathForm {
    FileSystem,  // As the file system has it.
    Host,        // The host's own.
};

// Makes `path` the one that `text` names in the form given; the text goes through the system's default code page.
// qn::dsc::zk::ZKErrorException, and `path` is as it was, if the host takes it for no path.
void StoreInHostPath(const qn::dsc::String& text, HostPathForm form, HostPathReference path);

// Owns a path of the host, and the host's text of it.
class HostPath {
  public:
    // An empty path.
    HostPath();

    // The path that `text` names in the form of the file system; an empty one if the host takes it for no path or there
    // is no memory.
    explicit HostPath(const qn::dsc::String& text);

    // Gives both back to the host, whose answers are not looked at.
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
