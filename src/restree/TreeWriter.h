#pragma once

// Nodes turned back into resource XML. Every operation appends to one String, so that a caller can put a document
// together from whole subtrees and hand-picked properties; nothing here writes an XML declaration.
//
// An element begins with its line break, "\n", so a document has none at its end. `indent` is what stands in front of
// the element; each level of nesting adds three blanks to it. A type that is null is left out.
// Keys, types and the paths of links are written as they stand. A key that isn't a name in XML gives a document that
// doesn't read back.
//
// Only WriteEntries, and what contains it, loads deferred contents; the tree may change at that moment. Exceptions are
// those of String: bad_alloc, and OutOfRange when `out` would get too long. `out` then holds what came before.

#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

class NodeEntry;
class ResTreeNode;

// The whole subtree. An entry "Protocols" stands twice: behind the opening tag, and at its place among the entries.
// Linear in the text, and no stack is used for the depth of the tree.
void WriteNode(ResTreeNode& node, String& out, std::u16string_view indent);

// The opening tag, with ` name="..."` if the name differs from the type, and with ` ordered="true"` for an ordered node
// whose type doesn't end in "List"; then the entry "Protocols", one level deeper. If there is none,
// `defaultProtocols` puts an empty one in its place.
void WriteOpenTag(ResTreeNode& node, String& out, std::u16string_view indent, bool defaultProtocols);

void WriteCloseTag(const ResTreeNode& node, String& out, std::u16string_view indent);

// All entries in the node's order, one level deeper than `indent`. Loads deferred contents first.
void WriteEntries(ResTreeNode& node, String& out, std::u16string_view indent);

// One entry by name, under the key as it is stored; it is never loaded for that. If there is none, a text element `key`
// with the value `fallback`, or nothing if that is null.
void WriteProperty(ResTreeNode& node, String& out, std::u16string_view key, std::u16string_view indent,
                   const String* type, const String* fallback);

// One entry by its kind. A text stands as a text element; a localised one as its whole list of languages; a link as
// `<:Link  name="key">path</:Link>`, with two blanks; a child as a node under its own name.
void WriteEntry(const NodeEntry& entry, String& out, std::u16string_view key, std::u16string_view indent,
                const String* type);

// One text element, with the value escaped. `localized` adds ` localize="true"`.
void WriteTextElement(String& out, std::u16string_view tag, std::u16string_view value, std::u16string_view indent,
                      const String* type, bool localized);

}  // namespace zkhw
