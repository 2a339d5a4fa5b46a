// What the exported queries ask the tree, and what they make of its results.

#include "library/ExportsTest.h"
#include "library/RecordingTree.h"

namespace zkhw {
namespace {

using Calls = std::vector<std::string>;

struct QueryCase {
    const char* base;
    const char* sub;
    const char* options;
    const char* asked;
};

const QueryCase queryCases[] = {
    {"base", "", "", "[base] [stripPathPrefix=base]"},
    {"base", "a/b", "", "[base/a/b] [stripPathPrefix=base]"},
    {"base", "/a/b", "", "[base/a/b] [stripPathPrefix=base]"},
    {"base", "//a", "", "[base//a] [stripPathPrefix=base]"},
    {"base", "/", "", "[base] [stripPathPrefix=base]"},
    {"base", "//", "", "[base//] [stripPathPrefix=base]"},
    {"base", "a/", "", "[base/a/] [stripPathPrefix=base]"},
    {"base", "", "x", "[base] [x,stripPathPrefix=base]"},
    {"base", "", "x,", "[base] [x,,stripPathPrefix=base]"},
    {"base", "", "recurse=true,protocol=T", "[base] [recurse=true,protocol=T,stripPathPrefix=base]"},
    {"a/b", "c", "", "[a\\/b/c] [stripPathPrefix=a/b]"},
    {"a/b", "", "", "[a/b] [stripPathPrefix=a/b]"},
    {"a/b", "/", "", "[a/b] [stripPathPrefix=a/b]"},
    {"/a", "c", "", "[\\/a/c] [stripPathPrefix=/a]"},
    {"/", "c", "", "[\\//c] [stripPathPrefix=/]"},
    {"/", "", "", "[/] [stripPathPrefix=/]"},
    {"a\\b", "c\\d", "", "[a\\\\b/c\\d] [stripPathPrefix=a\\b]"},
    {"a\\b", "", "", "[a\\b] [stripPathPrefix=a\\b]"},
    {"a,b=c", "d", "e=f", "[a,b=c/d] [e=f,stripPathPrefix=a,b=c]"},
    {"", "", "", "[] [stripPathPrefix=]"},
    {"", "a", "", "[/a] [stripPathPrefix=]"},
    {"", "/a", " ", "[/a] [ ,stripPathPrefix=]"},
    {"\xC3\x84", "\xF0\x9F\x98\x80", "\xE2\x82\xAC",
     "[\xC3\x84/\xF0\x9F\x98\x80] [\xE2\x82\xAC,stripPathPrefix=\xC3\x84]"},
};

class TreeQuery : public ExportsTest {
  protected:
    void ExpectAsked(const QueryCase& query) {
        tree.asked.clear();
        const HostText value;
        HostTexts list;
        FPGAResTree_GetProperty(query.base, query.sub, query.options, value.Get(), &found);
        FPGAResTree_GetDescendantNames(query.base, query.sub, query.options, &list.array, &found);
        FPGAResTree_GetMultipleProperties(query.base, query.sub, query.options, &list.array, &found);
        const std::string asked(query.asked);
        EXPECT_EQ(tree.asked,
                  (Calls{"GetProperty " + asked, "GetDescendantNames " + asked, "GetMultipleProperties " + asked}));
    }

