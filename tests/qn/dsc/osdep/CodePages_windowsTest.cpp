// What the system's code pages make of what is no text in them: their default character, never the bytes again.

#include <memory>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/AnsiToWide.h"
#include "qn/dsc/osdep/WideToAnsi.h"

namespace qn::dsc::osdep {
namespace {

std::u16string Wide(std::string_view bytes, const char* locale) {
    const std::unique_ptr<char16_t[]> units(AnsiToWide(bytes.data(), bytes.data() + bytes.size(), locale));
    return units.get();
}

std::string Narrow(std::u16string_view units, const char* locale) {
    const std::unique_ptr<char[]> bytes(WideToAnsi(units.data(), units.data() + units.size(), locale));
    return bytes.get();
}

TEST(CodePagesOfWindows, ByteThatIsNoUtf8BecomesTheDefaultCharacter) {
    EXPECT_EQ(Wide("a\xFFz", ""), u"a\uFFFDz");
    EXPECT_EQ(Wide("\x80", ""), u"\uFFFD");
    EXPECT_EQ(Wide("\xC3\xC3\xA9", ""), u"\uFFFD\u00E9");
}

TEST(CodePagesOfWindows, HalfOfAPairBecomesTheDefaultCharacter) {
    EXPECT_EQ(Narrow(u"a\xD800z", ""), "a\xEF\xBF\xBDz");
    EXPECT_EQ(Narrow(u"a\xDCFF", ""), "a\xEF\xBF\xBD");
}

TEST(CodePagesOfWindows, AsciiHasTheLetterWithoutItsAccent) {
    EXPECT_EQ(Narrow(u"caf\u00e9", "US-ASCII"), "cafe");
}

TEST(CodePagesOfWindows, AsciiHasAQuestionMarkForWhatIsUnlikeAnyOfIts) {
    EXPECT_EQ(Narrow(u"a\u65e5z", "US-ASCII"), "a?z");
}

}  // namespace
}  // namespace qn::dsc::osdep
