#include "restree/TreeWriter.h"

#include <cstdint>
#include <vector>

#include "hostbridge/XmlEscape.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

using namespace std::string_view_literals;
using qn::dsc::osdep::Equal;

constexpr uint32_t blanksPerLevel = 3;

// The caller's indent and the blanks of the levels below it.
struct Indent {
    std::u16string_view outer;
    uint32_t blanks;

    Indent Deeper() const { return {outer, blanks + blanksPerLevel}; }
};

void BeginLine(String& out, Indent indent) {
    out.Append(u"\n"sv);
    out.Append(indent.outer);
    out.Append(indent.blanks, u' ');
}

void AppendTextElement(String& out, std::u16string_view tag, std::u16string_view value, Indent indent,
                       const String* type, bool localized) {
    BeginLine(out, indent);
    out.Append(u"<"sv);
    out.Append(tag);
    if (type != nullptr) {
        out.Append(u" type=\""sv);
        out.Append(*type);
        out.Append(u"\""sv);
    }
    if (localized) {
        out.Append(u" localize=\"true\""sv);
    }
    out.Append(u">"sv);
    AppendXmlEscaped(out, value, true);
    out.Append(u"</"sv);
    out.Append(tag);
    out.Append(u">"sv);
}

void AppendLink(String& out, std::u16string_view key, std::u16string_view path, Indent indent) {
    BeginLine(out, indent);
    // Two blanks: that is the form of a link.
    out.Append(u"<:Link  name=\""sv);
    out.Append(key);
    out.Append(u"\">"sv);
    out.Append(path);
    out.Append(u"</:Link>"sv);
}

// What a localised text shows is only its choice; behind the first NUL stands the list that it was chosen from.
std::u16string_view LanguageList(std::u16string_view text) {
    const size_t separator = text.find(u'\0');
    const bool hasList = separator != std::u16string_view::npos && separator + 1 < text.size();
    return hasList ? text.substr(separator + 1) : text;
}

void AppendOpenTag(const ResTreeNode& node, String& out, Indent indent) {
    BeginLine(out, indent);
    out.Append(u"<"sv);
    out.Append(node.GetType());
    if (!Equal(node.GetName(), node.GetType())) {
        out.Append(u" name=\""sv);
        AppendXmlEscaped(out, node.GetName(), true);
        out.Append(u"\""sv);
    }
    if (node.IsOrdered() && !EndsWith(node.GetType(), u"List")) {
        out.Append(u" ordered=\"true\""sv);
    }
    out.Append(u">"sv);
}

void AppendCloseTag(const ResTreeNode& node, String& out, Indent indent) {
    BeginLine(out, indent);
    out.Append(u"</"sv);
    out.Append(node.GetType());
    out.Append(u">"sv);
}

// Writes an entry unless it is a child: that is given back for the caller to write.
ResTreeNode* AppendFlatEntry(const NodeEntry& entry, String& out, std::u16string_view key, Indent indent,
                             const String* type) {
    switch (entry.Kind()) {
        case TextEntry:
            AppendTextElement(out, key, *entry.Text(), indent, type, false);
            return nullptr;
        case LocalizedTextEntry:
            AppendTextElement(out, key, LanguageList(*entry.Text()), indent, type, true);
            return nullptr;
        case LinkEntry:
            AppendLink(out, key, *entry.LinkPath(), indent);
            return nullptr;
        case ChildEntry:
            return entry.Child();
        default:
            return nullptr;
    }
}

// Writes a subtree with a stack of its own. Loads and whoever hears of them may change the tree on the way, so what
// leaves it is kept, and a position is stepped before it is read again.
class SubtreeWriter {
  public:
    explicit SubtreeWriter(String& text) : out(text) {}

    void WriteNode(ResTreeNode& top, Indent indent) {
        Open(top, indent.blanks);
        Run(indent.outer);
    }

    void WriteEntries(ResTreeNode& node, Indent indent) {
        open.push_back({&node, node.End(), indent.blanks, Phase::Head, false});
        Run(indent.outer);
    }

