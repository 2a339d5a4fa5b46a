#pragma once

// The user's collation through ICU, as Compare needs it.

#include <memory>
#include <string_view>

struct UCollator;

namespace qn::dsc::osdep {

// One collation, fitted to the order that ASCII has everywhere. After construction it is never changed, so any number
// of threads may compare with it.
class Collation {
  public:
    // The collation of the ICU locale `locale` ("" and "en_US_POSIX", ICU's name for "C" and "POSIX", are the root
    // collation). Languages that order some ASCII letters in their own way (Estonian "z", Lithuanian "y") get the root
    // collation; those that take two ASCII letters for one (Czech "ch") keep their order but for these pairs.
    explicit Collation(const char* locale);
    ~Collation();

    Collation(const Collation&) = delete;
    Collation& operator=(const Collation&) = delete;

    // Compare by this collation, with no short cut for ASCII. 0 if there is no collation or it fails. Linear.
    int Compare(std::u16string_view a, std::u16string_view b) const;

  private:
    struct Closer {
        void operator()(UCollator* opened) const;
    };
    using Handle = std::unique_ptr<UCollator, Closer>;

    // Null if the locale's own order does not fit, or ICU fails.
    static Handle OpenFitting(const char* locale);
    static Handle OpenWithRules(std::u16string_view rules);

    // Null: ICU could not open even its root collation.
    Handle collator;
    // Canadian French. ICU leaves out what two texts have in common at their front, which with accents that count from
    // the end puts texts with characters that do not count at all out of order; sort keys are right.
    bool accentsFromTheEnd = false;
};

// Whether the user's collation has been opened by some comparison.
bool IsUserCollationOpen();

}  // namespace qn::dsc::osdep
