#include "qn/dsc/osdep/FileFinder.h"

#include <cerrno>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

using Names = std::vector<std::string>;

// What is found in `folder`, without the folder's path.
Names Found(const TemporaryFolder& folder, const char16_t* pattern) {
    FileFinder finder;
    const std::string before = ExactText(folder.System(u""));
    Names names;
    for (const std::string& path : ExactTexts(finder.ListFiles(folder.System(pattern)))) {
        EXPECT_EQ(path.substr(0, before.size()), before);
        names.push_back(path.substr(before.size()));
    }
    return names;
}

void WriteFiles(const TemporaryFolder& folder, const Names& names) {
    for (const std::string& name : names) {
        folder.WriteFile(name, "");
    }
}

TEST(FileFinder, GivesTheFolderItselfAndItsParentFirst) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"!", "-", "a"});
    EXPECT_EQ(Found(folder, u"*"), (Names{".", "..", "!", "-", "a"}));
}

TEST(FileFinder, AnEmptyFolderHasNoOtherNames) {
    const TemporaryFolder folder;
    EXPECT_EQ(Found(folder, u"*"), (Names{".", ".."}));
    EXPECT_EQ(Found(folder, u"*resource.xml"), Names{});
}

TEST(FileFinder, OrdersNamesByTheirUpperCasedUnits) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"b", "_a", "B1", "a2", "A10", "ab", "Z", "a.b", "a b", "[", "^", "9"});
    EXPECT_EQ(Found(folder, u"*"),
              (Names{".", "..", "9", "a b", "a.b", "A10", "a2", "ab", "b", "B1", "Z", "[", "^", "_a"}));
}

// On Windows no two names of a folder differ in letter case alone.
TEST(FileFinder, NamesThatDifferInCaseAreOrderedByTheirUnitsAsOnlyLinuxTellsCaseApart) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"foo", "Foo", "FOO", "fOO", "fo"});
    EXPECT_EQ(Found(folder, u"f*"), (Names{"fo", "FOO", "Foo", "fOO", "foo"}));
}

TEST(FileFinder, OrdersOtherAlphabetsByTheirUpperCaseToo) {
    const TemporaryFolder folder;
    // e acute, E acute and o slashed, a pair, a Chinese character, U+E000 and U+FF21.
    WriteFiles(folder, {"\xC3\xA9", "\xC3\x89z", "\xC3\xB8", "\xF0\x9F\x98\x80", "\xE6\x97\xA5", "\xEE\x80\x80",
                        "\xEF\xBC\xA1", "z"});
    EXPECT_EQ(Found(folder, u"*"),
              (Names{".", "..", "z", "{00E9}", "{00C9}z", "{00F8}", "{65E5}", "{D83D}{DE00}", "{E000}", "{FF21}"}));
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST(FileFinder, OrdersBytesOutsideUtf8ByTheirUnitsAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    // A byte outside UTF-8, a pair, U+E000, and U+FF21 beside U+FF41, which differ in letter case.
    WriteFiles(folder, {"\xFF", "\xF0\x9F\x98\x80", "\xEE\x80\x80", "\xEF\xBC\xA1", "\xEF\xBD\x81", "z"});
    EXPECT_EQ(Found(folder, u"*"), (Names{".", "..", "z", "{D83D}{DE00}", "{DCFF}", "{E000}", "{FF21}", "{FF41}"}));
}

TEST(FileFinder, PatternsAreBlindToLetterCase) {
    const TemporaryFolder folder;
    WriteFiles(folder,
               {"A_Resource.XML", "resource.xml", "b_resource.xml", "resource_cache.xml", "c_resource.xml.bak"});
    folder.MakeFolder("d_RESOURCE.xml");
    EXPECT_EQ(Found(folder, u"*resource.xml"),
              (Names{"A_Resource.XML", "b_resource.xml", "d_RESOURCE.xml", "resource.xml"}));
    EXPECT_EQ(Found(folder, u"*RESOURCE.XML").size(), 4u);
}

TEST(FileFinder, AQuestionMarkIsOneUnit) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"a", "ab", "abc", "b"});
    EXPECT_EQ(Found(folder, u"?"), (Names{".", "a", "b"}));
    EXPECT_EQ(Found(folder, u"??"), (Names{"..", "ab"}));
    EXPECT_EQ(Found(folder, u"a?c"), (Names{"abc"}));
}

