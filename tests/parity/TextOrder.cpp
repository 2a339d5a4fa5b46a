// Prints how 20,000 made-up texts compare, so that two platforms can be held against each other (compare_platforms.py).
// For each kind of text a line "kind NAME COUNT", and one for each text, in the order of Compare: its number, "=" if it
// is equal to the one before and else "<", and its units in hexadecimal digits. The texts are the same in every run.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <numeric>
#include <string>
#include <string_view>
#include <vector>

#include "qn/dsc/osdep/Compare.h"

namespace {

using qn::dsc::osdep::Compare;

class Random {
  public:
    explicit Random(uint64_t seed) : state(seed * 2654435769u + 1) {}

    // From 0 up to, not including, `end`.
    uint32_t Below(uint32_t end) {
        state ^= state << 13;
        state ^= state >> 7;
        state ^= state << 17;
        return static_cast<uint32_t>((state >> 16) % end);
    }

  private:
    uint64_t state;
};

struct Range {
    char16_t first;
    char16_t last;
};

// What the texts of a kind are made of; an earlier range is taken more often than a later one.
struct Kind {
    const char* name;
    uint32_t count;
    std::vector<Range> ranges;
};

const Range small{u'a', u'd'};

const std::vector<Kind>& Kinds() {
    static const std::vector<Kind> kinds = {
        {"ascii", 6000, {{u' ', u'~'}, small, {u'A', u'D'}, {u'0', u'9'}, {u'-', u'-'}, {u'\'', u'\''}}},
        {"ascii-names", 4000, {small, {u'A', u'D'}, {u'-', u'-'}, {u'\'', u'\''}, {u'_', u'_'}, {u' ', u' '}}},
        {"ascii-controls", 2000, {{0x00, 0x1F}, small, {0x7F, 0x7F}, {u'-', u'-'}}},
        {"latin-1", 2000, {{0x00C0, 0x00FF}, small, {0x00A1, 0x00BF}}},
        {"greek", 1000, {{0x0391, 0x03C9}, small}},
        {"cyrillic", 1000, {{0x0410, 0x044F}, small}},
        {"cjk", 1000, {{0x4E00, 0x9FA5}, small}},
        {"combining", 1000, {{u'a', u'f'}, {0x0300, 0x0304}, {0x0327, 0x0328}}},
        {"c1-controls", 1000, {{0x0080, 0x009F}, small}},
        {"surrogates", 1000, {{0xD800, 0xDFFF}, small}},
    };
    return kinds;
}

std::u16string MakeText(const Kind& kind, Random& random) {
    std::u16string text(random.Below(7), u'\0');
    for (char16_t& unit : text) {
        const auto count = static_cast<uint32_t>(kind.ranges.size());
        const Range& range = kind.ranges[std::min(random.Below(count), random.Below(count))];
        unit = static_cast<char16_t>(range.first + random.Below(static_cast<uint32_t>(range.last - range.first) + 1u));
    }
    return text;
}

void PrintKind(const Kind& kind, uint64_t seed) {
    Random random(seed);
    std::vector<std::u16string> texts;
    for (uint32_t i = 0; i < kind.count; ++i) {
        texts.push_back(MakeText(kind, random));
    }
    std::vector<uint32_t> order(texts.size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(),
                     [&texts](uint32_t a, uint32_t b) { return Compare(texts[a], texts[b]) < 0; });
    std::printf("kind %s %u\n", kind.name, kind.count);
    for (size_t i = 0; i < order.size(); ++i) {
        const bool isEqual = i > 0 && Compare(texts[order[i - 1]], texts[order[i]]) == 0;
        std::printf("%u %c", order[i], isEqual ? '=' : '<');
        for (const char16_t unit : texts[order[i]]) {
            std::printf(" %04X", static_cast<unsigned int>(unit));
        }
        std::printf("\n");
    }
}

}  // namespace

int main() {
    uint64_t seed = 1;
    for (const Kind& kind : Kinds()) {
        PrintKind(kind, seed++);
    }
    return 0;
}
