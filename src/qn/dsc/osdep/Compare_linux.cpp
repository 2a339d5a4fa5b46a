#include "qn/dsc/osdep/Compare_linux.h"

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include <unicode/uchar.h>
#include <unicode/ucol.h>
#include <unicode/uloc.h>
#include <unicode/uset.h>
#include <unicode/utf16.h>

#include "qn/dsc/osdep/Compare_ascii.h"

namespace qn::dsc::osdep {

namespace {

struct SetCloser {
    void operator()(USet* set) const { uset_close(set); }
};
using Set = std::unique_ptr<USet, SetCloser>;

// Rules that put the punctuation of ASCII right behind the blank, in its order.
std::u16string PunctuationRules() {
    std::u16string rules = u"&' '";
    for (char16_t unit : asciiPunctuation) {
        rules += u"<\\";
        rules += unit;
    }
    return rules;
}

// Whether the ASCII units stand in their order, each with a primary weight of its own.
bool HasAsciiOrder(UCollator* collator) {
    std::u16string order = u"\t\n\v\f\r ";
    order += asciiPunctuation;
    order += u"0123456789abcdefghijklmnopqrstuvwxyz";
    ucol_setStrength(collator, UCOL_PRIMARY);
    bool inOrder = true;
    for (size_t i = 0; i + 1 < order.size(); ++i) {
        inOrder = inOrder && ucol_strcoll(collator, &order[i], 1, &order[i + 1], 1) == UCOL_LESS;
    }
    ucol_setStrength(collator, UCOL_SECONDARY);
    return inOrder;
}

// The sequences that begin with two ASCII units and that the collation takes for one letter (Czech "ch"), the shorter
// ones first. Case-folded texts are compared, so sequences with a capital letter are left out, as are those with an
// apostrophe. False if ICU failed or if an ASCII unit by itself is taken for several letters.
bool FindAsciiContractions(const UCollator* collator, std::vector<std::u16string>& sequences) {
    UErrorCode error = U_ZERO_ERROR;
    const Set contractions(uset_openEmpty());
    const Set expansions(uset_openEmpty());
    if (!contractions || !expansions) {
        return false;
    }
    ucol_getContractionsAndExpansions(collator, contractions.get(), expansions.get(), true, &error);
    const int32_t count = uset_getItemCount(contractions.get());
    for (int32_t i = 0; i < count && U_SUCCESS(error); ++i) {
        UChar32 first;
        UChar32 last;
        UChar units[64];
        const int32_t length = uset_getItem(contractions.get(), i, &first, &last, units, 64, &error);
        const std::u16string sequence(units, static_cast<size_t>(std::max(length, 0)));
        const bool isAscii = length >= 2 && units[0] < 0x80 && units[1] < 0x80;
        if (isAscii && sequence.find_first_of(u"ABCDEFGHIJKLMNOPQRSTUVWXYZ'-") == std::u16string::npos) {
            sequences.push_back(sequence);
        }
    }
    std::stable_sort(sequences.begin(), sequences.end(),
                     [](const auto& a, const auto& b) { return a.size() < b.size(); });
    bool expands = false;
    for (UChar32 character = 0; character < 0x80; ++character) {
        expands = expands || uset_contains(expansions.get(), character);
    }
    return U_SUCCESS(error) && !expands;
}

// Whether a sequence compares as its first unit and the rest do when something keeps them apart.
bool IsTakenApart(const UCollator* collator, const std::u16string& sequence) {
    std::u16string apart = sequence;
    apart.insert(1, 1, u'\u0001');
    return ucol_strcoll(collator, sequence.data(), static_cast<int32_t>(sequence.size()), apart.data(),
                        static_cast<int32_t>(apart.size())) == UCOL_EQUAL;
}

// The character at `at`, of two units if they are a pair, and `at` behind it.
UChar32 TakeCharacter(std::u16string_view text, size_t& at) {
    const char16_t unit = text[at++];
    if (U16_IS_LEAD(unit) && at < text.size() && U16_IS_TRAIL(text[at])) {
        const char16_t trail = text[at++];
        return U16_GET_SUPPLEMENTARY(unit, trail);
    }
    return unit;
}

// A text without "-" and "'", case-folded. Texts of up to 256 units stay on the stack.
class FoldedText {
  public:
    explicit FoldedText(std::u16string_view text) {
        // Folding changes the number of units of no character today; twice the room is enough if it ever does.
        if (text.size() > shortLength) {
            longUnits = std::make_unique<char16_t[]>(2 * text.size());
            units = longUnits.get();
        }
        size_t at = 0;
        while (at < text.size()) {
            const UChar32 character = TakeCharacter(text, at);
            if (character != u'-' && character != u'\'') {
                Append(u_foldCase(character, U_FOLD_CASE_DEFAULT));
            }
        }
    }

    FoldedText(const FoldedText&) = delete;
    FoldedText& operator=(const FoldedText&) = delete;

    const char16_t* Units() const { return units; }
    int32_t Length() const { return static_cast<int32_t>(length); }

  private:
    static constexpr size_t shortLength = 256;

