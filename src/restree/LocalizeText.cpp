#include "restree/LocalizeText.h"

#include <vector>

#include "hostbridge/ResourceLanguage.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::osdep::Compare;

String LocalizeText(const String& text) {
    const String language = GetResourceLanguage();
    std::vector<String> items;
    SplitList(text.View(), u',', items, true);
    const String* chosen = nullptr;
    size_t chosenStart = 0;
    for (const String& item : items) {
        const size_t equals = item.View().find(u'=');
        if (equals == std::u16string_view::npos) {
            continue;
        }
        const std::u16string_view code = item.View().substr(0, equals);
        const bool isExact = Compare(code, language.View()) == 0;
        if (isExact || Compare(code, u"eng") == 0) {
            chosen = &item;
            chosenStart = equals + 1;
        }
        if (isExact) {
            break;
        }
    }
    if (chosen == nullptr) {
        return text;
    }
    String result(chosen->View().substr(chosenStart));
    result.Append(1, u'\0');
    result.Append(text);
    return result;
}

}  // namespace zkhw
