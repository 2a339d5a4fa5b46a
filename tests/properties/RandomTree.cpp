// What doesn't come back from XML, by the rules of the writer and of the language, and is left out of trees that are to
// come back:
//
// - keys of texts that are no names in XML, or that mean something to the reader (":Link", ":Include"); types likewise;
// - an unordered node of a type that is a list type: it isn't marked, and comes back ordered;
// - a name that differs from the type in letter case alone: it isn't written, and comes back as the type;
// - a node without entries that is named as its type: it reads as a text;
// - "Protocols" in an ordered node: it is written twice and comes back twice;
// - white space at the ends of a value, carriage returns, line feeds and tabs in names, and what XML can't hold at all;
// - "#{" in a value: it is a parameter; a slash in the value of a path, which becomes a backslash; a "Reserves" with
//   blanks or with paths from the root, which become relative;
// - a localised value that ends in its NUL;
// - a link whose key or path has a character that would need an escape, and one that the reader can't follow at that
//   moment, or that leads to or from the root: a path that is no path of a node by its text;
// - in an ordered node, an entry with the key of a later child: the child takes its place.

#include "properties/RandomTree.h"

#include <algorithm>
#include <string>

#include "qn/dsc/osdep/Compare.h"
#include "restree/NodePath.h"
#include "support/TreeMaking.h"

namespace zkhw {

using qn::dsc::osdep::Equal;
using namespace std::string_view_literals;

namespace {

constexpr size_t mostNodes = 24;
constexpr std::u16string_view types[] = {u"Thing"sv,  u"Clock"sv,  u"FooList"sv, u"ResourceList"sv,
                                         u"Module"sv, u"Target"sv, u"T\u00E4g"sv};
constexpr std::u16string_view keys[] = {u"a"sv,         u"A"sv,        u"b-1"sv,    u"DisplayName"sv, u"LogPath"sv,
                                        u"Protocols"sv, u"Reserves"sv, u"\u00D6"sv, u"K.2"sv,         u"_k"sv};
constexpr std::u16string_view units = u"ab AB/\\.,:#{}&<>\"'-\u00E4\u4E2D=1";

bool IsListType(std::u16string_view type) {
    return type.ends_with(u"List") || Equal(type, u"Module") || Equal(type, u"Target");
}

bool IsBlank(char16_t unit) {
    return unit == u' ' || unit == u'\t' || unit == u'\n' || unit == u'\r';
}

class Maker {
  public:
    Maker(Random& random, TreeKind kind) : random(random), kind(kind) {}

    std::unique_ptr<ResTreeNode> Make() {
        auto root = std::make_unique<ResTreeNode>(u"Top", u"Root", random.OneIn(2));
        Fill(*root, 0);
        AddText(*root, u"Last", u"1");
        for (ResTreeNode* node : NodesOf(*root)) {
            if (random.OneIn(3) && node != root.get()) {
                AddLinkTo(*root, *node);
            }
        }
        return root;
    }

  private:
    void Fill(ResTreeNode& node, size_t depth) {
        for (size_t left = random.Below(6); left > 0; --left) {
            if (depth < 5 && nodes < mostNodes && random.OneIn(2)) {
                AddNode(node, depth);
            } else {
                AddTextTo(node);
            }
        }
    }

    void AddNode(ResTreeNode& node, size_t depth) {
        const std::u16string_view type = random.Of(types);
        const std::u16string name = random.OneIn(12) ? std::u16string(type) : random.Text(units, 5);
        const bool ordered = random.OneIn(2) || (kind.comesBack && IsListType(type));
        const bool isTaken = node.FindRaw(std::u16string_view(name)) != nullptr;
        if (isTaken && (kind.comesBack || !kind.mayRepeatChildren || !node.IsOrdered())) {
            return;
        }
        ResTreeNode* child = nullptr;
        node.AddChildEntry(name, type, ordered, child);
        ++nodes;
        Fill(*child, depth + 1);
        if (kind.comesBack && child->Begin() == child->End()) {
            AddText(*child, u"only", u"");
        }
    }

