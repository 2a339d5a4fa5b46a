#include "cachebuilder/TargetDiscovery.h"

#include "qn/dsc/osdep/path.h"
#include "restree/ResultCode.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::osdep::Equal;
using qn::dsc::osdep::GetDirectoryName;
using qn::dsc::osdep::GetFileName;
using qn::dsc::osdep::IsAbsolutePath;
using qn::dsc::osdep::JoinPath;

namespace {

// Deepest first; what is left of a path that ends in a backslash is one component.
std::vector<String> SplitPath(String path) {
    std::vector<String> components;
    while (!path.IsEmpty()) {
        String name = GetFileName(path);
        String directory = GetDirectoryName(path);
        if (name.IsEmpty()) {
            components.push_back(std::move(directory));
            break;
        }
        components.push_back(std::move(name));
        path = std::move(directory);
    }
    return components;
}

}  // namespace

bool IsHostsResourceFile(const String& path) {
    static const String hostsFile = JoinPath(JoinPath(JoinPath(u"Targets", u"QN"), u"FPGA"), u"hosts_resource.xml");
    return EndsWith(path.View(), hostsFile.View());
}

int32_t MakeRelativePath(String base, String target, String& result) {
    if (!IsAbsolutePath(base) || !IsAbsolutePath(target)) {
        return invalidArgument;
    }
    if (target.At(target.Length() - 1) == u'\\') {
        target.Erase(target.Length() - 1, 1, false);
    }
    std::vector<String> baseParts = SplitPath(std::move(base));
    std::vector<String> targetParts = SplitPath(std::move(target));
    while (baseParts.back() == targetParts.back()) {
        baseParts.pop_back();
        targetParts.pop_back();
        if (baseParts.empty() || targetParts.size() <= 1) {
            break;
        }
    }
    String relative;
    for (size_t i = 0; i < baseParts.size(); ++i) {
        relative = JoinPath(JoinPath(relative, u".."), u"");
    }
    for (auto part = targetParts.rbegin(); part != targetParts.rend(); ++part) {
        relative = JoinPath(relative, *part);
    }
    result.Swap(relative);
    return success;
}

}  // namespace zkhw
