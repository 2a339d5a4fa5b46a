#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "restree/TypeTable.h"
#include "support/ExactText.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

// The bases of a type in order, with blanks between them; "?" for a type without a record.
std::string Bases(const TypeTable& table, const char16_t* type) {
    const TypeRecord* record = table.Find(type);
    if (record == nullptr) {
        return "?";
    }
    std::string text;
    for (const TypeRecord* base : record->bases) {
        text += (text.empty() ? "" : " ") + ExactText(base->name);
    }
    return text;
}

std::string Protocols(ResTreeNode& node) {
    std::vector<String> list;
    node.GetProtocols(list);
    std::string text;
    for (const String& protocol : list) {
        text += "<" + ExactText(protocol) + ">";
    }
    return text;
}

// --- TypeTable ---

TEST(TypeTable, RelationWithoutABaseMakesTheType) {
    TypeTable table;
    table.AddTypeRelation(u"A", u"");
    EXPECT_EQ(Bases(table, u"A"), "");
}

TEST(TypeTable, BasesStayInTheOrderOfTheirAddition) {
    TypeTable table;
    table.AddTypeRelation(u"Z", u"");
    table.AddTypeRelation(u"A", u"");
    table.AddTypeRelation(u"T", u"Z");
    table.AddTypeRelation(u"T", u"A");
    table.AddTypeRelation(u"T", u"Z");
    EXPECT_EQ(Bases(table, u"T"), "Z A Z");
}

TEST(TypeTable, BaseThatIsNoTypeYetIsDropped) {
    TypeTable table;
    table.AddTypeRelation(u"T", u"Later");
    table.AddTypeRelation(u"Later", u"");
    EXPECT_EQ(Bases(table, u"T"), "");
    EXPECT_EQ(Bases(table, u"Later"), "");
}

TEST(TypeTable, NamesAreBlindToCase) {
    TypeTable table;
    table.AddTypeRelation(u"Base", u"");
    table.AddTypeRelation(u"type", u"BASE");
    table.AddTypeRelation(u"TYPE", u"");
    EXPECT_EQ(Bases(table, u"Type"), "Base");
    EXPECT_EQ(ExactText(table.Find(u"TYPE")->name), "type");
}

// A soft hyphen counts for nothing, a letter of another width for the letter.
TEST(TypeTable, NamesOutsideAsciiAreFoundByTheLanguage) {
    TypeTable table;
    table.AddTypeRelation(u"Base", u"");
    table.AddTypeRelation(u"Plain", u"Base");
    table.AddTypeRelation(u"\u00C9tude", u"Base");
    EXPECT_EQ(Bases(table, u"Pla\u00ADin"), "Base");
    EXPECT_EQ(Bases(table, u"\u00E9tude"), "Base");
    EXPECT_EQ(Bases(table, u"\u00E9tud\u00E9"), "?");
}

TEST(TypeTable, UnknownTypeHasNoRecord) {
    const TypeTable table;
    EXPECT_EQ(table.Find(u"A"), nullptr);
    EXPECT_EQ(table.Find(u""), nullptr);
}

TEST(TypeTable, RootStartsWithTheBuiltInRelations) {
    const ResTreeNode root(u"", u"", false);
    const TypeTable& table = *root.GetTypeTable();
    EXPECT_EQ(Bases(table, u"Resource"), "");
    EXPECT_EQ(Bases(table, u"IOResource"), "Resource");
    EXPECT_EQ(Bases(table, u"ResourceList"), "");
    EXPECT_EQ(Bases(table, u"Target"), "ResourceList");
    EXPECT_EQ(Bases(table, u"Connector"), "ResourceList");
    EXPECT_EQ(Bases(table, u"Module"), "Resource ResourceList");
    EXPECT_EQ(Bases(table, u"ProviderResourceTreeRoot"), "?");
}

TEST(TypeTable, CopyStandsAlone) {
    const ResTreeNode root(u"", u"", false);
    const std::unique_ptr<TypeTable> copy = root.GetTypeTable()->Copy();
    copy->AddTypeRelation(u"New", u"Target");
    EXPECT_EQ(root.GetTypeTable()->Find(u"New"), nullptr);
    EXPECT_NE(copy->Find(u"Target"), root.GetTypeTable()->Find(u"Target"));
    EXPECT_EQ(copy->Find(u"Target")->bases[0], copy->Find(u"ResourceList"));
    EXPECT_EQ(Bases(*copy, u"Module"), "Resource ResourceList");
    EXPECT_EQ(Bases(*copy, u"New"), "Target");
}

