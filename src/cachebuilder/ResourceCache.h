#pragma once

// What the writer and the reader of the cache file share.

#include <cstdint>
#include <string_view>

namespace zkhw {

// From ReadResourceCache: the cache is stale or unusable.
inline constexpr int32_t needsScan = 1;

// The properties that the cache keeps of a target, in the order of the file.
inline constexpr std::u16string_view summaryProperties[] = {
    u"DeviceCategory",        u"EIOItemIconName",
    u"EIOItemTypeName",       u"FPGAItemSubType",
    u"SupportedFPGAHostList", u"TargetClass",
    u"TargetXMLPath",         u"LocalizedInformationToDisplayWhenAddingNewTarget",
    u"FindTargetVIPath",      u"DeviceIDs",
    u"CustomFPGAMethodList",
};

}  // namespace zkhw
