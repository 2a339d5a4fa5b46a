#include "qn/dsc/zk/HostErrorText.h"

#include "hostbridge/HostFunctions.h"
#include "hostbridge/HostString.h"

namespace qn::dsc::zk {

namespace {

// Disposes of what the host gave, whatever becomes of the text.
struct GivenText {
    ~GivenText() {
        if (handle != nullptr) {
            zkhw::HostDisposeHandle(handle);
        }
    }
    zkhw::HostHandle handle = nullptr;
};

}  // namespace

NarrowString GetHostErrorText(int32_t code) {
    GivenText text;
    if (zkhw::HostGetErrorText(code, &text.handle) == 0) {
        return "Unknown error code or error text unavailable.";
    }
    return zkhw::HostStringToNarrow(text.handle);
}

}  // namespace qn::dsc::zk
