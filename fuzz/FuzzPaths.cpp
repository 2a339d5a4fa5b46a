// The operations on the text of file paths: rules that hold for any text, and rules for the paths that hold no "."
// parts.

#include <string>

#include "FuzzInput.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/path.h"

namespace {

using qn::dsc::String;
using namespace qn::dsc::osdep;  // NOLINT(google-build-using-namespace): the file is about this one's operations.

bool EndsInSeparator(const String& path) {
    return !path.IsEmpty() && path.At(path.Length() - 1) == u'\\';
}

void CheckOne(const String& path) {
    const String directory = GetDirectoryName(path);
    const String name = GetFileName(path);
    fuzz::Require(directory.Length() <= path.Length(), "a folder's path is a part of the path");
    fuzz::Require(name.Find(u'\\', 0) == String::npos, "a file name holds no separator");
    fuzz::Require(directory.View() == path.View().substr(0, directory.Length()), "a folder's path begins the path");

    String climbing = path;
    for (uint32_t steps = 0; steps <= path.Length() + 1; ++steps) {
        String above = GetDirectoryName(climbing);
        if (above.View() == climbing.View()) {
            break;
        }
        fuzz::Require(above.Length() < climbing.Length(), "climbing ends");
        climbing = above;
    }

    const String folded = NormalizePath(path);
    fuzz::Require(folded.IsEmpty() || IsAbsolutePath(folded), "a folded path is absolute or empty");
    fuzz::Require(folded.IsEmpty() || IsAbsolutePath(path), "only an absolute path is folded");
    fuzz::Require(NormalizePath(folded).View() == folded.View(), "folding twice is folding once");

    String ended = path;
    if (!ended.IsEmpty()) {
        AppendSeparator(ended);
        fuzz::Require(EndsInSeparator(ended), "AppendSeparator ends the path in a separator");
        const String once = ended;
        AppendSeparator(ended);
        fuzz::Require(once.View() == ended.View(), "AppendSeparator appends once");
    }
}

void CheckTwo(const String& base, const String& part) {
    const String joined = JoinPath(base, part);
    if (IsAbsolutePath(part) || base.IsEmpty()) {
        fuzz::Require(joined.View() == part.View(), "an absolute part wins");
        return;
    }
    const uint32_t separators = EndsInSeparator(base) ? 0 : 1;
    fuzz::Require(joined.Length() == base.Length() + separators + part.Length(), "a join adds one separator at most");
    fuzz::Require(IsAbsolutePath(joined) || !IsAbsolutePath(base), "a join keeps an absolute base absolute");
    if (part.Find(u'\\', 0) == String::npos && part.Find(u':', 0) == String::npos) {
        fuzz::Require(GetFileName(joined).View() == part.View(), "the name that was joined is the file name");
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const String base(input.TakeText());
    const String part(input.TakeText());
    CheckOne(base);
    CheckOne(part);
    CheckTwo(base, part);
    CheckOne(JoinPath(base, part));
    return 0;
}
