#include "qn/dsc/osdep/Compare_linux.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdlib>
#include <random>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include <gtest/gtest.h>
#include <unicode/uchar.h>
#include <unicode/uclean.h>
#include <unicode/ucol.h>
#include <unicode/uloc.h>

#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/Compare_ascii.h"

namespace {

using qn::dsc::osdep::Collation;
using qn::dsc::osdep::Compare;
using qn::dsc::osdep::CompareAscii;
using qn::dsc::osdep::IsUserCollationOpen;
using qn::dsc::osdep::undecidedByAscii;

// No test depends on the locale of the machine: the user's collation is the root collation, whatever is set outside.
class RootLocale : public testing::Environment {
    void SetUp() override { setenv("LC_ALL", "C", 1); }
};
const testing::Environment* const rootLocale = testing::AddGlobalTestEnvironment(new RootLocale);

std::string Show(std::u16string_view text) {
    std::string shown = "[";
    for (char16_t unit : text) {
        char number[8];
        std::snprintf(number, sizeof(number), "%04X ", static_cast<unsigned>(unit));
        shown += number;
    }
    return shown + "]";
}

// Compare as it is defined, with nothing done fast: sort keys for the first step, lists for the second.
class Model {
  public:
    explicit Model(const char* locale, const std::u16string& moreRules = u"") {
        UErrorCode error = U_ZERO_ERROR;
        UCollator* const plain = ucol_open(locale, &error);
        int32_t length = 0;
        const UChar* const plainRules = ucol_getRules(plain, &length);
        const std::u16string rules =
            std::u16string(plainRules, static_cast<size_t>(length)) +
            u"&' '<'!'<'\"'<'#'<'$'<'%'<'&'<'('<')'<'*'<','<'.'<'/'<':'<';'<'?'<'@'<'['<'\\'<']'<"
            u"'^'<'_'<'`'<'{'<'|'<'}'<'~'<'+'<'<'<'='<'>'" +
            moreRules;
        ucol_close(plain);
        collator = ucol_openRules(rules.data(), static_cast<int32_t>(rules.size()), UCOL_DEFAULT, UCOL_SECONDARY,
                                  nullptr, &error);
        EXPECT_TRUE(U_SUCCESS(error)) << u_errorName(error);
    }
    ~Model() { ucol_close(collator); }
    Model(const Model&) = delete;
    Model& operator=(const Model&) = delete;

    int Compare(const std::u16string& a, const std::u16string& b) const {
        const int first = Sign(SortKey(a), SortKey(b));
        return first != 0 ? first : Sign(Marks(a), Marks(b));
    }

  private:
    // Before: the negated number of other units in front, so that fewer is greater; then 0 for "'" and 1 for "-".
    using MarkList = std::vector<std::pair<long, int>>;

    template <typename Value>
    static int Sign(const Value& a, const Value& b) {
        return a < b ? -1 : (b < a ? 1 : 0);
    }

    std::vector<uint8_t> SortKey(const std::u16string& text) const {
        std::u16string folded;
        for (size_t i = 0; i < text.size(); ++i) {
            if (text[i] == u'-' || text[i] == u'\'') {
                continue;
            }
            const bool isPair = (text[i] & 0xFC00) == 0xD800 && i + 1 < text.size() && (text[i + 1] & 0xFC00) == 0xDC00;
            if (isPair) {
                const UChar32 character = u_foldCase(0x10000 + ((text[i] & 0x3FF) << 10) + (text[i + 1] & 0x3FF), 0);
                folded += static_cast<char16_t>(0xD800 + ((character - 0x10000) >> 10));
                folded += static_cast<char16_t>(0xDC00 + (character & 0x3FF));
                ++i;
            } else {
                folded += static_cast<char16_t>(u_foldCase(text[i], 0));
            }
        }
        std::vector<uint8_t> key(folded.size() * 16 + 16);
        const int32_t length = ucol_getSortKey(collator, folded.data(), static_cast<int32_t>(folded.size()), key.data(),
                                               static_cast<int32_t>(key.size()));
        EXPECT_LE(static_cast<size_t>(length), key.size());
        key.resize(static_cast<size_t>(length));
        return key;
    }

