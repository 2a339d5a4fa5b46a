// Entries, names and paths of the model.

#include "TreeModel.h"

#include <algorithm>
#include <utility>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ChangeFlags.h"
#include "restree/NodePath.h"
#include "restree/TextList.h"

namespace fuzz::model {

using qn::dsc::String;
using qn::dsc::osdep::Compare;
using zkhw::ChildEntry;
using zkhw::LinkEntry;
using zkhw::TextEntry;

namespace {

bool IsText(const Entry& entry) {
    return entry.kind == TextEntry;
}

std::u16string Plain(const String& text) {
    return std::u16string(text.View());
}

// The types that every root knows, each with one of those that it inherits from.
constexpr std::pair<std::u16string_view, std::u16string_view> relations[] = {{u"IOResource", u"Resource"},
                                                                             {u"Target", u"ResourceList"},
                                                                             {u"Connector", u"ResourceList"},
                                                                             {u"Module", u"Resource"},
                                                                             {u"Module", u"ResourceList"}};

bool IsA(std::u16string_view type, std::u16string_view wanted) {
    if (Compare(type, wanted) == 0) {
        return true;
    }
    return std::any_of(std::begin(relations), std::end(relations), [&](const auto& relation) {
        return Compare(relation.first, type) == 0 && IsA(relation.second, wanted);
    });
}

}  // namespace

Tree::Tree(bool ordered) : root{u"", u"Root", ordered, nullptr, {}, {}, {}} {}

std::vector<Node*> Tree::Nodes() {
    Nodelist nodes{&root};
    for (size_t i = 0; i < nodes.size(); ++i) {
        for (const auto& entry : nodes[i]->entries) {
            if (entry->child) {
                nodes.push_back(entry->child.get());
            }
        }
    }
    return nodes;
}

// --- Reading ---

Entry* Tree::Find(Node& node, std::u16string_view key) {
    for (const auto& entry : node.entries) {
        if (Compare(entry->key, key) == 0) {
            return entry.get();
        }
    }
    return nullptr;
}

Node* Tree::LookupCounting(Node& start, std::u16string_view path, size_t& links) {
    Node* node = &start;
    if (path.substr(0, 1) == u"/") {
        while (node->parent != nullptr) {
            node = node->parent;
        }
        path.remove_prefix(1);
    }
    std::vector<String> components;
    zkhw::SplitList(path, u'/', components, false);
    for (const String& component : components) {
        if (component == u"..") {
            node = node->parent;
        } else if (component != u".") {
            const Entry* entry = Find(*node, component.View());
            if (entry == nullptr || IsText(*entry)) {
                return nullptr;
            }
            // A link may lead to itself; so many are followed in all.
            if (entry->kind == LinkEntry && ++links > 256) {
                return nullptr;
            }
            node = entry->child ? entry->child.get() : LookupCounting(*node, entry->text, links);
        }
        if (node == nullptr) {
            return nullptr;
        }
    }
    return node;
}

Node* Tree::Lookup(Node& node, std::u16string_view path) {
    size_t links = 0;
    return LookupCounting(node, path, links);
}

Node* Tree::Resolve(Node& node, const Entry& entry) {
    return entry.child ? entry.child.get() : IsText(entry) ? nullptr : Lookup(node, entry.text);
}

std::u16string Tree::PathOf(const Node& node) {
    return node.parent == nullptr ? u"/"
                                  : Plain(zkhw::JoinEscapedPath(String(PathOf(*node.parent)), String(node.name)));
}

std::u16string Tree::DisplayPathOf(Node& node) {
    if (node.parent == nullptr) {
        return u"/";
    }
    const Entry* display = Find(node, u"DisplayName");
    const bool isGiven = display != nullptr && IsText(*display);
    const auto shown = isGiven ? std::optional<std::u16string_view>(display->text) : std::nullopt;
    return Plain(zkhw::JoinDisplayPath(String(DisplayPathOf(*node.parent)), String(node.name), shown));
}

bool Tree::Supports(Node& node, std::u16string_view type) {
    if (type.empty() || IsA(node.type, type)) {
        return true;
    }
    const Entry* protocols = Find(node, u"Protocols");
    if (protocols == nullptr || !IsText(*protocols)) {
        return false;
    }
    const std::u16string list = u"," + protocols->text + u",";
    return list.find(u"," + std::u16string(type) + u",") != std::u16string::npos;
}

// --- Changing ---

void Tree::Set(Node& node, std::u16string_view key, std::u16string_view value) {
    if (Entry* entry = Find(node, key)) {
        Assign(node, *entry, value);
    } else {
        Add(node, key, TextEntry, value, false, nullptr);
    }
}

void Tree::Assign(Node& node, Entry& entry, std::u16string_view value) {
    if (!IsText(entry)) {
        return;
    }
    entry.text = value;
    const bool isDisplayName = Compare(entry.key, u"DisplayName") == 0;
    Raise(node, zkhw::PropertyChanged);
    if (isDisplayName) {
        Raise(node, zkhw::NodeNameChanged);
    }
    if (isDisplayName && node.parent != nullptr) {
        Raise(*node.parent, zkhw::ChildNameChanged);
    }
}

Entry* Tree::Add(Node& node, std::u16string_view key, zkhw::EntryKind kind, std::u16string_view text, bool childOrdered,
                 const std::u16string* before) {
    if (!node.ordered && Find(node, key) != nullptr) {
        return nullptr;
    }
    auto entry = std::make_unique<Entry>(Entry{std::u16string(key), kind, std::u16string(text), nullptr});
    if (kind == ChildEntry) {
        entry->child = std::make_unique<Node>(Node{entry->key, entry->text, childOrdered, &node, {}, {}, {}});
    }
    const Entry* next = before == nullptr ? nullptr : Find(node, *before);
    const auto position = std::find_if(node.entries.begin(), node.entries.end(), [&](const auto& other) {
        return node.ordered ? other.get() == next : Compare(other->key, key) > 0;
    });
    Entry* made = node.entries.insert(position, std::move(entry))->get();
    Raise(node, kind == TextEntry ? zkhw::PropertyAdded : zkhw::ChildAdded);
    return made;
}

void Tree::RemoveChildNodes(Node& node) {
    std::vector<Entry*> children;
    for (const auto& entry : node.entries) {
        if (entry->child) {
            children.push_back(entry.get());
        }
    }
    if (node.ordered) {
        std::reverse(children.begin(), children.end());
    }
    for (Entry* entry : children) {
        Remove(node, entry);
    }
}

void Tree::Remove(Node& node, Entry* entry) {
    const bool wasText = IsText(*entry);
    if (entry->child) {
        Raise(*entry->child, zkhw::NodeDeleting);
        RemoveChildNodes(*entry->child);
        Raise(*entry->child, zkhw::NodeDeleted);
    }
    const auto at = std::find_if(node.entries.begin(), node.entries.end(),
                                 [entry](const auto& other) { return other.get() == entry; });
    // Out of the list first: nobody finds a node that is being destroyed.
    const std::unique_ptr<Entry> removed = std::move(*at);
    node.entries.erase(at);
    if (removed->child) {
        Destroy(*removed->child);
    }
    Raise(node, wasText ? zkhw::PropertyRemoved : zkhw::ChildRemoved);
}

void Tree::RemoveByName(Node& node, std::u16string_view key) {
    if (Entry* entry = Find(node, key)) {
        Remove(node, entry);
    }
}

// Texts and links go one by one, with their notices; then all that listens, and all listening of the node itself.
void Tree::Destroy(Node& node) {
    while (!node.entries.empty()) {
        Remove(node, node.entries.front().get());
    }
    for (Node* other : Nodes()) {
        RemoveObserver(*other, nullptr, &node, -1);
    }
    std::erase_if(registrations, [&node](const auto& registration) { return registration->node == &node; });
    node.records.clear();
}

bool Tree::WouldLose(const Node& node, std::u16string_view newName) {
    if (node.parent == nullptr || node.parent->ordered) {
        return false;
    }
    const Entry* taken = Find(*node.parent, newName);
    return taken != nullptr && taken->child.get() != &node;
}

bool Tree::Rename(Node& node, std::u16string_view newName) {
    if (node.parent != nullptr) {
        // The first entry of that name: in an ordered node it may be another one.
        Entry* entry = Find(*node.parent, node.name);
        if (entry == nullptr) {
            return false;
        }
        entry->key = newName;
        if (!node.parent->ordered) {
            std::stable_sort(node.parent->entries.begin(), node.parent->entries.end(),
                             [](const auto& a, const auto& b) { return Compare(a->key, b->key) < 0; });
        }
    }
    node.name = newName;
    Raise(node, zkhw::NodeNameChanged);
    if (node.parent != nullptr) {
        Raise(*node.parent, zkhw::ChildNameChanged);
    }
    return true;
}

void Tree::CopyInto(Node& target, Node& source) {
    for (const auto& entry : source.entries) {
        if (entry->child) {
            RemoveByName(target, entry->key);
            Entry* copy = Add(target, entry->key, ChildEntry, entry->child->type, entry->child->ordered, nullptr);
            CopyInto(*copy->child, *entry->child);
        } else if (IsText(*entry)) {
            Add(target, entry->key, TextEntry, entry->text, false, nullptr);
        } else {
            const String led = zkhw::JoinList(String(PathOf(source)), String(entry->text), u'/', false, true);
            const String path = zkhw::MakeRelativeNodePath(led, String(PathOf(target)));
            Add(target, entry->key, LinkEntry, path.View(), false, nullptr);
        }
    }
}

}  // namespace fuzz::model
