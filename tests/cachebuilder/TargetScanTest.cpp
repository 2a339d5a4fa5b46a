#include <memory>

#include <gtest/gtest.h>

#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/Installation.h"
#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

class TargetScan : public testing::Test {
  protected:
    // Scans the working directory in the place of the executable at `executable`.
    void Scan(const char16_t* executable = toolPath) {
        ExecutableScope scope(installation, executable);
        EXPECT_EQ(tree.ScanTargets(installation.System(), *root), 0);
    }

    ResTreeNode& Child(const char16_t* name) {
        NodeEntry* entry = root->Find(name);
        return entry == nullptr || entry->Child() == nullptr ? *root : *entry->Child();
    }

    // "nothing" if there is no such text.
    std::string Text(const char16_t* child, const char16_t* key) {
        const auto text = Child(child).GetProperty(key);
        return text ? ExactText(*text) : "nothing";
    }

    std::string Dump(const char16_t* child) { return DumpTree(Child(child)); }
    std::string SystemText(const char16_t* below) { return ExactText(installation.System(below)); }

    Installation installation;
    FPGAResTree tree;
    std::unique_ptr<ResTreeNode> root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
};

TEST_F(TargetScan, FolderWithoutResourceFilesGivesAnEmptyTree) {
    Scan();
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(TargetScan, TargetIsStampedBehindWhatItsFileSays) {
    installation.Write("x/x_resource.xml", "<Target name=\"X\"><Kind>k</Kind></Target>");
    Scan();
    EXPECT_EQ(Dump(u"X"),
              "X:Target ordered\n"
              "  Kind=k\n"
              "  TargetXMLPath=Targets\\QN\\FPGA\\x\\x_resource.xml\n"
              "  TargetDir=" +
                  SystemText(u"x") +
                  "\n"
                  "  TargetClassShortClassName=X\n"
                  "  TargetClass=COM.QN.FPGA.X\n"
                  "  EIOItemTypeName=FPGA I/O\n"
                  "  EIOItemIconName=fpga\\IO.png\n");
}

TEST_F(TargetScan, TargetKeepsItsOwnClassAndItemProperties) {
    installation.Write("x_resource.xml",
                       "<Target name=\"X\"><TargetClass>c</TargetClass><EIOItemTypeName>t</EIOItemTypeName>"
                       "<EIOItemIconName>i</EIOItemIconName></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetClass"), "c");
    EXPECT_EQ(Text(u"X", u"EIOItemTypeName"), "t");
    EXPECT_EQ(Text(u"X", u"EIOItemIconName"), "i");
}

TEST_F(TargetScan, TargetLosesItsOwnPathFolderAndShortName) {
    installation.Write("x_resource.xml",
                       "<Target name=\"X\"><TargetXMLPath>p</TargetXMLPath><TargetDir>d</TargetDir>"
                       "<TargetClassShortClassName>s</TargetClassShortClassName></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetXMLPath"), "Targets\\QN\\FPGA\\x_resource.xml");
    EXPECT_EQ(Text(u"X", u"TargetDir"), ExactText(installation.System()));
    EXPECT_EQ(Text(u"X", u"TargetClassShortClassName"), "X");
}

TEST_F(TargetScan, EmptyClassOfATargetIsKept) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><TargetClass/></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetClass"), "");
}

TEST_F(TargetScan, ChildInThePlaceOfAPropertyStays) {
    installation.Write("x_resource.xml",
                       "<Target name=\"X\" ordered=\"false\"><TargetClass name=\"TargetClass\"/></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetClass"), "nothing");
    ASSERT_NE(Child(u"X").Find(u"TargetClass"), nullptr);
    EXPECT_NE(Child(u"X").Find(u"TargetClass")->Child(), nullptr);
}

TEST_F(TargetScan, TargetHasATypeTableOfItsOwn) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    installation.Write("y_resource.xml", "<Other><K>v</K></Other>");
    Scan();
    EXPECT_NE(Child(u"X").GetTypeTable(), nullptr);
    EXPECT_EQ(Child(u"Other").GetTypeTable(), nullptr);
}

TEST_F(TargetScan, TypeOfATargetMayHaveAnyLetterCase) {
    installation.Write("x_resource.xml", "<TARGET name=\"X\"><K>v</K></TARGET>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetClass"), "COM.QN.FPGA.X");
}

