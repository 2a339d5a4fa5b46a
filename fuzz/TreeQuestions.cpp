#include "TreeQuestions.h"

#include <algorithm>
#include <vector>

#include "FuzzInput.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/NodePath.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace fuzz {

using model::Entry;
using model::Node;
using model::Tree;
using zkhw::ResTreeNode;
using zkhw::String;
using Texts = std::vector<std::u16string>;

View MakeView(ResTreeNode& node, zkhw::AdapterObserverSet* observers) {
    View view;
    zkhw::ResTreeNodeAdapter::Make(&node, observers)->QueryInterface(IID_IzkhwResourceTreeNode5, view.ReceiveAny());
    return view;
}

namespace {

// --- What is received, freed as a host frees it ---

std::u16string Take(BSTR text) {
    std::u16string taken(zkhw::ViewOf(text));
    SysFreeString(text);
    return taken;
}

}  // namespace

Texts TakeTexts(ULONG count, BSTR* array) {
    Texts taken;
    for (ULONG i = 0; i < count; ++i) {
        taken.push_back(Take(array[i]));
    }
    CoTaskMemFree(array);
    return taken;
}

namespace {

std::vector<const ResTreeNode*> Take(ULONG count, IzkhwResourceTreeNode** array) {
    std::vector<const ResTreeNode*> taken;
    for (ULONG i = 0; i < count; ++i) {
        taken.push_back(static_cast<zkhw::ResTreeNodeAdapter*>(array[i])->GetNode());
        array[i]->Release();
    }
    CoTaskMemFree(array);
    return taken;
}

template <typename Call>
std::u16string Text(Call call) {
    BSTR text = nullptr;
    Require(call(&text) == S_OK, "a text is given");
    return Take(text);
}

HRESULT YesOrNo(bool yes) {
    return yes ? S_OK : S_FALSE;
}

// --- The slow answers ---

const Entry* Property(Node& node, std::u16string_view key) {
    const Entry* entry = Tree::Find(node, key);
    return entry != nullptr && entry->kind == zkhw::TextEntry ? entry : nullptr;
}

Texts PropertyKeys(const Node& node) {
    Texts keys;
    for (const auto& entry : node.entries) {
        if (entry->kind == zkhw::TextEntry) {
            keys.push_back(entry->key);
        }
    }
    return keys;
}

// A link to a node that the walk stands in is passed over.
void CollectDescendants(Node& node, std::u16string_view type, std::vector<Node*>& path,
                        std::vector<const ResTreeNode*>& found) {
    path.push_back(&node);
    for (const auto& entry : node.entries) {
        Node* next = Tree::Resolve(node, *entry);
        if (next == nullptr || std::find(path.begin(), path.end(), next) != path.end()) {
            continue;
        }
        if (Tree::Supports(*next, type)) {
            found.push_back(next->real);
        }
        CollectDescendants(*next, type, path, found);
    }
    path.pop_back();
}

std::u16string JoinDisplay(const std::u16string& parent, Node& node) {
    const Entry* display = Property(node, u"DisplayName");
    const auto shown = display == nullptr ? std::nullopt : std::optional<std::u16string_view>(display->text);
    return std::u16string(zkhw::JoinDisplayPath(String(parent), String(node.name), shown).View());
}

std::u16string Join(const std::u16string& parent, const std::u16string& name) {
    return std::u16string(zkhw::JoinEscapedPath(String(parent), String(name)).View());
}

struct NameWalk {
    std::u16string type;
    std::u16string exclusion;
    bool includePath;
    Texts names;
    Texts displays;
    std::vector<Node*> path;

    bool Passes(Node& node) const {
        const Entry* excluded = exclusion.empty() ? nullptr : Property(node, exclusion);
        const bool isExcluded =
            excluded != nullptr && (excluded->text.empty() || zkhw::ParseBool(String(excluded->text)));
        return Tree::Supports(node, type) && !isExcluded;
    }

    void Append(Node& node, const std::u16string& at, const std::u16string& display) {
        if (Passes(node)) {
            names.push_back(includePath ? at : node.name);
            displays.push_back(display);
        }
    }

