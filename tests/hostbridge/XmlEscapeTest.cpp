#include "hostbridge/XmlEscape.h"

#include <gtest/gtest.h>

#include "qn/dsc/osdep/AllocationFault.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::String;

TEST(XmlEscape, ReplacesFiveCharactersWithQuotes) {
    EXPECT_EQ(ExactText(XmlEscape(u"&<>'\"", true)), "&amp;&lt;&gt;&apos;&quot;");
}

TEST(XmlEscape, ReplacesThreeCharactersWithoutQuotes) {
    EXPECT_EQ(ExactText(XmlEscape(u"&<>'\"", false)), "&amp;&lt;&gt;'\"");
}

TEST(XmlEscape, LeavesEverythingElseAlone) {
    const std::u16string_view text(u"a\0b\x01\t\r\n;#\x7F\x80\u20AC\xD83D\xDE00\xDC26\xFFFF", 17);
    EXPECT_EQ(ExactText(XmlEscape(text, true)), ExactText(text));
    EXPECT_EQ(ExactText(XmlEscape(text, false)), ExactText(text));
}

TEST(XmlEscape, UnitsWhoseLowBitsAreThoseOfASpecialCharacterPass) {
    // 64, 256 and 0x8000 above "&" and "<".
    const std::u16string_view text = u"\x66\x7C\u0126\u013C\u8026\u803C";
    EXPECT_EQ(ExactText(XmlEscape(text, true)), ExactText(text));
}

TEST(XmlEscape, EmptyTextStaysEmpty) {
    EXPECT_EQ(ExactText(XmlEscape(u"", true)), "");
}

TEST(XmlEscape, EscapesAreNotRecognised) {
    EXPECT_EQ(ExactText(XmlEscape(u"&amp;", true)), "&amp;amp;");
}

TEST(XmlEscape, SpecialCharactersMayStandAtBothEnds) {
    EXPECT_EQ(ExactText(XmlEscape(u"<a&b>", false)), "&lt;a&amp;b&gt;");
}

TEST(XmlEscape, AppendingKeepsWhatIsThere) {
    String out(u"x<");
    AppendXmlEscaped(out, u"a<b", true);
    EXPECT_EQ(ExactText(out), "x<a&lt;b");
}

TEST(XmlEscape, AppendingMakesNoStringOfItsOwn) {
    String out;
    out.Reserve(100);
    qn::dsc::osdep::FailAllocation(UINT64_MAX, false);
    AppendXmlEscaped(out, u"plain", true);
    AppendXmlEscaped(out, u"a<b&c", true);
    qn::dsc::osdep::ClearAllocationFault();
    EXPECT_EQ(qn::dsc::osdep::AllocationCount(), 0u);
    EXPECT_EQ(ExactText(out), "plaina&lt;b&amp;c");
}

}  // namespace
}  // namespace zkhw
