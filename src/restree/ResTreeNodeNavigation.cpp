// From a path to a node and back.

#include <algorithm>
#include <array>
#include <memory>
#include <utility>
#include <vector>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/NodePath.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::osdep::Compare;

namespace {

constexpr std::u16string_view displayNameKey = u"DisplayName";

// The path of a link that is being followed. It has its own text: a load on the way may change the link.
struct LinkPath {
    LinkPath(std::u16string_view path, size_t start) : text(path), components(text.View().substr(start), u"/", false) {}
    LinkPath(const LinkPath&) = delete;
    LinkPath& operator=(const LinkPath&) = delete;

    String text;
    PieceReader components;
};

constexpr size_t maximalLinks = 256;

// Where a path starts: the node, and the offset of the first component.
size_t FindStart(std::u16string_view path, ResTreeNode*& node, ResTreeNode* documentRoot) {
    if (path.substr(0, 2) == u"#{") {
        const size_t close = path.find(u'}', 2);
        const bool isClosed = close != std::u16string_view::npos;
        const std::u16string_view anchor = path.substr(2, isClosed ? close - 2 : close);
        constexpr std::u16string_view documentRootAnchor = u"document-root";
        if (documentRoot != nullptr &&
            (qn::dsc::HasSameUnits(anchor, documentRootAnchor) || Compare(anchor, documentRootAnchor) == 0)) {
            node = documentRoot;
        }
        // Behind the brace and the separator; an anchor that isn't closed leaves all but its first unit as the path.
        return isClosed ? std::min(close + 2, path.size()) : 1;
    }
    if (path.substr(0, 1) == u"/") {
        while (node->GetParent() != nullptr) {
            node = node->GetParent();
        }
        return 1;
    }
    return 0;
}

}  // namespace

ResTreeNode* ResTreeNode::Lookup(std::u16string_view path, ResTreeNode* documentRoot) {
    const ReleaseScope scope;
    ResTreeNode* node = this;
    const size_t start = FindStart(path, node, documentRoot);
    PieceReader outermost(path.substr(start), u"/", false);
    // The paths of links that are open inside each other; the last is the innermost.
    std::vector<std::unique_ptr<LinkPath>> links;
    size_t followed = 0;
    while (true) {
        PieceReader& components = links.empty() ? outermost : links.back()->components;
        if (!components.Next()) {
            if (links.empty()) {
                return node;
            }
            links.pop_back();
            continue;
        }
        String unescaped = String::WithoutBuffer();
        std::u16string_view component = components.Raw();
        if (components.MayHaveEscapes()) {
            unescaped = UnescapeText(component, u'/');
            component = unescaped.View();
        }
        if (Compare(component, u"..") == 0) {
            node = node->parent;
        } else if (Compare(component, u".") != 0) {
            const NodeEntry* entry = node->Find(component);
            const auto link = entry == nullptr ? std::nullopt : entry->LinkPath();
            if (!link) {
                node = entry == nullptr ? nullptr : entry->Child();
            } else {
                if (++followed > maximalLinks) {
                    return nullptr;
                }
                const size_t linkStart = FindStart(*link, node, nullptr);
                links.push_back(std::make_unique<LinkPath>(*link, linkStart));
            }
        }
        if (node == nullptr) {
            return nullptr;
        }
    }
}

namespace {

// From the node below the root to `node`.
std::vector<ResTreeNode*> WayFromRoot(const ResTreeNode* node) {
    std::vector<ResTreeNode*> way;
    for (; node->GetParent() != nullptr; node = node->GetParent()) {
        way.push_back(const_cast<ResTreeNode*>(node));
    }
    std::reverse(way.begin(), way.end());
    return way;
}

bool NeedsNoEscapes(std::u16string_view name) {
    return qn::dsc::FindEither(name, u'/', u'\\') == name.size();
}

// A path that is built from the root downward, as JoinEscapedPath does it, but in place.
class GrowingPath {
  public:
    void Append(std::u16string_view part) {
        if (isRoot) {
            // A path that counts as "/" alone, such as "/" and ignorable units, is replaced.
            path.Assign(u"/", 1);
        } else {
            path.Append(u"/");
        }
        if (NeedsNoEscapes(part)) {
            path.Append(part);
        } else {
            path.Append(EscapeText(part, u'/').View());
        }
        // With a second slash a path is never "/" again, so the comparisons are linear in all.
        isRoot = isRoot && Compare(path.View(), u"/") == 0;
    }
    String Take() { return std::move(path); }

  private:
    String path{u"/"};
    bool isRoot = true;
};

// A path of up to 256 units that is written from its end, in one climb and without memory.
class ClimbingPath {
  public:
    // Puts a slash and `name` in front; false if that is not possible.
    bool Prepend(std::u16string_view name) {
        if (name.size() >= first || !NeedsNoEscapes(name)) {
            return false;
        }
        first -= name.size();
        std::copy(name.begin(), name.end(), units.data() + first);
        units[--first] = u'/';
        return true;
    }

    // Whether the path up to its first name counts as something else than "/".
    bool BeginsWithAName() const {
        const char16_t unit = first + 1 < size ? units[first + 1] : u'/';
        return unit != u'/' && unit < 0x80 && qn::dsc::osdep::asciiWeights[unit] != 0;
    }

    std::u16string_view View() const { return {units.data() + first, size - first}; }

  private:
    static constexpr size_t size = 256;

    std::array<char16_t, size> units;
    size_t first = size;
};

}  // namespace

String ResTreeNode::GetPath() const {
    ClimbingPath plain;
    const ResTreeNode* top = this;
    while (top->parent != nullptr && plain.Prepend(top->GetName())) {
        top = top->parent;
    }
    if (top->parent == nullptr && plain.BeginsWithAName()) {
        return String(plain.View());
    }
    GrowingPath path;
    for (const ResTreeNode* node : WayFromRoot(this)) {
        path.Append(node->GetName());
    }
    return path.Take();
}

String ResTreeNode::GetDisplayPath() {
    const ReleaseScope scope;
    GrowingPath path;
    for (ResTreeNode* node : WayFromRoot(this)) {
        const auto displayName = node->GetProperty(displayNameKey);
        if (!displayName) {
            path.Append(node->GetName());
        } else if (!displayName->empty()) {
            path.Append(*displayName);
        }
    }
    return path.Take();
}

String ResTreeNode::GetEntryDisplayPath(EntryIterator iterator, const String& parentDisplayPath) {
    const ReleaseScope scope;
    ResTreeNode* node = ResolveEntry(iterator);
    if (node == nullptr) {
        return String();
    }
    // First, since it may load, and so change the name.
    const auto displayName = node->GetProperty(displayNameKey);
    return JoinDisplayPath(parentDisplayPath, node->GetName(), displayName);
}

}  // namespace zkhw
