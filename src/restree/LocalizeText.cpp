#include "restree/LocalizeText.h"

#include <utility>

#include "hostbridge/ResourceLanguage.h"
#include "qn/dsc/FindUnit.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::osdep::Equal;

String LocalizeText(std::u16string_view text) {
    const std::u16string_view language = GetResourceLanguage().View();
    constexpr std::u16string_view english = u"eng";
    std::u16string_view chosen;
    String chosenText = String::WithoutBuffer();  // Holds `chosen` if that isn't a part of `text`.
    bool isChosen = false;
    PieceReader items(text, u",", true);
    while (items.Next()) {
        String unescaped = String::WithoutBuffer();
        std::u16string_view item = items.Raw();
        if (items.MayHaveEscapes()) {
            unescaped = UnescapeText(item, u',');
            item = unescaped.View();
        }
        const size_t equals = qn::dsc::FindUnit(item, u'=');
        if (equals == item.size()) {
            continue;
        }
        const std::u16string_view code = item.substr(0, equals);
        const bool isExact = Equal(code, language);
        if (isExact || Equal(code, english)) {
            chosen = item.substr(equals + 1);
            chosenText = std::move(unescaped);
            isChosen = true;
        }
        if (isExact) {
            break;
        }
    }
    if (!isChosen) {
        return String(text);
    }
    constexpr char16_t nul[] = {0};
    return String::Concat({chosen, std::u16string_view(nul, 1), text});
}

}  // namespace zkhw
