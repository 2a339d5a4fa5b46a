#include "hostbridge/HostPath.h"

#include <iterator>
#include <new>

#include "hostbridge/HostString.h"
#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/CommandLine.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"
#include "qn/dsc/zk/ThrowIfZKError.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::osdep::GetExecutableDir;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::PathFromArgument;
using qn::dsc::zk::ThrowIfZKError;
using qn::dsc::zk::ZKErrorException;

namespace {

// From numbers of this system to codes of the host. The codes 2, 11, 12 and 20 can't be asked for.
constexpr int32_t specialDirectoryCodes[] = {0,  1,  3,  4,  5,  6,  7,  8,  9,  10, 13, 14, 15,
                                             16, 17, 18, 19, 21, 22, 23, 24, 25, 26, 27, 28};
constexpr uint32_t targetsDirectory = 24;

}  // namespace

void StoreInHostPath(const String& text, HostPathForm form, HostPathReference path) {
    const NarrowString narrow(text);
    ThrowIfZKError(form == HostPathForm::FileSystem ? HostSystemTextToPath(narrow.CStr(), path)
                                                    : HostTextToPath(narrow.CStr(), narrow.Length(), path));
}

HostPath::HostPath() : path(HostEmptyPath(nullptr)) {}

// The other constructor has run: an exception that leaves this one gives the path back as well.
HostPath::HostPath(const String& text) : HostPath() {
    if (text.IsEmpty()) {
        return;
    }
    try {
        StoreInHostPath(text, HostPathForm::FileSystem, path);
    } catch (const ZKErrorException&) {
        // The path stays empty.
    } catch (const std::bad_alloc&) {
        // The path stays empty.
    }
}

HostPath::~HostPath() {
    if (text != nullptr) {
        HostDisposeHandle(text);
    }
    HostDestroyPath(path);
}

bool HostPath::GetText(String& result) {
    if (HostPathToString(path, &text) != 0) {
        return false;
    }
    // A host may speak of native paths.
    result = PathFromArgument(HostStringToNarrow(text).CStr());
    return true;
}

String GetHostSpecialDir(uint32_t number) {
    String directory;
    if (FindRuntimeModule() == nullptr) {
        return number == targetsDirectory ? JoinPath(GetExecutableDir(), u"Targets") : directory;
    }
    if (number >= std::size(specialDirectoryCodes)) {
        return directory;
    }
    HostPath path;
    if (HostGetSpecialDir(specialDirectoryCodes[number], path.Get()) == 0) {
        path.GetText(directory);
    }
    return directory;
}

}  // namespace zkhw
