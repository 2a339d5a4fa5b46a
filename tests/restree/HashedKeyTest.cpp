#include "restree/HashedKey.h"

#include <cstring>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/Compare.h"

namespace zkhw {
namespace {

TEST(HashedKey, KeysThatDifferInCaseAloneHaveTheSameHash) {
    const std::u16string lower(u"abcdefghijklmnopqrstuvwxyz_0123456789/.:");
    const std::u16string upper(u"ABCDEFGHIJKLMNOPQRSTUVWXYZ_0123456789/.:");
    for (size_t length = 0; length <= lower.size(); ++length) {
        const std::u16string_view key = std::u16string_view(lower).substr(0, length);
        EXPECT_EQ(HashKey(key), HashKey(std::u16string_view(upper).substr(0, length))) << length;
        EXPECT_NE(HashKey(key), 0) << length;
    }
}

TEST(HashedKey, UnitsFromTheFullStopToTheTildeArePlain) {
    for (uint32_t unit = 0; unit <= 0xFFFF; ++unit) {
        const bool isPlain = unit >= u'.' && unit <= u'~';
        for (size_t length = 1; length <= 9; ++length) {
            for (const size_t at : {size_t{0}, length / 2, length - 1}) {
                std::u16string key(length, u'k');
                key[at] = static_cast<char16_t>(unit);
                ASSERT_EQ(HashKey(key) != 0, isPlain) << unit << " at " << at << " of " << length;
            }
        }
    }
}

TEST(HashedKey, PlainUnitsAllCountInTheOrder) {
    for (char16_t unit = u'.'; unit <= u'~'; ++unit) {
        EXPECT_NE(qn::dsc::osdep::asciiWeights[unit], 0) << static_cast<uint32_t>(unit);
    }
}

TEST(HashedKey, LiteralHasTheHashOfItsText) {
    constexpr HashedKey literals[] = {u"", u"a", u"abc", u"name", u"Names", u":DeferredLoadPath", u"a b"};
    for (const HashedKey& literal : literals) {
        EXPECT_EQ(literal.hash, HashKey(std::u16string(literal.text))) << literal.text.size();
    }
}

TEST(HashedKey, PlainKeyMayEqualItsOwnHashAndNone) {
    const HashedKey plain(std::u16string_view(u"name"), 7);
    for (uint32_t other = 0; other <= 0xFF; ++other) {
        EXPECT_EQ(plain.MayEqual(static_cast<uint8_t>(other)), other == 7 || other == 0) << other;
    }
}

TEST(HashedKey, KeyThatIsNotPlainMayEqualAny) {
    const HashedKey blank(std::u16string_view(u"a b"));
    for (uint32_t other = 0; other <= 0xFF; ++other) {
        EXPECT_TRUE(blank.MayEqual(static_cast<uint8_t>(other))) << other;
    }
}

// A key that is hashed by the compiler has to have the hash that it has when it is read from a file.
TEST(HashedKey, UnitsAreJoinedForTheCompilerAsTheyLieInMemory) {
    const char16_t units[] = u"\x0102\x0304\x0506\xF708";
    uint64_t word = 0;
    std::memcpy(&word, units, sizeof word);
    EXPECT_EQ(detail::JoinUnits(units), word);
}

TEST(HashedKey, KeysOfABoardHaveManyHashes) {
    std::vector<uint32_t> counts(256);
    for (uint32_t i = 0; i < 2560; ++i) {
        std::u16string key(u"Line");
        for (const char digit : std::to_string(i)) {
            key.push_back(static_cast<char16_t>(digit));
        }
        ++counts[HashKey(key)];
    }
    EXPECT_EQ(counts[0], 0u);
    for (const uint32_t count : counts) {
        EXPECT_LE(count, 40u);
    }
}

}  // namespace
}  // namespace zkhw
