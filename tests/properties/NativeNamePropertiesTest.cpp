// Every name that a file can have on Linux comes through a listing and back to the file.

#include <set>
#include <string>

#include <gtest/gtest.h>

#include "properties/Random.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/BinaryFile.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::String;

// Pieces of names: plain ones, ends and middles of sequences, encoded surrogates, overlong forms, a backslash and the
// unit that stands for it, wildcards, separators of the other form.
constexpr std::string_view pieces[] = {"a",
                                       "B",
                                       ".",
                                       " ",
                                       "\\",
                                       "\xEF\x81\x9C",
                                       "*",
                                       "?",
                                       ":",
                                       "\x80",
                                       "\xC3",
                                       "\xE4",
                                       "\xC3\xA4",
                                       "\xE4\xB8\xAD",
                                       "\xFF",
                                       "\x01",
                                       "\xF0",
                                       "\x9F",
                                       "\x92\xA9",
                                       "~",
                                       "\xED\xA0\x80",
                                       "\xED\xB2\x80",
                                       "\n",
                                       "\xF0\x9F\x92\xA9",
                                       "\xC0\xAF",
                                       "\xF4\x90\x80\x80"};

std::string RandomName(Random& random) {
    std::string name;
    for (size_t left = 1 + random.Below(10); left > 0; --left) {
        if (random.OneIn(4)) {
            const char byte = static_cast<char>(1 + random.Below(255));
            name += byte == '/' ? 'x' : byte;
        } else {
            name += random.Of(pieces);
        }
    }
    return name == "." || name == ".." ? "x" : name;
}

TEST(NativeNameProperties, ATextOfAnyNameGivesItsBytesBack) {
    ForEachCase(11, [](Random& random) {
        const std::string name = RandomName(random);
        const String text(name.data(), static_cast<uint32_t>(name.size()));
        EXPECT_EQ(qn::dsc::NarrowString(text.CStr(), text.Length()).View(), name) << qn::dsc::ExactText(text);
    });
}

// Each file holds its own name. Two names with and without a backslash in the same place read the same, so only one of
// them is there.
TEST(NativeNameProperties, AListedNameLeadsToItsFile) {
    constexpr size_t perFolder = 200;
    std::set<std::string> used;
    size_t opened = 0;
    uint64_t number = 0;
    for (size_t round = 0; opened < caseCount; ++round) {
        const qn::dsc::osdep::TemporaryFolder folder;
        std::set<std::string> names;
        while (names.size() < perFolder) {
            Random random(12 * caseCount + number++);
            std::string name = RandomName(random);
            std::string alike = name;
            for (size_t at = 0; (at = alike.find("\xEF\x81\x9C")) != std::string::npos;) {
                alike.replace(at, 3, "\\");
            }
            if (names.count(alike) == 0 && names.insert(alike).second) {
                folder.WriteFile(name, name);
            }
        }
        qn::dsc::osdep::FileFinder finder;
        std::set<std::string> seen;
        for (const String& path : finder.ListFiles(folder.System(u"*"))) {
            const std::u16string_view name = path.View().substr(path.View().rfind(u'\\') + 1);
            if (name == u"." || name == u"..") {
                continue;
            }
            SCOPED_TRACE(qn::dsc::ExactText(String(name)) + ", a name of seed 12");
            qn::dsc::osdep::BinaryFile file;
            ASSERT_NO_THROW(file.Open(path, qn::dsc::osdep::BinaryMode::Read));
            char bytes[256];
            const int32_t size = file.Read(bytes, sizeof bytes);
            ASSERT_GT(size, 0);
            seen.insert(std::string(bytes, static_cast<size_t>(size)));
            ++opened;
        }
        ASSERT_EQ(seen.size(), perFolder) << "in round " << round;
    }
}

}  // namespace
}  // namespace zkhw
