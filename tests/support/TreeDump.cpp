#include "support/TreeDump.h"

#include <cstdio>
#include <vector>

#include "support/ExactText.h"

namespace zkhw {

namespace {

struct OpenNode {
    ResTreeNode* node;
    EntryIterator next;
};

std::string Printable(std::u16string_view text) {
    std::string printable;
    for (const char unit : qn::dsc::ExactText(text)) {
        if (static_cast<unsigned char>(unit) < 0x20) {
            char number[8];
            std::snprintf(number, sizeof number, "{%04X}", static_cast<unsigned>(unit));
            printable += number;
        } else {
            printable.push_back(unit);
        }
    }
    return printable;
}

std::string Heading(const ResTreeNode& node) {
    return Printable(node.GetName()) + ":" + Printable(node.GetType()) + (node.IsOrdered() ? " ordered" : "");
}

std::string Line(const NodeEntry& entry, const ResTreeNode& holder) {
    const std::string key = Printable(entry.Key());
    switch (entry.Kind()) {
        case TextEntry:
            return key + "=" + Printable(*entry.Text());
        case LocalizedTextEntry:
            return key + "~" + Printable(*entry.Text());
        case LinkEntry:
            return key + "->" + Printable(*entry.LinkPath());
        case ChildEntry: {
            const ResTreeNode& child = *entry.Child();
            const std::string keyPart = Printable(child.GetName()) == key ? "" : key + "=>";
            return keyPart + Heading(child) + (child.GetParent() == &holder ? "" : " !parent");
        }
        case EmptyEntry:
            break;
    }
    return key + " !empty";
}

}  // namespace

std::string DumpTree(ResTreeNode& root) {
    std::string dump = Heading(root) + "\n";
    std::vector<OpenNode> open = {{&root, root.Begin()}};
    while (!open.empty()) {
        if (open.back().next.IsEnd()) {
            open.pop_back();
            continue;
        }
        ResTreeNode& holder = *open.back().node;
        const NodeEntry& entry = *open.back().next;
        dump.append(open.size() * 2, ' ').append(Line(entry, holder)).append("\n");
        ++open.back().next;
        if (ResTreeNode* child = entry.Child()) {
            open.push_back({child, child->Begin()});
        }
    }
    return dump;
}

}  // namespace zkhw