TEST(FileFinder, ANameWithoutWildcardsFindsThatName) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"Readme", "Readme2"});
    EXPECT_EQ(Found(folder, u"README"), (Names{"Readme"}));
    EXPECT_EQ(Found(folder, u"nope"), Names{});
}

TEST(FileFinder, SignsOfOtherPatternLanguagesStandForThemselves) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"[ab]", "a", "{b}"});
    EXPECT_EQ(Found(folder, u"[ab]"), (Names{"[ab]"}));
    EXPECT_EQ(Found(folder, u"{b}"), (Names{"{b}"}));
}

TEST(FileFinder, NativeNamesSurviveTheRoundTripAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    const Names names = {"a\\b", "\\", "\xFF", "\xC3",         "\xED\xA0\x80", "\xF0\x9F\x98\x80", "a:b", "*",
                         "?",    " ",  "\n",   "\xEF\x81\x9C", "..."};
    for (const std::string& name : names) {
        folder.WriteFile(name, "in " + name);
    }
    FileFinder finder;
    size_t files = 0;
    for (const String& path : finder.ListFiles(folder.System(u"*"))) {
        if (IsExistingFile(path)) {
            ++files;
        }
    }
    EXPECT_EQ(files, names.size());
}

TEST(FileFinder, ABackslashInANameIsAUnitOfItsOwnAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"a\\b"});
    EXPECT_EQ(Found(folder, u"a*"), (Names{"a{F05C}b"}));
    EXPECT_EQ(Found(folder, u"a?b"), (Names{"a{F05C}b"}));
}

TEST(FileFinder, APathKeepsTheFolderAsThePatternHasIt) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"Sub/x"});
    FileFinder finder;
    const String base = folder.System(u"sub\\.\\..\\SUB/");
    EXPECT_EQ(ExactTexts(finder.ListFiles(base + u"x")), (Names{ExactText(base) + "x"}));
}

TEST(FileFinder, ARelativePatternStartsAtTheWorkingFolder) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"Sub/x", "y"});
    const WorkingFolderScope scope(folder.Native());
    FileFinder finder;
    EXPECT_EQ(ExactTexts(finder.ListFiles(u"?")), (Names{".", "y"}));
    EXPECT_EQ(ExactTexts(finder.ListFiles(u"sub\\x")), (Names{"sub\\x"}));
    EXPECT_EQ(ExactTexts(finder.ListFiles(u"C:y*")), (Names{"C:y"}));
}

TEST(FileFinder, AWildcardInAFolderIsAnOrdinarySignAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"ab/x", "*/y"});
    EXPECT_EQ(Found(folder, u"?b\\x"), Names{});
    EXPECT_EQ(Found(folder, u"*\\?"), (Names{"*\\.", "*\\y"}));
}

// Wine doesn't show links that lead nowhere or in a circle.
TEST(FileFinder, FindsLinksWhereverTheyLeadAsOnlyLinuxHasDanglingLinks) {
    const TemporaryFolder folder;
    folder.MakeLink("nowhere", "dangling");
    folder.MakeLink(".", "self");
    EXPECT_EQ(Found(folder, u"*"), (Names{".", "..", "dangling", "self"}));
}

TEST(FileFinder, WhatIsNoFolderGivesAnEmptyList) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"file"});
    FileFinder finder;
    EXPECT_TRUE(finder.ListFiles(folder.System(u"nope\\*")).empty());
    EXPECT_TRUE(finder.ListFiles(folder.System(u"file\\*")).empty());
    EXPECT_TRUE(finder.ListFiles(u"D:\\*").empty());
    EXPECT_TRUE(finder.ListFiles(u"\\\\server\\share\\*").empty());
    EXPECT_TRUE(finder.ListFiles(u"").empty());
    EXPECT_TRUE(finder.ListFiles(folder.System(u"")).empty());
}