    RecordingTree tree;
    unsigned char found = 0xAA;
};

TEST_F(TreeQuery, PathAndOptionsReachTheTreeInOneForm) {
    for (const QueryCase& query : queryCases) {
        ExpectAsked(query);
    }
}

// Windows puts its default character in the place of what is no text.
TEST_F(TreeQuery, BytesThatAreNoUtf8ReachTheTreeAsOnlyLinuxKeepsBytes) {
    ExpectAsked({"base", "\x80", "\xFF", "[base/\x80] [\xFF,stripPathPrefix=base]"});
}

TEST_F(TreeQuery, NullTextsCountAsEmpty) {
    const HostText value;
    EXPECT_EQ(FPGAResTree_GetProperty(nullptr, nullptr, nullptr, value.Get(), &found), S_OK);
    EXPECT_EQ(tree.asked, Calls{"GetProperty [] [stripPathPrefix=]"});
}

TEST_F(TreeQuery, PropertyIsStoredAndFound) {
    tree.texts = {u"\u00C4 value"};
    const HostText value("before");
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", value.Get(), &found), S_OK);
    EXPECT_EQ(value.Bytes(), "\xC3\x84 value");
    EXPECT_EQ(found, 1);
}

TEST_F(TreeQuery, MissIsNoFailureAndStoresTheEmptyString) {
    tree.result = S_FALSE;
    // Not looked at, but freed.
    tree.texts = {u"left over"};
    const HostText value("before");
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", value.Get(), &found), S_OK);
    EXPECT_EQ(value.Bytes(), "");
    EXPECT_EQ(found, 0);
}

TEST_F(TreeQuery, OtherSuccessOfAPropertyCountsAsFound) {
    tree.result = 2;
    tree.texts = {u"value"};
    const HostText value("before");
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", value.Get(), &found), S_OK);
    EXPECT_EQ(value.Bytes(), "value");
    EXPECT_EQ(found, 1);
}

TEST_F(TreeQuery, NullTextOfAPropertyIsTheEmptyString) {
    const HostText value("before");
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", value.Get(), &found), S_OK);
    EXPECT_EQ(value.Bytes(), "");
    EXPECT_EQ(found, 1);
}

TEST_F(TreeQuery, FailureIsHandedOnAndStoresNothing) {
    tree.result = static_cast<HRESULT>(0x80070057U);
    const HostText value("before");
    HostTexts list;
    list.Make({"before"});
    TakeCalls();
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", value.Get(), &found), tree.result);
    EXPECT_EQ(FPGAResTree_GetDescendantNames("a", "b", "", &list.array, &found), tree.result);
    EXPECT_EQ(FPGAResTree_GetMultipleProperties("a", "b", "", &list.array, &found), tree.result);
    EXPECT_EQ(TakeCalls(), Calls{});
    EXPECT_EQ(value.Bytes(), "before");
    EXPECT_EQ(list.Texts(), Calls{"before"});
    EXPECT_EQ(found, 0xAA);
}

TEST_F(TreeQuery, ErrorWhileAPropertyIsStoredLeavesTheFunction) {
    tree.texts = {u"value"};
    host.errorTexts[9] = "words";
    const HostText value("before");
    host.Fail("HostResizeArray", 9);
    EXPECT_EQ(ErrorOf([&] { FPGAResTree_GetProperty("a", "b", "", value.Get(), &found); }),
              "9 | Error Code: 9 (00000009): words");
    EXPECT_EQ(value.Bytes(), "before");
    EXPECT_EQ(found, 1);
}

TEST_F(TreeQuery, ListIsStoredAndFound) {
    tree.texts = {u"x", u"\u20AC", u""};
    HostTexts list;
    EXPECT_EQ(FPGAResTree_GetDescendantNames("a", "b", "", &list.array, &found), S_OK);
    EXPECT_EQ(list.Texts(), (Calls{"x", "\xE2\x82\xAC", ""}));
    EXPECT_EQ(found, 1);
}

TEST_F(TreeQuery, MissOfAListEmptiesTheArray) {
    tree.result = S_FALSE;
    HostTexts list;
    list.Make({"p", "q"});
    EXPECT_EQ(FPGAResTree_GetMultipleProperties("a", "b", "", &list.array, &found), S_OK);
    EXPECT_EQ(list.Texts(), Calls{});
    EXPECT_NE(list.array, nullptr);
    EXPECT_EQ(found, 0);
}

TEST_F(TreeQuery, NullTextInAListIsTheEmptyString) {
    tree.texts = {u"x", u"y"};
    tree.givesNullText = true;
    HostTexts list;
    EXPECT_EQ(FPGAResTree_GetDescendantNames("a", "b", "", &list.array, &found), S_OK);
    EXPECT_EQ(list.Texts(), (Calls{"", ""}));
}

TEST_F(TreeQuery, WhereNothingIsToBeStoredNothingIs) {
    tree.texts = {u"x"};
    TakeCalls();
    EXPECT_EQ(FPGAResTree_GetProperty("a", "b", "", nullptr, nullptr), S_OK);
    EXPECT_EQ(TakeCalls(), Calls{});
    EXPECT_EQ(FPGAResTree_GetDescendantNames("a", "b", "", nullptr, &found), E_POINTER);
    EXPECT_EQ(FPGAResTree_GetMultipleProperties("a", "b", "", nullptr, &found), E_POINTER);
    EXPECT_EQ(found, 0xAA);
}

}  // namespace
}  // namespace zkhw