TEST_F(TargetScan, TargetNamedAsTheHostSetIsATarget) {
    installation.Write("x_resource.xml", "<Target name=\"FPGAHostSet\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(Text(u"FPGAHostSet", u"TargetClass"), "COM.QN.FPGA.FPGAHostSet");
}

TEST_F(TargetScan, HostSetStaysAsItWasRead) {
    installation.Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    Scan();
    EXPECT_EQ(Dump(u"FPGAHostSet"), "FPGAHostSet:FPGAHostSet\n  HostA=1\n");
}

TEST_F(TargetScan, HostSetMayHaveAnyLetterCase) {
    installation.Write("hosts_resource.xml", "<Set name=\"fpgahostset\"><HostA>1</HostA></Set>");
    Scan();
    EXPECT_EQ(Dump(u"fpgahostset"), "fpgahostset:Set\n  HostA=1\n");
}

TEST_F(TargetScan, OtherNodeNotesItsFile) {
    installation.Write("a_resource.xml", "<Some><K>v</K></Some>");
    Scan();
    EXPECT_EQ(Dump(u"Some"), "Some:Some\n  FPGA_XMLSource=Targets\\QN\\FPGA\\a_resource.xml\n  K=v\n");
}

TEST_F(TargetScan, OtherNodeOfTwoFilesNotesBoth) {
    installation.Write("a_resource.xml", "<Some><K>a</K></Some>");
    installation.Write("b_resource.xml", "<Some><L>b</L></Some>");
    Scan();
    EXPECT_EQ(Dump(u"Some"),
              "Some:Some\n  FPGA_XMLSource=Targets\\QN\\FPGA\\a_resource.xml,Targets\\QN\\FPGA\\b_resource.xml\n"
              "  K=a\n  L=b\n");
}

TEST_F(TargetScan, FileThatIsSeenAgainIsNotNotedAgain) {
    installation.Write("a_resource.xml", "<Some><K>a</K></Some>");
    Scan();
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"), "Targets\\QN\\FPGA\\a_resource.xml");
}

TEST_F(TargetScan, SourceThatAFileBringsAlongIsKept) {
    installation.Write("a_resource.xml",
                       "<Some><FPGA_XMLSource>own.xml, targets\\qn\\fpga\\B_resource.xml</FPGA_XMLSource></Some>");
    installation.Write("b_resource.xml", "<Some><K>b</K></Some>");
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "own.xml, targets\\qn\\fpga\\B_resource.xml,Targets\\QN\\FPGA\\a_resource.xml");
}

TEST_F(TargetScan, CommaOfAFolderIsNotEscaped) {
    installation.Write("a,b/c_resource.xml", "<Some><K>v</K></Some>");
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"), "Targets\\QN\\FPGA\\a,b\\c_resource.xml");
    // It reads as two pieces, neither of which is the file.
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "Targets\\QN\\FPGA\\a,b\\c_resource.xml,Targets\\QN\\FPGA\\a,b\\c_resource.xml");
}

TEST_F(TargetScan, FilesStayInTheOrderOfTheWalkWithoutAHostsFile) {
    installation.Write("b_resource.xml", "<Some><K>b</K></Some>");
    installation.Write("c/a_resource.xml", "<Some><K>c</K></Some>");
    installation.Write("a_resource.xml", "<Some><K>a</K></Some>");
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "Targets\\QN\\FPGA\\a_resource.xml,Targets\\QN\\FPGA\\b_resource.xml,"
              "Targets\\QN\\FPGA\\c\\a_resource.xml");
    EXPECT_EQ(Text(u"Some", u"K"), "c");
}

TEST_F(TargetScan, HostsFileIsReadFirstAndTheOthersKeepTheirOrder) {
    for (const char* file : {"a", "b", "hosts", "z"}) {
        installation.Write(file + std::string("_resource.xml"), "<Some><K>" + std::string(file) + "</K></Some>");
    }
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "Targets\\QN\\FPGA\\hosts_resource.xml,Targets\\QN\\FPGA\\a_resource.xml,"
              "Targets\\QN\\FPGA\\b_resource.xml,Targets\\QN\\FPGA\\z_resource.xml");
}

TEST_F(TargetScan, HostsFileMayHaveAnyLetterCase) {
    installation.Write("a_resource.xml", "<Some><K>a</K></Some>");
    installation.Write("HOSTS_Resource.XML", "<Some><K>h</K></Some>");
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "Targets\\QN\\FPGA\\HOSTS_Resource.XML,Targets\\QN\\FPGA\\a_resource.xml");
}

TEST_F(TargetScan, OnlyTheFirstOfTwoHostsFilesIsMoved) {
    installation.Write("a_resource.xml", "<Some><K>1</K></Some>");
    installation.Write("p/Targets/QN/FPGA/hosts_resource.xml", "<Some><K>2</K></Some>");
    installation.Write("q/Targets/QN/FPGA/hosts_resource.xml", "<Some><K>3</K></Some>");
    Scan();
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"),
              "Targets\\QN\\FPGA\\p\\Targets\\QN\\FPGA\\hosts_resource.xml,Targets\\QN\\FPGA\\a_resource.xml,"
              "Targets\\QN\\FPGA\\q\\Targets\\QN\\FPGA\\hosts_resource.xml");
}