TEST(TypeTable, CopiesStandAloneFromEachOther) {
    TypeTable table;
    table.AddTypeRelation(u"Z", u"");
    table.AddTypeRelation(u"M", u"Z");
    table.AddTypeRelation(u"A", u"M");
    const std::unique_ptr<TypeTable> first = table.Copy();
    const std::unique_ptr<TypeTable> second = table.Copy();
    first->AddTypeRelation(u"A", u"Z");
    EXPECT_EQ(Bases(*first, u"A"), "M Z");
    // The change keeps what the copy had.
    EXPECT_EQ(Bases(*first, u"M"), "Z Z");
    EXPECT_EQ(first->Find(u"A")->bases[0], first->Find(u"M"));
    EXPECT_EQ(Bases(*second, u"A"), "M");
    EXPECT_EQ(Bases(table, u"A"), "M");
}

TEST(TypeTable, CopyKnowsNothingOfLaterRelations) {
    TypeTable table;
    table.AddTypeRelation(u"Z", u"");
    const std::unique_ptr<TypeTable> before = table.Copy();
    table.AddTypeRelation(u"A", u"Z");
    const std::unique_ptr<TypeTable> after = table.Copy();
    EXPECT_EQ(before->Find(u"A"), nullptr);
    EXPECT_EQ(Bases(*after, u"A"), "Z");
}

TEST(TypeTable, CopyOutlivesTheTable) {
    auto table = std::make_unique<TypeTable>();
    table->AddTypeRelation(u"Z", u"");
    table->AddTypeRelation(u"A", u"Z");
    const std::unique_ptr<TypeTable> copy = table->Copy();
    table.reset();
    EXPECT_EQ(Bases(*copy, u"A"), "Z");
    EXPECT_TRUE(copy->Find(u"A")->IsA(u"Z"));
}

TEST(TypeTable, CopyOfACopyHasTheSameRelations) {
    TypeTable table;
    table.AddTypeRelation(u"Z", u"");
    table.AddTypeRelation(u"A", u"Z");
    const std::unique_ptr<TypeTable> copy = table.Copy()->Copy();
    EXPECT_EQ(Bases(*copy, u"A"), "Z");
}

TEST(TypeTable, CopyOfAnEmptyTableIsEmptyAndCanGrow) {
    const TypeTable table;
    const std::unique_ptr<TypeTable> copy = table.Copy();
    EXPECT_EQ(copy->Find(u"A"), nullptr);
    copy->AddTypeRelation(u"A", u"");
    EXPECT_EQ(Bases(*copy, u"A"), "");
    EXPECT_EQ(table.Find(u"A"), nullptr);
}

TEST(TypeTable, CopyHasTypesWhoseBasesComeLaterInTheTable) {
    TypeTable table;
    table.AddTypeRelation(u"Z", u"");
    table.AddTypeRelation(u"M", u"Z");
    table.AddTypeRelation(u"A", u"M");
    const std::unique_ptr<TypeTable> copy = table.Copy();
    EXPECT_EQ(Bases(*copy, u"A"), "M");
    EXPECT_EQ(Bases(*copy, u"Z"), "");
    // Copied for "A" and once more in its own turn: the base stands twice, which changes no answer.
    EXPECT_EQ(Bases(*copy, u"M"), "Z Z");
    EXPECT_TRUE(copy->Find(u"A")->IsA(u"Z"));
}

TEST(TypeRecord, IsAListTypeByItsNameInAnyCase) {
    TypeTable table;
    for (const char16_t* name : {u"List", u"ResourceLIST", u"mylist"}) {
        table.AddTypeRelation(name, u"");
        EXPECT_TRUE(table.Find(name)->IsListType());
    }
    for (const char16_t* name : {u"Lis", u"ListOf", u"", u"L ist"}) {
        table.AddTypeRelation(name, u"");
        EXPECT_FALSE(table.Find(name)->IsListType());
    }
}

TEST(TypeRecord, IsAListTypeByABaseAtAnyDistance) {
    TypeTable table;
    table.AddTypeRelation(u"SomeList", u"");
    table.AddTypeRelation(u"Plain", u"");
    table.AddTypeRelation(u"Near", u"Plain");
    table.AddTypeRelation(u"Near", u"SomeList");
    table.AddTypeRelation(u"Far", u"Near");
    EXPECT_TRUE(table.Find(u"Near")->IsListType());
    EXPECT_TRUE(table.Find(u"Far")->IsListType());
    EXPECT_FALSE(table.Find(u"Plain")->IsListType());
}

