// A node as XML text, whole and filtered.

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "interfaces/support/NodeViewTest.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

class NodeXml : public NodeViewTest {
  protected:
    static std::string Xml(const NodeView& view) {
        return GivenText([&](BSTR* xml) { return view->GetXml(xml); });
    }
    using Names = std::vector<const char16_t*>;
    static std::string Filtered(const NodeView& view, bool keep, const Names& nodes, const Names& properties) {
        std::vector<LPCWSTR> nodeNames(nodes.size());
        std::vector<LPCWSTR> propertyNames(properties.size());
        std::transform(nodes.begin(), nodes.end(), nodeNames.begin(), In);
        std::transform(properties.begin(), properties.end(), propertyNames.begin(), In);
        return GivenText([&](BSTR* xml) {
            return view->GetFilteredXmlEx(keep ? 1 : 0, static_cast<ULONG>(nodes.size()), nodeNames.data(),
                                          static_cast<ULONG>(properties.size()), propertyNames.data(), xml);
        });
    }
};

TEST_F(NodeXml, GetXmlWritesTheNodeWithoutAnIndent) {
    ResTreeNode* const a = AddChild(*root, u"a<b", u"Clock", true);
    AddText(*a, u"K", u"1 & 2");
    AddChild(*a, u"Clock", u"Clock");
    EXPECT_EQ(Xml(View(*a)),
              "S_OK \n<Clock name=\"a&lt;b\" ordered=\"true\">"
              "\n   <K>1 &amp; 2</K>"
              "\n   <Clock>"
              "\n   </Clock>"
              "\n</Clock>");
}

TEST_F(NodeXml, GetXmlEndsAtANulInsideTheText) {
    ResTreeNode* const a = AddChild(*root, u"A");
    // A localised text that ends in its NUL is written whole.
    a->AddTextEntry(u"L", std::u16string_view(u"x\0", 2), LocalizedTextEntry);
    EXPECT_EQ(Xml(View(*a)), "S_OK \n<T name=\"A\">\n   <L localize=\"true\">x");
}

TEST_F(NodeXml, GetXmlOfALocalisedTextWritesItsLanguages) {
    ResTreeNode* const a = AddChild(*root, u"A");
    a->AddTextEntry(u"L", std::u16string_view(u"x\0eng=x,jpn=y", 13), LocalizedTextEntry);
    EXPECT_EQ(Xml(View(*a)), "S_OK \n<T name=\"A\">\n   <L localize=\"true\">eng=x,jpn=y</L>\n</T>");
}

// N(T), ordered: P=1, child "A" of type "U" with P=2, Q=3 and a child "B" of type "V" with P=4; link L; localised Loc.
class NodeFilteredXml : public NodeXml {
  protected:
    NodeFilteredXml() {
        AddText(*n, u"P", u"1");
        ResTreeNode* const a = AddChild(*n, u"A", u"U", true);
        AddText(*a, u"P", u"2");
        AddText(*a, u"Q", u"3");
        AddText(*AddChild(*a, u"B", u"V"), u"P", u"4");
        AddLink(*n, u"L", u"A");
        AddText(*n, u"Loc", u"x", LocalizedTextEntry);
        view = View(*n);
        before = DumpTree(*root);
    }
    // The node itself stays as it was.
    ~NodeFilteredXml() override { EXPECT_EQ(DumpTree(*root), before); }

    ResTreeNode* n = AddChild(*root, u"N", u"T", true);
    NodeView view;
    std::string before;

    static constexpr const char* nothing = "S_OK \n<T name=\"N\" ordered=\"true\">\n</T>";
};

TEST_F(NodeFilteredXml, KeepingNothingDropsAllEntriesAndLinksToo) {
    EXPECT_EQ(Filtered(view, true, {}, {}), nothing);
    EXPECT_EQ(Filtered(view, true, {u"L"}, {u"L"}), nothing);
}

TEST_F(NodeFilteredXml, KeepingPropertiesAloneDropsAllChildren) {
    EXPECT_EQ(Filtered(view, true, {}, {u"p", u"q"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <P>1</P>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, KeepingALocalisedProperty) {
    EXPECT_EQ(Filtered(view, true, {}, {u"LOC"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <Loc localize=\"true\">x</Loc>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, KeepingANodeByItsKeyFiltersItInTurn) {
    EXPECT_EQ(Filtered(view, true, {u"a"}, {}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n   </U>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, KeepingNodesByTheirTypesOnEveryLevel) {
    EXPECT_EQ(Filtered(view, true, {u"u", u"v"}, {u"P"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <P>1</P>"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n      <P>2</P>"
              "\n      <V name=\"B\">"
              "\n         <P>4</P>"
              "\n      </V>"
              "\n   </U>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, ADeepNodeIsKeptOnlyIfAllAboveAreNamed) {
    EXPECT_EQ(Filtered(view, true, {u"B"}, {}), nothing);
}

TEST_F(NodeFilteredXml, NodeNamesNameNoPropertiesAndPropertyNamesNoNodes) {
    EXPECT_EQ(Filtered(view, true, {u"P"}, {u"A", u"U"}), nothing);
}

TEST_F(NodeFilteredXml, DroppingNothingIsTheWholeText) {
    EXPECT_EQ(Filtered(view, false, {}, {}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <P>1</P>"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n      <P>2</P>"
              "\n      <Q>3</Q>"
              "\n      <V name=\"B\">"
              "\n         <P>4</P>"
              "\n      </V>"
              "\n   </U>"
              "\n   <:Link  name=\"L\">../N/A</:Link>"
              "\n   <Loc localize=\"true\">x</Loc>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, DroppingPropertiesTakesThemFromEveryLevel) {
    EXPECT_EQ(Filtered(view, false, {}, {u"p", u"loc", u"L"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n      <Q>3</Q>"
              "\n      <V name=\"B\">"
              "\n      </V>"
              "\n   </U>"
              "\n   <:Link  name=\"L\">../N/A</:Link>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, DroppingNodesByKeyOrTypeLeavesLinks) {
    EXPECT_EQ(Filtered(view, false, {u"v", u"L"}, {u"P", u"Q"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n   </U>"
              "\n   <:Link  name=\"L\">../N/A</:Link>"
              "\n   <Loc localize=\"true\">x</Loc>"
              "\n</T>");
    EXPECT_EQ(Filtered(view, false, {u"A"}, {u"P", u"Loc"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <:Link  name=\"L\">../N/A</:Link>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, EqualKeysAreAllRemoved) {
    AddText(*n, u"p", u"again");
    before = DumpTree(*root);
    EXPECT_EQ(Filtered(view, false, {u"A"}, {u"P", u"Loc"}),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <:Link  name=\"L\">../N/A</:Link>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, GetFilteredXmlKeeps) {
    LPCWSTR nodes[] = {In(u"U")};
    LPCWSTR properties[] = {In(u"Q"), nullptr};
    EXPECT_EQ(GivenText([&](BSTR* xml) { return view->GetFilteredXml(1, nodes, 2, properties, xml); }),
              "S_OK \n<T name=\"N\" ordered=\"true\">"
              "\n   <U name=\"A\" ordered=\"true\">"
              "\n      <Q>3</Q>"
              "\n   </U>"
              "\n</T>");
}

TEST_F(NodeFilteredXml, CountsMayBeZeroWithoutArrays) {
    EXPECT_EQ(GivenText([&](BSTR* xml) { return view->GetFilteredXml(0, nullptr, 0, nullptr, xml); }), nothing);
}

}  // namespace
}  // namespace zkhw
