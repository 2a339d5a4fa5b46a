#pragma once

// What an element of a resource description means: a child node, a value, a link or an included file.

#include <string_view>

#include "restree/ParseStack.h"

namespace zkhw {

enum class ElementMode {
    Container,  // A further start tag has arrived.
    Leaf,       // The element's end tag has arrived.
};

class ElementReader {
  public:
    explicit ElementReader(ParseStack& stack) : stack(stack), frame(*stack.Top()), node(*frame.node) {}

    // Decides what the pending element of the top frame is, and makes it. `nextName` and `nextAttributes` are the
    // start tag that arrived in mode Container.
    void FlushPendingElement(ElementMode mode, std::string_view nextName, const char* const* nextAttributes);

  private:
    const AttributeList& Attributes() const { return frame.pendingAttributes; }

    void AppendTagToXmlValue();
    String ChooseEntryName(ElementMode mode, bool& isNode);
    void BeginXmlValue(const String& entryName, std::string_view nextName, const char* const* nextAttributes);
    bool IsNodeOrdered(std::u16string_view elementName) const;
    void BindDocumentElement(const String& entryName, std::u16string_view elementName, bool isOrdered);
    ResTreeNode& MakeChild(const String& entryName, std::u16string_view elementName, bool isOrdered);
    ResTreeNode* FindPrototype();
    ResTreeNode* Lookup(std::u16string_view path);

    void MakeValue(String&& entryName);
    void ReadValueText(bool isPath, TextBuilder& value);
    void MakeOrdinaryValue(std::u16string_view text, bool isReferenceList);
    void StoreText(std::u16string_view text, EntryKind kind, bool holdsVariables);
    void MakeLink(String&& entryName, std::u16string_view text);
    void Include(const String& text);
    void IncludeFile(const String& text);

    void Report(std::u16string_view message, const String& subject);
    const String* Before();

    ParseStack& stack;
    ParseFrame& frame;
    ResTreeNode& node;
    String before = String::WithoutBuffer();  // Holds the value of `next`.
};

}  // namespace zkhw