TEST(TypeRecord, BuiltInListTypesAreThoseBasedOnResourceList) {
    const ResTreeNode root(u"", u"", false);
    const TypeTable& table = *root.GetTypeTable();
    EXPECT_TRUE(table.Find(u"ResourceList")->IsListType());
    EXPECT_TRUE(table.Find(u"Target")->IsListType());
    EXPECT_TRUE(table.Find(u"Connector")->IsListType());
    EXPECT_TRUE(table.Find(u"Module")->IsListType());
    EXPECT_FALSE(table.Find(u"Resource")->IsListType());
    EXPECT_FALSE(table.Find(u"IOResource")->IsListType());
}

// --- IsA ---

TEST(IsA, ModuleIsAResourceListButNoIOResource) {
    const auto root = MakeRootNode();
    const ResTreeNode* module = AddChild(*root, u"m", u"Module");
    EXPECT_TRUE(module->IsA(u"ResourceList"));
    EXPECT_TRUE(module->IsA(u"Resource"));
    EXPECT_TRUE(module->IsA(u"module"));
    EXPECT_FALSE(module->IsA(u"IOResource"));
    EXPECT_FALSE(module->IsA(u"Target"));
}

TEST(IsA, TypeOfNoRelationIsItselfAndNothingElse) {
    const auto root = MakeRootNode();
    const ResTreeNode* node = AddChild(*root, u"n", u"Strange");
    EXPECT_TRUE(node->IsA(u"STRANGE"));
    EXPECT_FALSE(node->IsA(u"Resource"));
    EXPECT_FALSE(node->IsA(u""));
}

TEST(IsA, EmptyTypeIsAnEmptyType) {
    const ResTreeNode node(u"n", u"", false, noTable);
    EXPECT_TRUE(node.IsA(u""));
}

TEST(IsA, TypesAreBlindToCaseAtAnyDistance) {
    const auto root = MakeRootNode();
    root->GetTypeTable()->AddTypeRelation(u"Special", u"Module");
    const ResTreeNode* node = AddChild(*root, u"n", u"SPECIAL");
    EXPECT_TRUE(node->IsA(u"resourcelist"));
    EXPECT_TRUE(node->IsA(u"mODULE"));
}

TEST(IsA, WithoutATableOnTheWayUpOnlyTheOwnTypeCounts) {
    ResTreeNode detached(u"d", u"Module", false, noTable);
    const ResTreeNode* child = AddChild(detached, u"c", u"Target");
    EXPECT_TRUE(child->IsA(u"Target"));
    EXPECT_FALSE(child->IsA(u"ResourceList"));
}

TEST(IsA, NearestTableAloneIsAsked) {
    const auto root = MakeRootNode();
    root->GetTypeTable()->AddTypeRelation(u"Outer", u"Target");
    ResTreeNode* branch = AddChild(*root, u"b");
    branch->MakeTypeTableLocal();
    root->GetTypeTable()->AddTypeRelation(u"Later", u"Target");
    EXPECT_TRUE(AddChild(*branch, u"o", u"Outer")->IsA(u"Target"));
    EXPECT_FALSE(AddChild(*branch, u"l", u"Later")->IsA(u"Target"));
    EXPECT_TRUE(AddChild(*root, u"l", u"Later")->IsA(u"Target"));
}

TEST(MakeTypeTableLocal, RelationsStayInTheSubtree) {
    const auto root = MakeRootNode();
    ResTreeNode* branch = AddChild(*root, u"b");
    ResTreeNode* other = AddChild(*root, u"o");
    branch->MakeTypeTableLocal();
    ASSERT_NE(branch->GetTypeTable(), nullptr);
    branch->GetTypeTable()->AddTypeRelation(u"Mine", u"Target");
    EXPECT_TRUE(AddChild(*branch, u"x", u"Mine")->IsA(u"ResourceList"));
    EXPECT_FALSE(AddChild(*other, u"x", u"Mine")->IsA(u"ResourceList"));
}

TEST(MakeTypeTableLocal, OwnTableStays) {
    const auto root = MakeRootNode();
    const TypeTable* before = root->GetTypeTable();
    root->MakeTypeTableLocal();
    EXPECT_EQ(root->GetTypeTable(), before);
}

TEST(MakeTypeTableLocal, WithoutATableOnTheWayUpNothingIsMade) {
    ResTreeNode detached(u"d", u"T", false, noTable);
    ResTreeNode* child = AddChild(detached, u"c");
    child->MakeTypeTableLocal();
    EXPECT_EQ(child->GetTypeTable(), nullptr);
}

// --- Supports ---