    std::u16string Value(std::u16string_view key) {
        if (!kind.comesBack) {
            return random.Text(units, 12);
        }
        if (key == u"Reserves") {
            return std::u16string(random.OneIn(2) ? u"../a,b/c"sv : u""sv);
        }
        std::u16string value = random.Text(units, 12);
        const bool isPath = key == u"LogPath";
        std::erase_if(value,
                      [&](char16_t unit) { return unit == u'#' || (isPath && (unit == u'/' || unit == u'\\')); });
        while (!value.empty() && IsBlank(value.back())) {
            value.pop_back();
        }
        return value.substr(std::min(value.find_first_not_of(u" \t"), value.size()));
    }

    void AddTextTo(ResTreeNode& node) {
        const std::u16string_view key = random.Of(keys);
        const bool isRepeated = node.FindRaw(key) != nullptr && node.FindRaw(key)->Kind() == ChildEntry;
        if (kind.comesBack && ((key == u"Protocols" && node.IsOrdered()) || isRepeated)) {
            return;
        }
        std::u16string value = Value(key);
        EntryKind entryKind = TextEntry;
        if (random.OneIn(5) && key != u"Reserves" && key != u"LogPath") {
            entryKind = LocalizedTextEntry;
            value = random.OneIn(2) ? std::u16string(u"one\0eng=one,jpn=x"sv) + value : value;
        }
        node.AddTextEntry(key, value, entryKind);
    }

    // At the end of an ordered node, so that all that stands ahead can be found there.
    void AddLinkTo(ResTreeNode& root, ResTreeNode& node) {
        const std::vector<ResTreeNode*> all = NodesOf(root);
        ResTreeNode& target = *all[random.Below(all.size())];
        const String path = MakeRelativeNodePath(target.GetPath(), node.GetPath());
        const String key(u"zz" + std::u16string(1, static_cast<char16_t>(u'a' + random.Below(3))));
        const bool isBad = path.View().find_first_of(u"&<\"#") != std::u16string_view::npos || &target == &root ||
                           std::any_of(path.View().begin(), path.View().end(), IsBlank) ||
                           path.View().find(u"]]>") != std::u16string_view::npos;
        if (kind.comesBack && (isBad || !StandsAhead(all, node, target) ||
                               node.Lookup(path.View(), nullptr) != &target || node.FindRaw(key.View()) != nullptr)) {
            return;
        }
        node.AddLinkEntry(key.View(), path.View());
    }

    // Whether the reader has begun `target` when it comes to the link. In an unordered node that may stand ahead of
    // the children.
    static bool StandsAhead(const std::vector<ResTreeNode*>& all, const ResTreeNode& node, const ResTreeNode& target) {
        const auto isBelow = [&] {
            const ResTreeNode* above = &target;
            while (above != nullptr && above != &node) {
                above = above->GetParent();
            }
            return above == &node;
        };
        return std::find(all.begin(), all.end(), &target) <= std::find(all.begin(), all.end(), &node) ||
               (node.IsOrdered() && isBelow());
    }

    Random& random;
    TreeKind kind;
    size_t nodes = 1;
};

}  // namespace

std::unique_ptr<ResTreeNode> MakeRandomTree(Random& random, TreeKind kind) {
    return Maker(random, kind).Make();
}

std::vector<ResTreeNode*> NodesOf(ResTreeNode& root) {
    std::vector<ResTreeNode*> nodes;
    std::vector<ResTreeNode*> open{&root};
    while (!open.empty()) {
        ResTreeNode* node = open.back();
        open.pop_back();
        nodes.push_back(node);
        const size_t first = open.size();
        for (EntryIterator entry = node->Begin(); !entry.IsEnd(); ++entry) {
            if (entry->Child() != nullptr) {
                open.push_back(entry->Child());
            }
        }
        std::reverse(open.begin() + static_cast<std::ptrdiff_t>(first), open.end());
    }
    return nodes;
}

void ChangeSomething(Random& random, ResTreeNode& root) {
    const std::vector<ResTreeNode*> nodes = NodesOf(root);
    ResTreeNode& node = *nodes[random.Below(nodes.size())];
    switch (random.Below(5)) {
        case 0:
            node.SetProperty(random.Of(keys), u"changed");
            break;
        case 1:
            AddChild(node, u"made");
            break;
        case 2:
            node.RemoveEntry(node.Begin());
            break;
        case 3:
            // A name that nobody has: one that is taken would lose the node.
            node.Rename(u"new" + random.Text(u"0123456789", 12));
            break;
        default:
            node.ReserveOne(String(u"somebody"), ReserveRead);
    }
}

}  // namespace zkhw
