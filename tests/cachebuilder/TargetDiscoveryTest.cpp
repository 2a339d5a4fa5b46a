#include "cachebuilder/TargetDiscovery.h"

#include <gtest/gtest.h>

#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

constexpr int32_t invalid = static_cast<int32_t>(0x80070057);

TEST(IsHostsResourceFile, KnowsTheFileInItsPlace) {
    EXPECT_TRUE(IsHostsResourceFile(u"C:\\host\\Targets\\QN\\FPGA\\hosts_resource.xml"));
}

TEST(IsHostsResourceFile, IsBlindToLetterCase) {
    EXPECT_TRUE(IsHostsResourceFile(u"C:\\HOST\\TARGETS\\qn\\fpga\\Hosts_Resource.XML"));
}

TEST(IsHostsResourceFile, LooksAtTheLastCharactersAlone) {
    EXPECT_TRUE(IsHostsResourceFile(u"Targets\\QN\\FPGA\\hosts_resource.xml"));
    EXPECT_TRUE(IsHostsResourceFile(u"C:\\MyTargets\\QN\\FPGA\\hosts_resource.xml"));
}

TEST(IsHostsResourceFile, RefusesOtherPlacesAndNames) {
    EXPECT_FALSE(IsHostsResourceFile(u"C:\\host\\Targets\\QN\\FPGA\\sub\\hosts_resource.xml"));
    EXPECT_FALSE(IsHostsResourceFile(u"C:\\host\\Targets\\QN\\FPGA\\a_resource.xml"));
    EXPECT_FALSE(IsHostsResourceFile(u"hosts_resource.xml"));
    EXPECT_FALSE(IsHostsResourceFile(u""));
}

struct RelativeCase {
    const char16_t* base;
    const char16_t* target;
    const char* relative;
};

TEST(MakeRelativePath, LeadsFromTheBaseToTheTarget) {
    const RelativeCase cases[] = {
        {u"C:\\Host", u"C:\\Host\\Targets", "Targets"},
        {u"C:\\Host", u"C:\\Host\\Targets\\QN\\FPGA\\x\\x_resource.xml", "Targets\\QN\\FPGA\\x\\x_resource.xml"},
        {u"C:\\Host", u"C:\\Other\\x", "..\\Other\\x"},
        {u"C:\\a\\b\\c", u"C:\\a\\d\\e", "..\\..\\d\\e"},
        {u"C:\\a\\b", u"C:\\a", "..\\..\\a"},
        {u"C:\\", u"C:\\a\\b.xml", "a\\b.xml"},
        {u"C:\\", u"C:\\b.xml", "b.xml"},
        {u"C:\\a\\b", u"C:\\", "..\\..\\..\\C:"},
    };
    for (const RelativeCase& one : cases) {
        String result;
        EXPECT_EQ(MakeRelativePath(one.base, one.target, result), 0);
        EXPECT_EQ(ExactText(result), one.relative)
            << ExactText(String(one.base)) << " to " << ExactText(String(one.target));
    }
}

TEST(MakeRelativePath, ComparesBlindToLetterCase) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"c:\\HOST\\a", u"C:\\host\\A\\File.xml", result), 0);
    EXPECT_EQ(ExactText(result), "File.xml");
}

TEST(MakeRelativePath, NeverDropsTheNameOfTheTarget) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"C:\\a\\b", u"C:\\a\\b", result), 0);
    EXPECT_EQ(ExactText(result), "..\\b");
}

TEST(MakeRelativePath, TakesOneBackslashFromTheEndOfTheTarget) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"C:\\a", u"C:\\a\\b\\", result), 0);
    EXPECT_EQ(ExactText(result), "b");
}

TEST(MakeRelativePath, BaseWithABackslashGivesTheWholeTarget) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"C:\\Host\\", u"C:\\Host\\Targets\\x.xml", result), 0);
    EXPECT_EQ(ExactText(result), "C:\\Host\\Targets\\x.xml");
}

TEST(MakeRelativePath, OtherDriveGivesTheWholeTarget) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"D:\\Host", u"C:\\Host\\x.xml", result), 0);
    EXPECT_EQ(ExactText(result), "C:\\Host\\x.xml");
}

TEST(MakeRelativePath, NetworkPathsWorkAlike) {
    String result;
    EXPECT_EQ(MakeRelativePath(u"\\\\server\\share\\a", u"\\\\server\\share\\b\\x.xml", result), 0);
    EXPECT_EQ(ExactText(result), "..\\b\\x.xml");
}

TEST(MakeRelativePath, RefusesPathsThatAreNotAbsolute) {
    String result(u"kept");
    EXPECT_EQ(MakeRelativePath(u"Host", u"C:\\Host\\x", result), invalid);
    EXPECT_EQ(MakeRelativePath(u"C:\\Host", u"x", result), invalid);
    EXPECT_EQ(MakeRelativePath(u"", u"", result), invalid);
    EXPECT_EQ(MakeRelativePath(u"C:", u"C:\\a", result), invalid);
    EXPECT_EQ(ExactText(result), "kept");
}

TEST(MakeRelativePath, ResultMayBeOneOfTheInputs) {
    String path(u"C:\\a\\b");
    EXPECT_EQ(MakeRelativePath(u"C:\\a", path, path), 0);
    EXPECT_EQ(ExactText(path), "b");
}

TEST(MakeRelativePath, LongPathsAreFollowedToTheirEnds) {
    String base(u"C:\\same");
    String target(u"C:\\same");
    std::string expected;
    for (int i = 0; i < 300; ++i) {
        base.Append(u"\\b");
        target.Append(u"\\t");
        expected += "..\\";
    }
    for (int i = 0; i < 300; ++i) {
        expected += i == 0 ? "t" : "\\t";
    }
    String result;
    EXPECT_EQ(MakeRelativePath(base, target, result), 0);
    EXPECT_EQ(ExactText(result), expected);
}

}  // namespace
}  // namespace zkhw
