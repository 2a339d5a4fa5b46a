#include "qn/dsc/osdep/_GetExeFullPath.h"

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/SystemError.h"
#include "qn/dsc/osdep/path.h"

namespace qn::dsc::osdep {

String _GetExeFullPath() {
    String path;
    const int error = GetFileSystem().ReadExecutablePath(path);
    if (error != 0) {
        SetLastSystemError(SystemErrorOf(error));
        exception::ThrowAt(WinError(), "qn/dsc/osdep/_GetExeFullPath", __LINE__);
    }
    return MakeAbsolutePath(path);
}

String GetExecutableDir() {
    String folder = MakeAbsolutePath(GetDirectoryName(_GetExeFullPath()));
    AppendSeparator(folder);
    return folder;
}

String GetExecutableBaseName() {
    const String name = GetFileName(_GetExeFullPath());
    const uint32_t dot = name.FindLast(u'.');
    return dot == String::npos ? name : name.Substring(0, dot);
}

}  // namespace qn::dsc::osdep