    // Once a link was met in this call, the entries behind it are named by the way to here.
    void Walk(Node& node, bool crossed, const std::u16string& base, const std::u16string& displayBase) {
        path.push_back(&node);
        std::u16string newBase;
        std::u16string newDisplayBase;
        for (const auto& entry : node.entries) {
            Node* next = Tree::Resolve(node, *entry);
            if (next == nullptr || std::find(path.begin(), path.end(), next) != path.end()) {
                continue;
            }
            const bool isLink = entry->kind == zkhw::LinkEntry && !entry->text.empty();
            if (!crossed && !isLink) {
                Append(*next, Tree::PathOf(*next), Tree::DisplayPathOf(*next));
            } else {
                newBase = Join(crossed ? base : Tree::PathOf(node), entry->key);
                newDisplayBase = JoinDisplay(crossed ? displayBase : Tree::DisplayPathOf(node), *next);
                Append(*next, newBase, newDisplayBase);
                crossed = true;
            }
            Walk(*next, crossed, newBase, newDisplayBase);
        }
        path.pop_back();
    }
};

// --- Comparison ---

void SameTexts(Node& node, View& view) {
    Require(Text([&](BSTR* out) { return view->GetName(out); }) == node.name, "GetName");
    Require(Text([&](BSTR* out) { return view->GetType(out); }) == node.type, "GetType");
    Require(Text([&](BSTR* out) { return view->GetPath(out); }) == Tree::PathOf(node), "GetPath");
    Require(Text([&](BSTR* out) { return view->GetDisplayPath(out); }) == Tree::DisplayPathOf(node), "GetDisplayPath");
    ULONG count = 0;
    BSTR* array = nullptr;
    view->GetPropertyNames(&count, &array);
    const Texts keys = PropertyKeys(node);
    Require(TakeTexts(count, array) == keys, "GetPropertyNames");
    for (ULONG i = 0; i <= keys.size(); ++i) {
        BSTR value = nullptr;
        Require(view->GetPropertyAt(i, &value) == YesOrNo(i < keys.size()), "GetPropertyAt ends behind the last");
        SysFreeString(value);
    }
    for (const std::u16string& key : keys) {
        const Entry* first = Property(node, key);
        BSTR value = nullptr;
        Require(view->GetProperty(In(key), &value) == YesOrNo(first != nullptr), "GetProperty gives the first");
        const std::u16string taken = Take(value);
        Require(first == nullptr || taken == first->text, "GetProperty gives its value");
        Require(view->IsLocalizedProperty(In(key)) == S_FALSE, "no property is localised");
    }
}

void SameNeighbours(Node& node, View& view, const std::u16string& type) {
    View parent;
    view->GetParent(Receive(parent));
    Require(
        static_cast<bool>(parent) == (node.parent != nullptr) && view->HasParent() == YesOrNo(node.parent != nullptr),
        "GetParent");
    std::vector<const ResTreeNode*> children;
    bool any = false;
    for (const auto& entry : node.entries) {
        if (Node* child = Tree::Resolve(node, *entry)) {
            any = true;
            if (Tree::Supports(*child, type)) {
                children.push_back(child->real);
            }
        }
    }
    Require(view->HasChildren() == YesOrNo(any), "HasChildren");
    Require(view->IsOfType(In(type)) == YesOrNo(Tree::Supports(node, type)), "IsOfType");
    ULONG count = 0;
    IzkhwResourceTreeNode** array = nullptr;
    view->GetChildrenOfType(In(type), &count, &array);
    Require(Take(count, array) == children, "GetChildrenOfType");
    std::vector<const ResTreeNode*> descendants;
    std::vector<Node*> open;
    CollectDescendants(node, type, open, descendants);
    view->GetDescendantsOfType(In(type), &count, &array);
    Require(Take(count, array) == descendants, "GetDescendantsOfType");
}

void SameNames(Node& node, View& view, const std::u16string& type, bool includePath) {
    NameWalk walk{type, u"Seen", includePath, {}, {}, {}};
    walk.Walk(node, false, Tree::PathOf(node), Tree::DisplayPathOf(node));
    ULONG count = 0;
    BSTR* names = nullptr;
    BSTR* displays = nullptr;
    view->GetDescendantNamesEx(nullptr, In(type), includePath ? 1 : 0, In(u"Seen"), &count, &names, &displays);
    Require(TakeTexts(count, names) == walk.names, "GetDescendantNamesEx gives the same names");
    Require(TakeTexts(count, displays) == walk.displays, "GetDescendantNamesEx gives the same display paths");
}

void SameFinding(Node& node, View& view, const std::u16string& path) {
    std::u16string_view rest = path;
    ULONG consumed = 0;
    if (rest.substr(0, 1) == u"/") {
        rest.remove_prefix(1);
        consumed = 1;
    }
    Node* reached = &node;
    bool crossed = false;
    bool isComplete = !path.empty();
    std::vector<String> components;
    zkhw::SplitList(rest, u'/', components, false);
    for (const String& component : components) {
        const Entry* entry = Tree::Find(*reached, component.View());
        Node* next = entry == nullptr ? nullptr : Tree::Resolve(*reached, *entry);
        if (next == nullptr) {
            isComplete = false;
            break;
        }
        crossed |= entry->kind == zkhw::LinkEntry && !entry->text.empty();
        consumed += component.Length() + 1 +
                    static_cast<ULONG>(std::count(component.View().begin(), component.View().end(), u'/'));
        reached = next;
    }
    consumed = isComplete ? static_cast<ULONG>(path.size()) : consumed;
    View found;
    ULONG offset = 77;
    BOOL link = 77;
    Require(view->FindNode(In(path), &offset, &link, Receive(found)) == YesOrNo(isComplete), "FindNode");
    Require(offset == consumed && (link != 0) == crossed, "FindNode tells how far it came");
    // An empty path finds nothing, not even this node.
    Require(path.empty() ? !found : static_cast<zkhw::ResTreeNodeAdapter*>(found.Get())->GetNode() == reached->real,
            "FindNode gives the node that it came to");
}

void SameReservations(Node& node, View& view, const std::u16string& owners) {
    for (const bool except : {false, true}) {
        ULONG mode = 77;
        const uint32_t expected = Tree::Flags(node, &owners, except);
        const HRESULT result = view->GetReservationEx(In(owners), except ? 1 : 0, &mode);
        Require(result == YesOrNo(expected != 0) && mode == expected, "GetReservationEx");
    }
    ULONG mode = 77;
    const uint32_t expected = Tree::Flags(node, nullptr, false);
    Require(view->GetReservation(nullptr, &mode) == YesOrNo(expected != 0) && mode == expected, "GetReservation");
    Require(view->HasPendingChanges() == YesOrNo(node.pending != 0), "HasPendingChanges");
}

}  // namespace

void SameAnswers(Node& node, View view, const std::u16string& path, const std::u16string& type,
                 const std::u16string& owners) {
    SameTexts(node, view);
    SameNeighbours(node, view, type);
    SameNames(node, view, type, true);
    SameNames(node, view, type, false);
    SameFinding(node, view, path);
    SameReservations(node, view, owners);
}

}  // namespace fuzz
