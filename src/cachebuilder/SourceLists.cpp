#include "cachebuilder/SourceLists.h"

#include "qn/dsc/FindUnit.h"
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
    const auto source = entry->Text();
    if (!source) {
        return;
    }
    List& list = lists[&node];
    // A file may have written the entry itself since.
    if (!qn::dsc::HasSameUnits(list.text.View(), *source)) {
        list.pieces.clear();
        AddPieces(*source, list.pieces);
        list.text.Assign(*source);
    }
    if (list.pieces.contains(ToUpper(file.View()))) {
        return;
    }
    if (EndsInEscape(list.text.View())) {
        list.text = {};
    } else {
        AddPieces(file.View(), list.pieces);
        list.text.Append(u",");
        list.text.Append(file);
    }
    String& text = entry->EditText();
    text.Append(u",");
    text.Append(file);
    node.Raise(PropertyChanged);
}

}  // namespace zkhw
