#include "cachebuilder/SourceLists.h"

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

class SourceListsOf : public testing::Test {
  protected:
    std::string Source() { return ExactText(node.GetPropertyOrEmpty(u"FPGA_XMLSource")); }
    void SetSource(std::u16string_view text) { node.SetProperty(u"FPGA_XMLSource", text); }

    ResTreeNode node{u"N", u"N", false};
    SourceLists sources;
};

TEST_F(SourceListsOf, FirstFileMakesTheEntry) {
    sources.Add(node, u"a.xml");
    EXPECT_EQ(Source(), "a.xml");
}

TEST_F(SourceListsOf, FurtherFilesAreAppendedInTheirOrder) {
    for (const char16_t* file : {u"c.xml", u"a.xml", u"b.xml"}) {
        sources.Add(node, file);
    }
    EXPECT_EQ(Source(), "c.xml,a.xml,b.xml");
}

TEST_F(SourceListsOf, SameFileIsAddedOnce) {
    for (const char16_t* file : {u"a.xml", u"b.xml", u"a.xml", u"b.xml"}) {
        sources.Add(node, file);
    }
    EXPECT_EQ(Source(), "a.xml,b.xml");
}

TEST_F(SourceListsOf, LetterCaseOfAsciiDoesNotCount) {
    sources.Add(node, u"A\\b.XML");
    sources.Add(node, u"a\\B.xml");
    EXPECT_EQ(Source(), "A\\b.XML");
}

TEST_F(SourceListsOf, LetterCaseBeyondAsciiCounts) {
    sources.Add(node, u"\u00E9.xml");
    sources.Add(node, u"\u00C9.xml");
    EXPECT_EQ(Source(), "{00E9}.xml,{00C9}.xml");
}

TEST_F(SourceListsOf, ListThatWasThereIsTakenUp) {
    SetSource(u"x.xml,\t a.xml \r\n,y.xml");
    sources.Add(node, u"A.xml");
    EXPECT_EQ(Source(), "x.xml,\t a.xml \r\n,y.xml");
    sources.Add(node, u"z.xml");
    EXPECT_EQ(Source(), "x.xml,\t a.xml \r\n,y.xml,z.xml");
}

TEST_F(SourceListsOf, EmptyEntryBecomesAListWithAnEmptyPiece) {
    SetSource(u"");
    sources.Add(node, u"a.xml");
    EXPECT_EQ(Source(), ",a.xml");
}

TEST_F(SourceListsOf, EscapedCommaDoesNotSeparate) {
    SetSource(u"a\\,b.xml");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a\\,b.xml,b.xml");
    sources.Add(node, u"a,b.xml");
    EXPECT_EQ(Source(), "a\\,b.xml,b.xml");
}

TEST_F(SourceListsOf, CommaOfAFileIsNotEscapedAndSoTheFileIsNotKnownAgain) {
    sources.Add(node, u"a,b.xml");
    sources.Add(node, u"a,b.xml");
    EXPECT_EQ(Source(), "a,b.xml,a,b.xml");
    sources.Add(node, u"B.xml");
    EXPECT_EQ(Source(), "a,b.xml,a,b.xml");
}

TEST_F(SourceListsOf, FileBehindABackslashIsNotKnownAgain) {
    // The comma in front of it counts as escaped.
    SetSource(u"a\\");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a\\,b.xml");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a\\,b.xml,b.xml");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a\\,b.xml,b.xml");
}

TEST_F(SourceListsOf, DoubledBackslashIsKnownAsASingleOne) {
    SetSource(u"a\\\\b.xml");
    sources.Add(node, u"a\\b.xml");
    EXPECT_EQ(Source(), "a\\\\b.xml");
}

TEST_F(SourceListsOf, ChangeOfTheEntryInBetweenCounts) {
    sources.Add(node, u"a.xml");
    SetSource(u"b.xml");
    sources.Add(node, u"a.xml");
    EXPECT_EQ(Source(), "b.xml,a.xml");
}

TEST_F(SourceListsOf, EntryThatWentInBetweenIsMadeAnew) {
    sources.Add(node, u"a.xml");
    sources.Add(node, u"b.xml");
    node.RemoveEntryByName(u"FPGA_XMLSource");
    sources.Add(node, u"b.xml");
    sources.Add(node, u"a.xml");
    EXPECT_EQ(Source(), "b.xml,a.xml");
}

TEST_F(SourceListsOf, EntryThatIsNoTextStays) {
    ResTreeNode* child = nullptr;
    node.AddChildEntry(u"FPGA_XMLSource", u"T", false, child);
    sources.Add(node, u"a.xml");
    EXPECT_EQ(node.Find(u"FPGA_XMLSource")->Child(), child);
}

TEST_F(SourceListsOf, LocalisedEntryKeepsItsKind) {
    node.AddTextEntry(u"FPGA_XMLSource", u"a.xml", LocalizedTextEntry);
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a.xml,b.xml");
    EXPECT_EQ(node.Find(u"FPGA_XMLSource")->Kind(), LocalizedTextEntry);
}

TEST_F(SourceListsOf, NodesHaveListsOfTheirOwn) {
    ResTreeNode other(u"M", u"M", false);
    sources.Add(node, u"a.xml");
    sources.Add(other, u"a.xml");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(Source(), "a.xml,b.xml");
    EXPECT_EQ(ExactText(other.GetPropertyOrEmpty(u"FPGA_XMLSource")), "a.xml");
}

TEST_F(SourceListsOf, ChangesAreAnnounced) {
    struct Recorder : ResTreeNodeChangeObserver {
        void OnNodeChanged(ResTreeNode*, uint32_t changes, int32_t) override { seen.push_back(changes); }
        std::vector<uint32_t> seen;
    } recorder;
    node.AddObserver(&recorder, allChanges & ~uint32_t{AncestorChanged | ReservationChanged}, 7);
    sources.Add(node, u"a.xml");
    sources.Add(node, u"b.xml");
    sources.Add(node, u"b.xml");
    EXPECT_EQ(recorder.seen, (std::vector<uint32_t>{PropertyAdded, PropertyChanged}));
    node.RemoveObserver(&recorder, -1, false);
}

TEST_F(SourceListsOf, ManyFilesOfOneNodeAllStandOnce) {
    std::string expected;
    for (int round = 0; round < 2; ++round) {
        for (int i = 0; i < 5000; ++i) {
            const std::string file = std::to_string(i) + "_resource.xml";
            sources.Add(node, String(file.c_str()));
            if (round == 0) {
                expected += (i == 0 ? "" : ",") + file;
            }
        }
    }
    EXPECT_EQ(Source(), expected);
}

}  // namespace
}  // namespace zkhw
