#pragma once

// The option string of a query on the whole tree (zkfpga/tree_root.h has the grammar).

#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

struct QueryOptions {
    String protocol;  // Empty: all.
    bool recurse = false;
    String stripPathPrefix;
    String exclusionProperty;  // Empty: none.
    bool includePath = false;
    bool includeAliases = false;
    bool includeDisplayNames = false;
};

// Which keys a query understands; it passes over the others.
enum class QueryKeys {
    All,
    WithoutAliases,  // Neither "includeAliases" nor "includeDisplayNames".
};

// What isn't in `text` has its default. Never fails: an item that isn't a known key with a value does nothing.
QueryOptions ParseQueryOptions(std::u16string_view text, QueryKeys keys);

// `name` without its first characters: as many as the prefix has, and one for the "/" behind it with paths. Nothing is
// left of a name that is shorter.
std::u16string_view StripPathPrefix(std::u16string_view name, const String& prefix, bool includePath);

}  // namespace zkhw
