#include "qn/dsc/osdep/_GetCodePageID.h"

#include <cstring>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"

namespace {

using qn::dsc::exception::InvalidLocale;
using qn::dsc::osdep::GetCodePageID;

TEST(GetCodePageID, EmptyNameIsTheDefaultCodePage) {
    EXPECT_EQ(GetCodePageID(""), 0u);
}

TEST(GetCodePageID, UsAsciiIs20127) {
    EXPECT_EQ(GetCodePageID("US-ASCII"), 20127u);
}

TEST(GetCodePageID, Cp932Is932) {
    EXPECT_EQ(GetCodePageID("cp932"), 932u);
}

TEST(GetCodePageID, OtherNamesThrowInvalidLocale) {
    for (const char* name : {"cp1252", "us-ascii", "CP932", "cp932 ", " ", "US-ASCI", "US-ASCIIX", "932"}) {
        try {
            GetCodePageID(name);
            ADD_FAILURE() << name;
        } catch (const InvalidLocale& failure) {
            EXPECT_STREQ(failure.what(), "Invalid locale") << name;
            EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/_GetCodePageID") << name;
            EXPECT_GT(failure.GetLine(), 0) << name;
        }
    }
}

}  // namespace