TEST(FileFinder, AnUnreadableFolderGivesAnEmptyList) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"file"});
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::BeginSearch, folder.System(u"*"), EACCES);
    FileFinder finder;
    EXPECT_TRUE(finder.ListFiles(folder.System(u"*")).empty());
    EXPECT_EQ(finder.ListFiles(folder.System(u"f*")).size(), 1u);
    EXPECT_EQ(files.OpenSearches(), 0);
}

TEST(FileFinder, ASearchThatBreaksOffGivesWhatItFound) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"a", "b", "c"});
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::NextName, 3, EIO);
    EXPECT_EQ(Found(folder, u"*"), (Names{".", "..", "a"}));
    EXPECT_EQ(files.OpenSearches(), 0);
}

TEST(FileFinder, OneFinderServesManySearches) {
    const TemporaryFolder folder;
    WriteFiles(folder, {"a", "b"});
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    FileFinder finder;
    for (int i = 0; i < 100; ++i) {
        EXPECT_EQ(finder.ListFiles(folder.System(u"?")).size(), 3u);
        EXPECT_EQ(files.OpenSearches(), 0);
    }
}

// Throws in the middle of a search.
class FailingSearch : public FaultyFileSystem {
  public:
    int NextName(SearchHandle search, String& name) override {
        if (failing) {
            throw std::bad_alloc();
        }
        return FaultyFileSystem::NextName(search, name);
    }

    bool failing = true;
};

TEST(FileFinder, ASearchLeftOpenIsClosedByTheNextOne) {
    const TemporaryFolder folder;
    FailingSearch files;
    const FileSystemScope scope(files);
    FileFinder finder;
    EXPECT_THROW(finder.ListFiles(folder.System(u"*")), std::bad_alloc);
    EXPECT_EQ(files.OpenSearches(), 1);
    files.failing = false;
    EXPECT_EQ(finder.ListFiles(folder.System(u"*")).size(), 2u);
    EXPECT_EQ(files.OpenSearches(), 0);
}

TEST(FileFinder, ASearchLeftOpenIsClosedByTheDestructor) {
    const TemporaryFolder folder;
    FailingSearch files;
    const FileSystemScope scope(files);
    {
        FileFinder finder;
        EXPECT_THROW(finder.ListFiles(folder.System(u"*")), std::bad_alloc);
        EXPECT_EQ(files.OpenSearches(), 1);
    }
    EXPECT_EQ(files.OpenSearches(), 0);
}

constexpr int manyNames = 5000;

// The name that was made as number `i`.
std::string MixedName(int i) {
    return "n" + std::to_string(1000000 + i * 7919 % manyNames);
}

void ExpectManyNamesInOrder(const TemporaryFolder& folder) {
    FileFinder finder;
    const std::vector<String> found = finder.ListFiles(folder.System(u"*"));
    ASSERT_EQ(found.size(), static_cast<size_t>(manyNames + 2));
    for (size_t i = 2; i < found.size(); ++i) {
        ASSERT_EQ(ExactText(GetFileName(found[i])), "n" + std::to_string(1000000 + i - 2));
        ASSERT_FALSE(IsDirectory(found[i]));
    }
}

TEST(FileFinder, ListsAFolderOfManyFilesInOrder) {
    const TemporaryFolder folder;
    for (int i = 0; i < manyNames; ++i) {
        folder.WriteFile(MixedName(i), "");
    }
    ExpectManyNamesInOrder(folder);
}

// Wine doesn't show links that lead nowhere. Such a name stands as written: to ask for it must not read the folder
// again.
TEST(FileFinder, ListsAFolderOfManyLinksInOrderAsOnlyLinuxHasDanglingLinks) {
    const TemporaryFolder folder;
    for (int i = 0; i < manyNames; ++i) {
        folder.MakeLink("nowhere", MixedName(i));
    }
    ExpectManyNamesInOrder(folder);
}

}  // namespace

}  // namespace qn::dsc::osdep
