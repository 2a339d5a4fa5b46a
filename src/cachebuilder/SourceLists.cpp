#include "cachebuilder/SourceLists.h"

#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr std::u16string_view sourceKey = u"FPGA_XMLSource";

std::u16string ToUpper(std::u16string_view text) {
    std::u16string upper(text);
    for (char16_t& unit : upper) {
        if (unit >= u'a' && unit <= u'z') {
            unit = static_cast<char16_t>(unit - (u'a' - u'A'));
        }
    }
    return upper;
}

void AddPieces(std::u16string_view text, std::unordered_set<std::u16string>& pieces) {
    for (PieceReader reader(text, u",", true); reader.Next();) {
        const bool isPlain = !reader.MayHaveEscapes();
        pieces.insert(ToUpper(isPlain ? reader.Raw() : UnescapeText(reader.Raw(), u",").View()));
    }
}

// Whether a separator behind `text` would count as escaped.
bool EndsInEscape(std::u16string_view text) {
    const size_t last = text.find_last_not_of(u'\\');
    return (text.size() - 1 - last) % 2 != 0;
}

}  // namespace

void SourceLists::Add(ResTreeNode& node, const String& file) {
    NodeEntry* const entry = node.Find(sourceKey);
    if (entry == nullptr) {
        node.SetProperty(sourceKey, file.View());
        return;
    }
    if (!entry->IsText()) {
        return;
    }
    List& list = lists[&node];
    // A file may have written the entry itself since.
    if (list.entry != entry || !entry->IsTextMarked()) {
        list.pieces.clear();
        AddPieces(*entry->Text(), list.pieces);
        list.entry = entry;
        entry->MarkText();
    }
    if (list.pieces.contains(ToUpper(file.View()))) {
        return;
    }
    String& text = node.EditEntryText(*entry);
    const bool joinsTheLast = EndsInEscape(text.View());
    text.Append(u",");
    text.Append(file);
    if (!joinsTheLast) {
        AddPieces(file.View(), list.pieces);
        entry->MarkText();
    }
    node.Raise(PropertyChanged);
}

}  // namespace zkhw
