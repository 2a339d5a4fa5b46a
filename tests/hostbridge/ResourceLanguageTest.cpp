#include "hostbridge/ResourceLanguage.h"

#include "host/LoadedRuntime.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

// The process remembers its language, so each test asks in one of its own.
std::string LanguageOfHost(const std::string& name) {
    LoadStandInRuntime().language = name;
    return ExactText(GetResourceLanguage());
}

TEST(ResourceLanguage, IsEnglishWithoutAHost) {
    EXPECT_IN_CHILD([] { return ExactText(GetResourceLanguage()) == "eng"; });
}

TEST(ResourceLanguage, IsEnglishForAnEnglishHost) {
    EXPECT_IN_CHILD([] { return LanguageOfHost("English") == "eng"; });
}

TEST(ResourceLanguage, IsJapaneseForAJapaneseHost) {
    EXPECT_IN_CHILD([] { return LanguageOfHost("Japanese") == "jpn"; });
}

TEST(ResourceLanguage, IsChineseForAChineseHost) {
    EXPECT_IN_CHILD([] { return LanguageOfHost("ChineseS") == "chs"; });
}

TEST(ResourceLanguage, NameOfTheHostMayHaveAnyLetterCase) {
    EXPECT_IN_CHILD([] { return LanguageOfHost("english") == "eng"; });
    EXPECT_IN_CHILD([] { return LanguageOfHost("JAPANESE") == "jpn"; });
    EXPECT_IN_CHILD([] { return LanguageOfHost("chineses") == "chs"; });
}

TEST(ResourceLanguage, IsEnglishForAnyOtherHost) {
    EXPECT_IN_CHILD([] { return LanguageOfHost("French") == "eng"; });
    EXPECT_IN_CHILD([] { return LanguageOfHost("Chinese") == "eng"; });
    EXPECT_IN_CHILD([] { return LanguageOfHost("") == "eng"; });
}

TEST(ResourceLanguage, NameMayHave255Bytes) {
    EXPECT_IN_CHILD([] { return LanguageOfHost(std::string(255, 'x')) == "eng"; });
}

TEST(ResourceLanguage, WhatStandsBehindTheNameDoesNotCount) {
    EXPECT_IN_CHILD([] {
        StandInRuntime& runtime = LoadStandInRuntime();
        runtime.language = "Japanese";
        runtime.behindTheLanguage = "Chinese";
        return ExactText(GetResourceLanguage()) == "jpn";
    });
}

TEST(ResourceLanguage, IsAskedForOnce) {
    EXPECT_IN_CHILD([] {
        StandInRuntime& runtime = LoadStandInRuntime();
        runtime.language = "Japanese";
        GetResourceLanguage();
        runtime.language = "English";
        return ExactText(GetResourceLanguage()) == "jpn" && runtime.Count("HostGetLanguageName") == 1;
    });
}

TEST(ResourceLanguage, HostThatComesLaterChangesNothing) {
    EXPECT_IN_CHILD([] {
        const bool wasEnglish = ExactText(GetResourceLanguage()) == "eng";
        StandInRuntime& runtime = LoadStandInRuntime();
        runtime.language = "Japanese";
        return wasEnglish && ExactText(GetResourceLanguage()) == "eng" && runtime.Count("HostGetLanguageName") == 0;
    });
}

TEST(ResourceLanguageDeathTest, HostThatCannotAnswerIsFatal) {
    EXPECT_EXIT(
        {
            LoadModule(POOR_RUNTIME);
            GetResourceLanguage();
        },
        testing::ExitedWithCode(1), "^Fatal Error: ZARVIKV\\.LIB could not locate \"HostGetLanguageName\"\\.\n$");
}

}  // namespace
}  // namespace zkhw