    static MarkList Marks(const std::u16string& text) {
        MarkList marks;
        long others = 0;
        for (char16_t unit : text) {
            if (unit == u'-' || unit == u'\'') {
                marks.emplace_back(-others, unit == u'-' ? 1 : 0);
            } else {
                ++others;
            }
        }
        return marks;
    }

    UCollator* collator = nullptr;
};

// Random texts that are equal, or nearly so, often enough.
class TextSource {
  public:
    explicit TextSource(std::u16string choice) : units(std::move(choice)) {}

    std::u16string Text(size_t longest) {
        std::u16string text;
        for (size_t count = random() % (longest + 1); count > 0; --count) {
            text += units[random() % units.size()];
        }
        return text;
    }

    // Another text, or `text` with one unit changed, added, removed or repeated.
    std::u16string Near(std::u16string text, size_t longest) {
        if (random() % 4 == 0) {
            return Text(longest);
        }
        for (size_t edits = random() % 3; edits > 0; --edits) {
            const size_t at = random() % (text.size() + 1);
            const char16_t unit = units[random() % units.size()];
            switch (random() % 3) {
                case 0:
                    text.insert(at, 1, unit);
                    break;
                case 1:
                    text.erase(at, 1);
                    break;
                default:
                    if (at < text.size()) {
                        text[at] = unit;
                    }
                    break;
            }
        }
        return text;
    }

