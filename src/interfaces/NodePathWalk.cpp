#include "interfaces/NodePathWalk.h"

#include <algorithm>

#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

// What a name counts for when the rest of a path is looked for: itself, the separator behind it, and the backslashes
// in front of its slashes.
size_t ConsumedBy(std::u16string_view component) {
    return component.size() + 1 + static_cast<size_t>(std::count(component.begin(), component.end(), u'/'));
}

}  // namespace

NodePathResult WalkNodePath(ResTreeNode& start, std::u16string_view path) {
    NodePathResult result{&start, false, false, 0};
    if (path.empty()) {
        return result;
    }
    const size_t lead = path.front() == u'/' ? 1 : 0;
    size_t consumed = lead;
    PieceReader components(path.substr(lead), u"/", false);
    result.isComplete = true;
    while (components.Next()) {
        String unescaped = String::WithoutBuffer();
        std::u16string_view component = components.Raw();
        if (components.MayHaveEscapes()) {
            unescaped = UnescapeText(component, u'/');
            component = unescaped.View();
        }
        NodeEntry* const entry = result.node->Find(component);
        ResTreeNode* const next = entry == nullptr ? nullptr : result.node->ResolveEntry(entry);
        if (next == nullptr) {
            result.isComplete = false;
            break;
        }
        if (const auto link = entry->LinkPath(); link && !link->empty()) {
            result.crossedLink = true;
        }
        consumed += ConsumedBy(component);
        result.node = next;
    }
    result.consumed = static_cast<uint32_t>(result.isComplete ? path.size() : consumed);
    return result;
}

}  // namespace zkhw