TEST_F(TargetScan, BrokenFileIsReportedAndTheScanGoesOn) {
    installation.Write("a_resource.xml", "<Some><K>v</K>");
    installation.Write("b_resource.xml", "<Target name=\"B\"><K>v</K></Target>");
    Scan();
    EXPECT_NE(root->GetPropertyOrEmpty(u"XMLParseErrors").find(u"a_resource.xml"), std::u16string_view::npos);
    EXPECT_EQ(Text(u"B", u"TargetClass"), "COM.QN.FPGA.B");
    // What was read before the fault stays, without a note of its file.
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"), "nothing");
    EXPECT_EQ(Text(u"Some", u"K"), "v");
}

TEST_F(TargetScan, FileThatCannotBeOpenedLeavesNoTrace) {
    installation.Root().MakeFolder(Installation::Below("a_resource.xml"));
    installation.Write("d_resource.xml", "<Target name=\"D\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(root->Find(u"XMLParseErrors"), nullptr);
    EXPECT_EQ(Text(u"D", u"TargetClass"), "COM.QN.FPGA.D");
}

// Windows has no pipes in folders, and Wine doesn't show links that lead nowhere.
TEST_F(TargetScan, PipeOrDanglingLinkLeavesNoTraceAsOnlyLinuxHasThem) {
    installation.Root().MakeLink("nowhere", Installation::Below("b_resource.xml"));
    installation.Root().MakePipe(Installation::Below("c_resource.xml"));
    installation.Write("d_resource.xml", "<Target name=\"D\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(root->Find(u"XMLParseErrors"), nullptr);
    EXPECT_EQ(Text(u"D", u"TargetClass"), "COM.QN.FPGA.D");
}

TEST_F(TargetScan, NodeThatItsOwnDocumentReplacedIsNotStamped) {
    // The second level of the xml value ends it early, so that W is read beside the target and takes its place.
    installation.Write("a_resource.xml",
                       "<Target name=\"B\"><V type=\"xml\"><d><e></e></d></V><W name=\"B\"></W></Target>");
    installation.Write("b_resource.xml", "<Target name=\"C\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(Dump(u"B"), "B:W\n");
    EXPECT_EQ(Text(u"C", u"TargetClass"), "COM.QN.FPGA.C");
}

TEST_F(TargetScan, DocumentThatIsAValueLeavesItsTextOnTheRoot) {
    installation.Write("a_resource.xml", "<Some>text</Some>");
    Scan();
    EXPECT_EQ(DumpTree(*root), ":ProviderResourceTreeRoot\n  Some=text\n");
}

TEST_F(TargetScan, TargetOfTwoFilesHasTheStampsOfTheLaterOne) {
    installation.Write("a/a_resource.xml", "<Target name=\"X\"><TargetClass>first</TargetClass></Target>");
    installation.Write("b/b_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetXMLPath"), "Targets\\QN\\FPGA\\b\\b_resource.xml");
    EXPECT_EQ(Text(u"X", u"TargetDir"), SystemText(u"b"));
    EXPECT_EQ(Text(u"X", u"TargetClass"), "first");
    EXPECT_EQ(Text(u"X", u"K"), "v");
}

TEST_F(TargetScan, HostStoresFullPaths) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    installation.Write("y_resource.xml", "<Some><K>v</K></Some>");
    Scan(hostPath);
    EXPECT_EQ(Text(u"X", u"TargetXMLPath"), SystemText(u"x_resource.xml"));
    EXPECT_EQ(Text(u"Some", u"FPGA_XMLSource"), SystemText(u"y_resource.xml"));
}

TEST_F(TargetScan, ToolBesideTheHostStoresFullPaths) {
    installation.Write("tool/Zarvik.exe", "");
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(Text(u"X", u"TargetXMLPath"), SystemText(u"x_resource.xml"));
}

TEST_F(TargetScan, FileWhosePathCannotBeExpressedStaysUnstamped) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    const qn::dsc::osdep::WorkingFolderScope folder(installation.Root().Native(Installation::Below("")));
    ExecutableScope scope(installation, toolPath);
    // A relative folder is listed from the working folder, and its files have relative paths.
    EXPECT_EQ(tree.ScanTargets(u".", *root), 0);
    EXPECT_EQ(Dump(u"X"), "X:Target ordered\n  K=v\n");
}

TEST_F(TargetScan, NonAsciiNamesAreFoundAndNoted) {
    installation.Write("\xC3\xA9/\xE2\x82\xAC_resource.xml", "<Target name=\"\xC3\xA9\"><K>v</K></Target>");
    Scan();
    EXPECT_EQ(Text(u"\u00E9", u"TargetXMLPath"), "Targets\\QN\\FPGA\\{00E9}\\{20AC}_resource.xml");
    EXPECT_EQ(Text(u"\u00E9", u"TargetClass"), "COM.QN.FPGA.{00E9}");
}

}  // namespace
}  // namespace zkhw
