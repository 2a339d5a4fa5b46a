#pragma once

// Names of a folder as Linux gives them, chosen by a pattern and put in listing order.

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qn::dsc::osdep {

// What names are to fit: "*" stands for any units, "?" for any one unit; blind to letter case.
class NamePattern {
  public:
    explicit NamePattern(std::u16string_view pattern);

    const std::u16string& Upper() const { return upper; }
    // False only if no name that ends as `native` fits. Spares most names the conversion to units.
    bool MayFit(std::string_view native) const;

  private:
    std::u16string upper;
};

class NameList {
  public:
    struct Name {
        // The first four units of the upper case, first unit highest: this decides most comparisons without the text.
        uint64_t start;
        // Where the units begin, and their upper case likewise.
        size_t offset;
        size_t length;
        // Where the bytes begin, with a NUL behind them.
        size_t nativeOffset;
        bool isMatch;
        bool isKept;
    };

    void Clear();
    // Adds a name that fits the pattern, or any if it `isKept` in any case.
    void Add(std::string_view native, const NamePattern& pattern, bool isKept);
    // In ascending order of the upper-cased units, from the name number `first` on.
    void Sort(size_t first);

    size_t Count() const { return names.size(); }
    const Name& At(size_t number) const { return names[number]; }
    std::u16string_view TextOf(const Name& name) const {
        return std::u16string_view(units).substr(name.offset, name.length);
    }
    const char* NativeOf(const Name& name) const { return natives.c_str() + name.nativeOffset; }

  private:
    std::u16string_view UpperOf(const Name& name) const {
        return std::u16string_view(upperUnits).substr(name.offset, name.length);
    }
    bool IsBefore(const Name& left, const Name& right) const;

    // All names one behind the other, and their upper case; both have the same offsets.
    std::u16string units;
    std::u16string upperUnits;
    std::string natives;
    std::vector<Name> names;
};

}  // namespace qn::dsc::osdep
