#pragma once

#include "qn/dsc/StringBase.h"

namespace zkhw {

// The language in which localised texts are read: "eng", "jpn" or "chs", by the host's own; "eng" without a host or if
// the host's is none of these. The host is asked once, at the first call; a host that can't answer is fatal
// (HostFunctions.h). Not for several threads at the first call.
const qn::dsc::String& GetResourceLanguage();

}  // namespace zkhw
