#include "interfaces/QueryOptions.h"

#include <string>

#include <gtest/gtest.h>

#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

// Only what differs from the defaults.
std::string Show(const QueryOptions& options) {
    std::string text;
    const auto add = [&](const char* name, const String& value) {
        if (!value.IsEmpty()) {
            text += std::string(name) + "<" + ExactText(value) + ">";
        }
    };
    const auto addFlag = [&](const char* name, bool value) { text += value ? std::string(name) + " " : ""; };
    addFlag("recurse", options.recurse);
    addFlag("path", options.includePath);
    addFlag("aliases", options.includeAliases);
    addFlag("displays", options.includeDisplayNames);
    add("protocol", options.protocol);
    add("strip", options.stripPathPrefix);
    add("exclusion", options.exclusionProperty);
    return text;
}

std::string Parse(const char16_t* text, QueryKeys keys = QueryKeys::All) {
    return Show(ParseQueryOptions(text, keys));
}

struct Row {
    const char16_t* text;
    const char* options;
};

void ExpectRows(std::initializer_list<Row> rows) {
    for (const Row& row : rows) {
        EXPECT_EQ(Parse(row.text), row.options) << ExactText(std::u16string_view(row.text));
    }
}

TEST(QueryOptionsTest, AnEmptyTextLeavesTheDefaults) {
    EXPECT_EQ(Parse(u""), "");
    EXPECT_EQ(Show(ParseQueryOptions({}, QueryKeys::All)), "");
}

TEST(QueryOptionsTest, EachKeyHasItsField) {
    ExpectRows({{u"protocol=Foo", "protocol<Foo>"},
                {u"recurse=true", "recurse "},
                {u"stripPathPrefix=/a", "path strip</a>"},
                {u"exclusionProperty=Hidden", "exclusion<Hidden>"},
                {u"includePath=true", "path "},
                {u"includeAliases=true", "aliases "},
                {u"includeDisplayNames=true", "displays "}});
}

TEST(QueryOptionsTest, BlanksAndLetterCaseDontMatter) {
    ExpectRows({{u"recurse = TRUE , protocol = Foo", "recurse protocol<Foo>"},
                {u" \t\r\nRECURSE\t=\r\nTrue\n,\tPROTOCOL = a b ", "recurse protocol<a b>"},
                {u"StRiPpAtHpReFiX=X", "path strip<X>"}});
}

TEST(QueryOptionsTest, OnlyTheWordTrueIsTrue) {
    ExpectRows({{u"recurse=yes", ""},
                {u"recurse=1", ""},
                {u"recurse=on", ""},
                {u"recurse=enable", ""},
                {u"recurse=", ""},
                {u"recurse=truee", ""},
                {u"recurse=true,recurse=yes", ""},
                {u"includePath=true,includePath=on", ""},
                {u"includeAliases=true,includeAliases=1", ""}});
}

TEST(QueryOptionsTest, AnItemOfAnotherFormDoesNothing) {
    ExpectRows({{u"recurse", ""},
                {u"a=b=c", ""},
                {u"protocol=x=y", ""},
                {u"recurse=true=true", ""},
                {u"recurse=true=", ""},
                {u"=", ""},
                {u"=true", ""},
                {u",,recurse=true,,", "recurse "},
                {u"recurse,recurse=true", "recurse "},
                {u"recurs=true", ""},
                {u"recursee=true", ""},
                {u"rec urse=true", ""},
                {u"unknown=true,recurse=true", "recurse "}});
}

TEST(QueryOptionsTest, TheLaterOfTwoItemsCounts) {
    ExpectRows({{u"protocol=a,protocol=b", "protocol<b>"},
                {u"protocol=a,PROTOCOL=", ""},
                {u"recurse=false,recurse=true", "recurse "},
                {u"stripPathPrefix=a,stripPathPrefix=b", "path strip<b>"},
                {u"protocol=a,protocol=b=c", "protocol<a>"}});
}

TEST(QueryOptionsTest, SeparatorsInAValueHaveABackslashInFront) {
    ExpectRows({{u"protocol=a\\,b", "protocol<a,b>"},
                {u"protocol=a\\=b", "protocol<a=b>"},
                {u"protocol=\\,\\=", "protocol<,=>"},
                {u"protocol=a\\=b=c", ""},
                {u"protocol=a\\,recurse\\=true", "protocol<a,recurse=true>"}});
}

TEST(QueryOptionsTest, BackslashesAreReadForTheListAndForTheItem) {
    ExpectRows({// A single one before anything else stays.
                {u"protocol=a\\b", "protocol<a\\b>"},
                {u"protocol=a\\", "protocol<a\\>"},
                // Two are one for the list, and that one stays.
                {u"protocol=a\\\\b", "protocol<a\\b>"},
                // Two before a comma: one backslash, and the comma parts.
                {u"protocol=a\\\\,recurse=true", "recurse protocol<a\\>"},
                // Two before "=": the list leaves one, which escapes it.
                {u"protocol=a\\\\=b", "protocol<a=b>"},
                // Four are two for the list, and one for the item.
                {u"protocol=a\\\\\\\\b", "protocol<a\\b>"},
                {u"protocol=a\\\\\\\\=b", ""},
                {u"protocol=a\\\\\\,b", "protocol<a\\,b>"},
                {u"protocol=a\\\\\\\\\\,b", "protocol<a\\,b>"},
                {u"protocol=a\\\\\\\\\\=b", "protocol<a\\=b>"}});
}

TEST(QueryOptionsTest, APrefixSwitchesPathsOnUnlessTheyWereNamedBefore) {
    ExpectRows({{u"includePath=false,stripPathPrefix=x", "strip<x>"},
                {u"stripPathPrefix=x,includePath=false", "strip<x>"},
                {u"includePath=no,stripPathPrefix=x", "strip<x>"},
                {u"includePath=true,stripPathPrefix=x", "path strip<x>"},
                {u"stripPathPrefix=x,includePath=false,stripPathPrefix=y", "strip<y>"},
                {u"includePath,stripPathPrefix=x", "path strip<x>"},
                {u"stripPathPrefix=", "path "},
                {u"stripPathPrefix", ""}});
}

TEST(QueryOptionsTest, QueriesOfPropertiesPassOverTheKeysOfAliases) {
    EXPECT_EQ(Parse(u"includeAliases=true,includeDisplayNames=true,recurse=true", QueryKeys::WithoutAliases),
              "recurse ");
}

TEST(QueryOptionsTest, APrefixIsCutWithoutALook) {
    const auto strip = [](const char16_t* name, const char16_t* prefix, bool includePath) {
        return ExactText(StripPathPrefix(name, String(prefix), includePath));
    };
    EXPECT_EQ(strip(u"/a/b", u"/a", true), "b");
    EXPECT_EQ(strip(u"/a/b", u"xx", true), "b");
    EXPECT_EQ(strip(u"name", u"xx", false), "me");
    EXPECT_EQ(strip(u"name", u"xxxx", false), "");
    EXPECT_EQ(strip(u"name", u"xxx", true), "");
    EXPECT_EQ(strip(u"name", u"longer than that", true), "");
    EXPECT_EQ(strip(u"", u"", true), "");
}

}  // namespace
}  // namespace zkhw