  private:
    enum class Phase : uint8_t {
        Tag,      // Nothing is written yet.
        Head,     // The tag and "Protocols" are written.
        Entries,  // The entry at `position` is written.
    };

    struct OpenNode {
        ResTreeNode* node;
        EntryIterator position;
        uint32_t blanks;
        Phase phase;
        bool hasTags;
    };

    void Open(ResTreeNode& node, uint32_t blanks) { open.push_back({&node, node.End(), blanks, Phase::Tag, true}); }

    // Each round writes one flat entry, or opens or closes a node.
    void Run(std::u16string_view outer) {
        while (!open.empty()) {
            OpenNode& top = open.back();
            const Indent indent{outer, top.blanks};
            const NodeEntry* next = Advance(top, indent);
            if (next == nullptr) {
                continue;
            }
            if (ResTreeNode* child = AppendFlatEntry(*next, out, next->Key(), indent.Deeper(), nullptr)) {
                Open(*child, indent.Deeper().blanks);
            }
        }
    }

    // Goes one step on in `top`; gives the entry that is to be written now, if any.
    const NodeEntry* Advance(OpenNode& top, Indent indent) {
        if (top.phase == Phase::Tag) {
            AppendOpenTag(*top.node, out, indent);
            top.phase = Phase::Head;
            return top.node->FindRaw(u"Protocols");
        }
        if (top.phase == Phase::Head) {
            top.node->EnsureDeferredLoaded();
            top.position = top.node->Begin();
            top.phase = Phase::Entries;
        } else {
            ++top.position;
        }
        if (!top.position.IsEnd()) {
            return &*top.position;
        }
        if (top.hasTags) {
            AppendCloseTag(*top.node, out, indent);
        }
        open.pop_back();
        return nullptr;
    }

    String& out;
    std::vector<OpenNode> open;
    ReleaseScope scope;
};

void AppendEntry(const NodeEntry& entry, String& out, std::u16string_view key, Indent indent, const String* type) {
    if (ResTreeNode* child = AppendFlatEntry(entry, out, key, indent, type)) {
        SubtreeWriter(out).WriteNode(*child, indent);
    }
}

void AppendProperty(const ResTreeNode& node, String& out, std::u16string_view key, Indent indent, const String* type,
                    const String* fallback) {
    if (const NodeEntry* entry = node.FindRaw(key)) {
        AppendEntry(*entry, out, entry->Key(), indent, type);
    } else if (fallback != nullptr) {
        AppendTextElement(out, key, fallback->View(), indent, type, false);
    }
}

}  // namespace

void WriteNode(ResTreeNode& node, String& out, std::u16string_view indent) {
    SubtreeWriter(out).WriteNode(node, {indent, 0});
}

void WriteOpenTag(ResTreeNode& node, String& out, std::u16string_view indent, bool defaultProtocols) {
    AppendOpenTag(node, out, {indent, 0});
    const String empty;
    AppendProperty(node, out, u"Protocols", Indent{indent, 0}.Deeper(), nullptr, defaultProtocols ? &empty : nullptr);
}

void WriteCloseTag(const ResTreeNode& node, String& out, std::u16string_view indent) {
    AppendCloseTag(node, out, {indent, 0});
}

void WriteEntries(ResTreeNode& node, String& out, std::u16string_view indent) {
    SubtreeWriter(out).WriteEntries(node, {indent, 0});
}

void WriteProperty(ResTreeNode& node, String& out, std::u16string_view key, std::u16string_view indent,
                   const String* type, const String* fallback) {
    AppendProperty(node, out, key, {indent, 0}, type, fallback);
}

void WriteEntry(const NodeEntry& entry, String& out, std::u16string_view key, std::u16string_view indent,
                const String* type) {
    AppendEntry(entry, out, key, {indent, 0}, type);
}

void WriteTextElement(String& out, std::u16string_view tag, std::u16string_view value, std::u16string_view indent,
                      const String* type, bool localized) {
    AppendTextElement(out, tag, value, {indent, 0}, type, localized);
}

}  // namespace zkhw