TEST(Supports, EmptyTextIsAlwaysSupported) {
    const auto root = MakeRootNode();
    EXPECT_TRUE(root->Supports(u""));
}

TEST(Supports, TypeIsSupportedBlindToCase) {
    const auto root = MakeRootNode();
    ResTreeNode* module = AddChild(*root, u"m", u"Module");
    EXPECT_TRUE(module->Supports(u"RESOURCE"));
    EXPECT_FALSE(module->Supports(u"Foo"));
}

struct SupportsCase {
    const char16_t* protocols;
    const char16_t* text;
    bool expected;
};

TEST(Supports, WholePiecesOfTheListCountLetterByLetter) {
    constexpr SupportsCase cases[] = {
        {u"Foobar,Foo", u"Foo", true},
        {u"Foobar, Foo", u"Foo", false},
        {u"Foobar, Foo", u" Foo", true},
        {u"Foo", u"Foo", true},
        {u"Foo", u"foo", false},
        {u"Foo,Bar", u"Foo", true},
        {u"Bar,Foo,Baz", u"Foo", true},
        {u"Bar,Foo ,Baz", u"Foo", false},
        {u"FooFoo,Foo", u"Foo", true},
        {u"FooFoo", u"Foo", false},
        {u"", u"Foo", false},
        {u"A,B,C", u"A,B", true},
        {u"A,B,C", u"B,C", true},
        {u"xA,B,C", u"A,B", false},
        {u"aa,aaa", u"aa", true},
        {u"aaa,aa", u"aa", true},
        {u"Foo,", u"Foo", true},
        {u",Foo", u"Foo", true},
        // The search knows no escapes: the comma behind the backslash is one.
        {u"a\\,Foo", u"Foo", true},
    };
    for (const SupportsCase& row : cases) {
        const auto root = MakeRootNode();
        AddText(*root, u"Protocols", row.protocols);
        EXPECT_EQ(root->Supports(row.text), row.expected)
            << '"' << ExactText(std::u16string_view(row.protocols)) << "\" supports \""
            << ExactText(std::u16string_view(row.text)) << '"';
    }
}

TEST(Supports, LocalizedListCounts) {
    const auto root = MakeRootNode();
    AddText(*root, u"Protocols", u"Foo", LocalizedTextEntry);
    EXPECT_TRUE(root->Supports(u"Foo"));
}

TEST(Supports, ProtocolsThatAreNoTextDoNotCount) {
    const auto root = MakeRootNode();
    AddLink(*root, u"Protocols", u"Foo");
    EXPECT_FALSE(root->Supports(u"Foo"));
    ResTreeNode* child = AddChild(*root, u"c");
    AddChild(*child, u"Protocols", u"Foo");
    EXPECT_FALSE(child->Supports(u"Foo"));
}

// --- GetProtocols ---

TEST(GetProtocols, TypeThenBasesThenTheTrimmedList) {
    const auto root = MakeRootNode();
    root->GetTypeTable()->AddTypeRelation(u"Special", u"Module");
    root->GetTypeTable()->AddTypeRelation(u"Special", u"Connector");
    ResTreeNode* node = AddChild(*root, u"n", u"special");
    AddText(*node, u"Protocols", u" P1 ,, a\\,b ");
    EXPECT_EQ(Protocols(*node), "<special><Module><Resource><ResourceList><Connector><ResourceList><P1><><a,b>");
}

TEST(GetProtocols, UnknownTypeHasNoBases) {
    const auto root = MakeRootNode();
    ResTreeNode* node = AddChild(*root, u"n", u"Strange");
    EXPECT_EQ(Protocols(*node), "<Strange>");
}

TEST(GetProtocols, WithoutATableThereAreNoBases) {
    ResTreeNode node(u"n", u"Module", false, noTable);
    AddText(node, u"Protocols", u"");
    EXPECT_EQ(Protocols(node), "<Module>");
}

TEST(GetProtocols, ListIsAppendedTo) {
    const auto root = MakeRootNode();
    std::vector<String> list = {String(u"before")};
    root->GetProtocols(list);
    ASSERT_EQ(list.size(), 2u);
    EXPECT_EQ(ExactText(list[0]), "before");
    EXPECT_EQ(ExactText(list[1]), "Root");
}

TEST(GetProtocols, ProtocolsThatAreNoTextDoNotCount) {
    const auto root = MakeRootNode();
    AddLink(*root, u"Protocols", u"Foo");
    EXPECT_EQ(Protocols(*root), "<Root>");
}

}  // namespace
}  // namespace zkhw