    void Append(UChar32 character) {
        if (U_IS_BMP(character)) {
            units[length++] = static_cast<char16_t>(character);
        } else {
            units[length++] = U16_LEAD(character);
            units[length++] = U16_TRAIL(character);
        }
    }

    char16_t shortUnits[2 * shortLength];
    std::unique_ptr<char16_t[]> longUnits;
    char16_t* units = shortUnits;
    size_t length = 0;
};

// ucol_strcoll by way of sort keys, which need memory: std::bad_alloc.
UCollationResult CompareSortKeys(const UCollator* collator, const FoldedText& a, const FoldedText& b) {
    std::vector<uint8_t> keys[2];
    for (const FoldedText* text : {&a, &b}) {
        std::vector<uint8_t>& key = keys[text == &b];
        const int32_t length = ucol_getSortKey(collator, text->Units(), text->Length(), nullptr, 0);
        key.resize(static_cast<size_t>(length));
        ucol_getSortKey(collator, text->Units(), text->Length(), key.data(), length);
    }
    return keys[0] < keys[1] ? UCOL_LESS : (keys[1] < keys[0] ? UCOL_GREATER : UCOL_EQUAL);
}

std::atomic<bool> userCollationIsOpen{false};

// Lives as long as the process, since texts are compared until the last static object is gone.
const Collation& UserCollation() {
    static const Collation* const collation = [] {
        const auto* opened = new Collation(uloc_getDefault());
        userCollationIsOpen = true;
        return opened;
    }();
    return *collation;
}

}  // namespace

void Collation::Closer::operator()(UCollator* opened) const {
    ucol_close(opened);
}

Collation::Handle Collation::OpenWithRules(std::u16string_view rules) {
    UErrorCode error = U_ZERO_ERROR;
    Handle opened(ucol_openRules(rules.data(), static_cast<int32_t>(rules.size()), UCOL_DEFAULT, UCOL_SECONDARY,
                                 nullptr, &error));
    // What a locale may set otherwise: Thai skips punctuation, a locale's keywords may count digits as numbers.
    ucol_setAttribute(opened.get(), UCOL_ALTERNATE_HANDLING, UCOL_NON_IGNORABLE, &error);
    ucol_setAttribute(opened.get(), UCOL_NUMERIC_COLLATION, UCOL_OFF, &error);
    ucol_setAttribute(opened.get(), UCOL_CASE_LEVEL, UCOL_OFF, &error);
    return U_SUCCESS(error) ? std::move(opened) : nullptr;
}

Collation::Handle Collation::OpenFitting(const char* locale) {
    UErrorCode error = U_ZERO_ERROR;
    const Handle original(ucol_open(locale, &error));
    if (U_FAILURE(error)) {
        return nullptr;
    }
    int32_t length = 0;
    const UChar* const originalRules = ucol_getRules(original.get(), &length);
    std::u16string rules(originalRules, static_cast<size_t>(length));
    rules += PunctuationRules();
    Handle opened = OpenWithRules(rules);
    std::vector<std::u16string> sequences;
    if (!opened || !FindAsciiContractions(opened.get(), sequences)) {
        return nullptr;
    }
    if (!sequences.empty()) {
        for (const std::u16string& sequence : sequences) {
            // "&c=ch/h": "ch" counts as "c" with "h" behind it.
            rules += std::u16string(u"&") + sequence[0] + u'=' + sequence + u'/' + sequence.substr(1);
        }
        opened = OpenWithRules(rules);
        for (const std::u16string& sequence : sequences) {
            if (!opened || !IsTakenApart(opened.get(), sequence)) {
                return nullptr;
            }
        }
    }
    return HasAsciiOrder(opened.get()) ? std::move(opened) : nullptr;
}

Collation::Collation(const char* locale) {
    if (std::string_view(locale) != "en_US_POSIX") {
        collator = OpenFitting(locale);
    }
    if (!collator) {
        collator = OpenWithRules(PunctuationRules());
    }
    UErrorCode error = U_ZERO_ERROR;
    accentsFromTheEnd = collator && ucol_getAttribute(collator.get(), UCOL_FRENCH_COLLATION, &error) == UCOL_ON;
}

Collation::~Collation() = default;

int Collation::Compare(std::u16string_view a, std::u16string_view b) const {
    if (!collator || a.size() > INT32_MAX / 2 || b.size() > INT32_MAX / 2) {
        return 0;
    }
    const FoldedText foldedA(a);
    const FoldedText foldedB(b);
    const UCollationResult result = accentsFromTheEnd ? CompareSortKeys(collator.get(), foldedA, foldedB)
                                                      : ucol_strcoll(collator.get(), foldedA.Units(), foldedA.Length(),
                                                                     foldedB.Units(), foldedB.Length());
    return result == UCOL_EQUAL ? CompareMarks(a, b) : (result == UCOL_LESS ? -1 : 1);
}

int CompareCollated(std::u16string_view a, std::u16string_view b) {
    return UserCollation().Compare(a, b);
}

bool IsUserCollationOpen() {
    return userCollationIsOpen;
}

}  // namespace qn::dsc::osdep