  private:
    std::u16string units;
    std::mt19937 random{20240517};
};

std::u16string AsciiUnits() {
    std::u16string units;
    for (char16_t unit = 0; unit < 0x80; ++unit) {
        units += unit;
    }
    return units + u"--''--''aAbBzZ";
}

std::u16string NastyUnits() {
    std::u16string units = AsciiUnits() + AsciiUnits() + AsciiUnits();
    // Latin-1 with its soft hyphen, Latin ligatures and both Turkish letters i.
    for (char16_t unit = 0x80; unit < 0x100; ++unit) {
        units += unit;
    }
    units += u"\u00ad\u00ad\u0130\u0131\u0132\u0141\u0142\u0152\u0153\u017f\u01c4\u01c5\u1e9e\u212a\u212b";
    // Combining marks of different classes, the middle dot that belongs to an "l", joiners.
    units += u"\u0300\u0301\u0307\u0308\u030a\u030c\u0323\u0327\u0328\u0338\u0345\u00b7\u0387\u034f\u200b\u200d\ufe0f";
    // Full-width forms, dashes and quotes, Greek, Cyrillic, Hebrew, Arabic, Thai, Japanese, Korean, Chinese.
    units += u"\uff01\uff07\uff0d\uff10\uff21\uff41\u2010\u2011\u2013\u2019\u2212\u037e\u1fef\u2260\u226e";
    units += u"\u0391\u03b1\u03a3\u03c3\u03c2\u0410\u0430\u0419\u0439\u0438\u05d0\u05b0\u0627\u0644\u0e40\u0e01\u0e2f";
    units += u"\u3042\u304b\u30ab\u3099\u30fc\uff76\uac00\u1100\u1161\u11a8\u4e00\u4e8c\uf900";
    // Surrogates on their own and, by chance, in pairs: letters with two cases, a picture, a Chinese character.
    units += u"\xd801\xdc00\xdc28\xd83d\xde00\xd840\xdc0b\xdfff\xd800\ufffe\uffff\ufffd\ue000";
    return units;
}

// What Compare does, with another collation in place of the user's.
int CompareBy(const Collation& collation, const std::u16string& a, const std::u16string& b) {
    const int decided = CompareAscii(a, b);
    return decided == undecidedByAscii ? collation.Compare(a, b) : decided;
}

// Walks over `rounds` random triples of `source` and hands each to `check`, until one fails.
template <typename Check>
void ForTriples(TextSource source, int rounds, size_t longest, Check check) {
    for (int round = 0; round < rounds && !testing::Test::HasFailure(); ++round) {
        const std::u16string a = source.Text(longest);
        const std::u16string b = source.Near(a, longest);
        const std::u16string c = source.Near(b, longest);
        SCOPED_TRACE(Show(a) + Show(b) + Show(c));
        check(a, b, c);
    }
}

// Compare of the three texts obeys the laws of a total preorder.
template <typename Order>
void CheckLaws(Order order, const std::u16string& a, const std::u16string& b, const std::u16string& c) {
    const int ab = order(a, b);
    const int bc = order(b, c);
    const int ac = order(a, c);
    EXPECT_EQ(order(a, a), 0);
    EXPECT_EQ(order(b, a), -ab);
    EXPECT_EQ(order(c, b), -bc);
    EXPECT_EQ(order(c, a), -ac);
    if (ab == 0) {
        EXPECT_EQ(ac, bc);
    }
    if (bc == 0) {
        EXPECT_EQ(ac, ab);
    }
    if (ab == bc) {
        EXPECT_EQ(ac, ab);
    }
}

TEST(CompareProperties, AsciiIsATotalPreorder) {
    ForTriples(TextSource(AsciiUnits()), 60000, 8,
               [](const auto& a, const auto& b, const auto& c) { CheckLaws(Compare, a, b, c); });
}

TEST(CompareProperties, AllTextIsATotalPreorder) {
    ForTriples(TextSource(NastyUnits()), 60000, 6,
               [](const auto& a, const auto& b, const auto& c) { CheckLaws(Compare, a, b, c); });
}

TEST(CompareProperties, AsciiAgreesWithTheModel) {
    const Model model("");
    ForTriples(TextSource(AsciiUnits()), 60000, 8, [&](const auto& a, const auto& b, const auto& c) {
        EXPECT_EQ(Compare(a, b), model.Compare(a, b));
        EXPECT_EQ(Compare(b, c), model.Compare(b, c));
    });
}

TEST(CompareProperties, FewDifferentUnitsAgreeWithTheModel) {
    const Model model("");
    ForTriples(TextSource(u"aAb-'\u0001"), 60000, 12, [&](const auto& a, const auto& b, const auto& c) {
        EXPECT_EQ(Compare(a, b), model.Compare(a, b));
        EXPECT_EQ(Compare(a, c), model.Compare(a, c));
    });
}

TEST(CompareProperties, AllTextAgreesWithTheModel) {
    const Model model("");
    ForTriples(TextSource(NastyUnits()), 60000, 6, [&](const auto& a, const auto& b, const auto& c) {
        EXPECT_EQ(Compare(a, b), model.Compare(a, b));
        EXPECT_EQ(Compare(b, c), model.Compare(b, c));
    });
}

TEST(CompareProperties, AccentsOnAFewLettersAgreeWithTheModel) {
    const Model model("");
    ForTriples(TextSource(u"aAlLi\u00b7\u0308\u0323\u00e4-'\u0001"), 60000, 6,
               [&](const auto& a, const auto& b, const auto&) { EXPECT_EQ(Compare(a, b), model.Compare(a, b)); });
}

// Locales whose order fits, with letters of their own made of an ASCII letter and an accent.
class FittingLocale : public testing::TestWithParam<const char*> {};

TEST_P(FittingLocale, AgreesWithTheModel) {
    const Collation collation(GetParam());
    const Model model(GetParam());
    ForTriples(TextSource(NastyUnits()), 10000, 6, [&](const auto& a, const auto& b, const auto& c) {
        EXPECT_EQ(CompareBy(collation, a, b), model.Compare(a, b));
        CheckLaws([&](const auto& x, const auto& y) { return CompareBy(collation, x, y); }, a, b, c);
    });
    ForTriples(
        TextSource(u"aAoOnNcC\u0308\u030a\u0303\u030c\u0327\u0323-'\u0001"), 10000, 6,
        [&](const auto& a, const auto& b, const auto&) { EXPECT_EQ(CompareBy(collation, a, b), model.Compare(a, b)); });
}

INSTANTIATE_TEST_SUITE_P(Collation, FittingLocale,
                         testing::Values("", "de", "fr_CA", "sv", "fi", "es", "pl", "tr", "vi", "ro", "is", "ru",
                                         "de__PHONEBOOK"));

// Locales that take some pairs of ASCII letters for one letter, or that order ASCII letters in their own way.
class UnfittingLocale : public testing::TestWithParam<const char*> {};

TEST_P(UnfittingLocale, StaysATotalPreorderWithTheCommonOrderOfAscii) {
    const Collation collation(GetParam());
    const auto order = [&](const auto& x, const auto& y) { return CompareBy(collation, x, y); };
    ForTriples(TextSource(NastyUnits()), 10000, 6,
               [&](const auto& a, const auto& b, const auto& c) { CheckLaws(order, a, b, c); });
    ForTriples(TextSource(u"aAcCdDhHlLzZsSyYnNjJgG-'\u0001\u030a\u030c\u0301"), 20000, 6,
               [&](const auto& a, const auto& b, const auto& c) { CheckLaws(order, a, b, c); });
    ForTriples(
        TextSource(AsciiUnits() + u"aAcCdDhHlLzZsSyYnNjJgGaAcCdDhHlLzZsSyYnNjJgG"), 20000, 6,
        [&](const auto& a, const auto& b, const auto&) { EXPECT_EQ(collation.Compare(a, b), CompareAscii(a, b)); });
}

INSTANTIATE_TEST_SUITE_P(Collation, UnfittingLocale,
                         testing::Values("cs", "da", "nb", "hr", "hu", "cy", "sq", "et", "lt", "az", "en_US_POSIX",
                                         "zh__STROKE", "ja", "th"));

TEST(Collation, SwedishLettersStandBehindZ) {
    const Collation collation("sv_SE");
    EXPECT_EQ(CompareBy(collation, u"z", u"\u00e4"), -1);
    EXPECT_EQ(CompareBy(collation, u"z", u"a\u0308"), -1);
    EXPECT_EQ(CompareBy(collation, u"A\u0308", u"\u00e4"), 0);
    EXPECT_EQ(CompareBy(collation, u"xa\u0308", u"xb"), 1);
    EXPECT_EQ(CompareBy(collation, u"a-\u0308", u"b"), 1);
}

TEST(Collation, PairsOfAsciiLettersAreTwoLettersInEveryLocale) {
    const Collation czech("cs_CZ");
    EXPECT_EQ(CompareBy(czech, u"ch", u"d"), -1);
    EXPECT_EQ(CompareBy(czech, u"ch\u00e9", u"d\u00e9"), -1);
    EXPECT_EQ(CompareBy(czech, u"\u010d", u"cz"), 1);
    EXPECT_EQ(CompareBy(czech, u"\u010d", u"d"), -1);
    const Collation danish("da_DK");
    EXPECT_EQ(CompareBy(danish, u"aa", u"b"), -1);
    EXPECT_EQ(CompareBy(danish, u"\u00e5", u"z"), 1);
}

TEST(Collation, LocaleThatOrdersAsciiLettersInItsOwnWayGetsTheRootCollation) {
    const Collation estonian("et_EE");
    EXPECT_EQ(CompareBy(estonian, u"z", u"t"), 1);
    EXPECT_EQ(CompareBy(estonian, u"\u00e4", u"b"), -1);
}

TEST(Collation, TurkishCapitalIIsSmallI) {
    const Collation turkish("tr_TR");
    EXPECT_EQ(CompareBy(turkish, u"INFO", u"info"), 0);
    EXPECT_EQ(CompareBy(turkish, u"INFO\u00e9", u"info\u00c9"), 0);
    EXPECT_EQ(turkish.Compare(u"INFO", u"info"), 0);
    EXPECT_EQ(CompareBy(turkish, u"\u0131", u"i"), -1);
}

TEST(Collation, UnknownLocaleGetsTheRootCollation) {
    const Collation unknown("no such locale");
    EXPECT_EQ(unknown.Compare(u"\u00e4", u"z"), -1);
    EXPECT_EQ(unknown.Compare(u"\u00e4", u"a"), 1);
}

// Memory for ICU, as long as there is some.
bool memoryIsGone = false;
void* Allocate(const void*, size_t size) {
    return memoryIsGone ? nullptr : std::malloc(size);
}
void* Reallocate(const void*, void* block, size_t size) {
    return memoryIsGone ? nullptr : std::realloc(block, size);
}
void Free(const void*, void* block) {
    std::free(block);
}

// These look at the first use in a process, so that each runs in a process of its own.
class FirstUse : public testing::Test {
  protected:
    void SetUp() override { testing::FLAGS_gtest_death_test_style = "threadsafe"; }
};
using FirstUseDeathTest = FirstUse;

TEST_F(FirstUseDeathTest, AsciiAloneOpensNoCollation) {
    EXPECT_EXIT(
        {
            const std::u16string units = AsciiUnits();
            int sum = Compare(u"DisplayName", u"displayname") + Compare(u"co-op", u"coop") + Compare(u"\x01", u"'");
            for (char16_t first : units) {
                for (char16_t second : units) {
                    sum += Compare(std::u16string{first, u'x', second}, std::u16string{second, first});
                }
            }
            std::exit(IsUserCollationOpen() || sum == 1000000 ? 1 : 0);
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(FirstUseDeathTest, OtherCharactersOpenTheUsersCollation) {
    EXPECT_EXIT(
        {
            setenv("LC_ALL", "sv_SE.UTF-8", 1);
            const bool isSwedish = Compare(u"\u00e4", u"z") == 1;
            std::exit(isSwedish && IsUserCollationOpen() ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(FirstUseDeathTest, LocaleCMeansTheRootCollation) {
    for (const char* locale : {"C", "POSIX", "C.UTF-8"}) {
        EXPECT_EXIT(
            {
                setenv("LC_ALL", locale, 1);
                // By code points the small e with the accent would stand behind all ASCII.
                const bool isRoot = Compare(u"\u00e9", u"f") == -1 && Compare(u"\u00c9", u"\u00e9") == 0;
                std::exit(isRoot ? 0 : 1);
            },
            testing::ExitedWithCode(0), "")
            << locale;
    }
}

TEST_F(FirstUseDeathTest, ManyThreadsMayBeTheFirst) {
    EXPECT_EXIT(
        {
            std::atomic<int> wrong = 0;
            std::vector<std::thread> threads;
            for (int i = 0; i < 8; ++i) {
                threads.emplace_back([&] {
                    for (int round = 0; round < 100; ++round) {
                        wrong += Compare(u"\u00e9", u"f") != -1 || Compare(u"\u00c9a", u"\u00e9A") != 0;
                    }
                });
            }
            for (std::thread& thread : threads) {
                thread.join();
            }
            std::exit(wrong == 0 ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(FirstUseDeathTest, WithoutACollationOtherCharactersCountAsEqual) {
    EXPECT_EXIT(
        {
            UErrorCode error = U_ZERO_ERROR;
            u_setMemoryFunctions(nullptr, Allocate, Reallocate, Free, &error);
            // ICU has its default locale before it runs out of memory; without one it would wait for itself.
            uloc_getDefault();
            memoryIsGone = true;
            const bool areEqual = Compare(u"\u00e9", u"z") == 0 && Compare(u"\u00e9-", u"\u00e9") == 0;
            const bool isAsciiOrdered = Compare(u"a", u"z") == -1 && Compare(u"co-op", u"coop") == 1;
            std::exit(U_SUCCESS(error) && areEqual && isAsciiOrdered ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

}  // namespace
