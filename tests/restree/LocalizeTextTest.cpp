#include "restree/LocalizeText.h"

#include <gtest/gtest.h>

#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::String;

struct Choice {
    const char16_t* list;
    const char* chosen;
};

void ExpectChoices(const std::vector<Choice>& choices) {
    for (const Choice& choice : choices) {
        const String list(choice.list);
        EXPECT_EQ(ExactText(LocalizeText(list.View())), choice.chosen + std::string("{0000}") + ExactText(list));
    }
}

// Without a host the language is English.
TEST(LocalizeText, ChoosesATextAndKeepsTheList) {
    ExpectChoices({
        {u"eng=Clock,jpn=X", "Clock"},
        {u"jpn=X,eng=Clock", "Clock"},
        {u"ENG=Clock", "Clock"},
        {u"eng=A,eng=B", "A"},
        {u"plain,eng=Clock", "Clock"},
        {u"eng,eng=Clock", "Clock"},
        {u" eng=Clock , jpn=X", "Clock"},
        {u"eng= Clock ", " Clock"},
        {u"eng=", ""},
        {u"eng=a=b", "a=b"},
        {u"eng=a\\,b,jpn=X", "a,b"},
        {u"eng=a\\\\,jpn=X", "a\\"},
        {u"eng=a\\=b", "a\\=b"},
        {u"jpn=x\\,y,eng=Clock", "Clock"},
        {u"jpn=X,eng=a text of more than eight units\\, with a comma", "a text of more than eight units, with a comma"},
        {u"a text of more than eight units,eng=Clock", "Clock"},
        {u",,eng=Clock,,", "Clock"},
        {u"eng=\u540D", "{540D}"},
        {u"e\u00ADng=Soft hyphen", "Soft hyphen"},
    });
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(LocalizeText, WidthOfALanguagesNameDoesNotCountAsOnlyLinuxOrdersSo) {
    ExpectChoices({{u"\uFF45\uFF4E\uFF47=Wide", "Wide"}});
}

TEST(LocalizeText, GivesTheListAloneIfNoTextFits) {
    for (const char16_t* list :
         {u"", u"Clock", u"jpn=X", u"jpn=X,chs=Y", u"eng", u"english=X", u"eng =X", u"=X", u"en=X", u" , "}) {
        EXPECT_EQ(ExactText(LocalizeText(list)), ExactText(std::u16string_view(list)));
    }
}

TEST(LocalizeText, KeepsANulInsideTheList) {
    const String list(u"eng=a\0b,jpn=X", 13);
    EXPECT_EQ(ExactText(LocalizeText(list.View())), "a{0000}b{0000}eng=a{0000}b,jpn=X");
}

}  // namespace
}  // namespace zkhw
