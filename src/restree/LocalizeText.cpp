#include "restree/LocalizeText.h"

#include "hostbridge/ResourceLanguage.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::osdep::Equal;

String LocalizeText(const String& text) {
    const String language = GetResourceLanguage();
    String unescaped = String::WithoutBuffer();
    String chosen = String::WithoutBuffer();
    bool isChosen = false;
    PieceReader items(text.View(), u",", true);
    while (items.Next()) {
        std::u16string_view item = items.Raw();
        if (items.MayHaveEscapes()) {
            unescaped = UnescapeText(item, u',');
            item = unescaped.View();
        }
        const size_t equals = item.find(u'=');
        if (equals == std::u16string_view::npos) {
            continue;
        }
        const std::u16string_view code = item.substr(0, equals);
        const bool isExact = Equal(code, language.View());
        if (isExact || Equal(code, u"eng")) {
            chosen = String(item.substr(equals + 1));
            isChosen = true;
        }
        if (isExact) {
            break;
        }
    }
    if (!isChosen) {
        return text;
    }
    constexpr char16_t nul[] = {0};
    return String::Concat({chosen.View(), std::u16string_view(nul, 1), text.View()});
}

}  // namespace zkhw
