#pragma once

// Short forms for making small trees in tests.

#include <memory>

#include "restree/ResTreeNode.h"

namespace zkhw {

inline std::unique_ptr<ResTreeNode> MakeRootNode(bool ordered = false) {
    return std::make_unique<ResTreeNode>(u"Root", u"Root", ordered);
}

// For a detached node without types.
inline constexpr const TypeTable* noTable = nullptr;

inline ResTreeNode::Added AddText(ResTreeNode& node, const char16_t* key, const char16_t* value,
                                  EntryKind kind = TextEntry) {
    return node.AddTextEntry(key, value, kind);
}

inline ResTreeNode::Added AddTextBefore(ResTreeNode& node, const char16_t* key, const char16_t* value,
                                        const char16_t* before) {
    const String place(before);
    return node.AddTextEntry(key, value, TextEntry, &place);
}

inline ResTreeNode::Added AddLink(ResTreeNode& node, const char16_t* key, const char16_t* path) {
    return node.AddLinkEntry(key, path);
}

// The new child, or what AddChildEntry gives in its place.
inline ResTreeNode* AddChild(ResTreeNode& node, const char16_t* key, const char16_t* type = u"T",
                             bool ordered = false) {
    ResTreeNode* child = nullptr;
    node.AddChildEntry(key, type, ordered, child);
    return child;
}

}  // namespace zkhw
