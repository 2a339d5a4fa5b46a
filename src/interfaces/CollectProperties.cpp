#include "interfaces/CollectProperties.h"

#include <utility>

#include "hostbridge/ClusterText.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/QueryOptions.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

bool EndsInSeparator(std::u16string_view path) {
    if (path.empty() || path.back() != u'/') {
        return false;
    }
    size_t backslashes = 0;
    while (backslashes + 1 < path.size() && path[path.size() - 2 - backslashes] == u'\\') {
        ++backslashes;
    }
    return backslashes % 2 == 0;
}

String MakePrefix(std::u16string_view path, const PropertyQuery& query) {
    String prefix;
    if (query.includePath) {
        prefix.Assign(path);
        if (!EndsInSeparator(path)) {
            prefix.Append(u"/");
        }
    }
    return query.strip.IsEmpty() ? prefix : String(StripPathPrefix(prefix.View(), query.strip, query.includePath));
}

}  // namespace

void CollectProperties(ResTreeNode& node, std::u16string_view path, const PropertyQuery& query,
                       std::vector<String>& list) {
    const String prefix = MakePrefix(path, query);
    for (EntryIterator entry = node.BeginLoaded(); !entry.IsEnd(); ++entry) {
        const auto value = entry->Text();
        if (!value) {
            continue;
        }
        String name = prefix + EscapeText(UpToNul(entry->Key()), u'/');
        if (query.withValues) {
            String cluster;
            MakeNameValueCluster(name, UpToNul(*value), cluster);
            name = std::move(cluster);
        }
        list.push_back(std::move(name));
    }
}

}  // namespace zkhw
