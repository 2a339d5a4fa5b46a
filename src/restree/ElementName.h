#pragma once

// The name of an element and what it means to the resource language.

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace zkhw {

class ElementName {
  public:
    // Empty: no element.
    bool IsEmpty() const { return length == 0; }
    void Clear() { length = 0; }

    // Takes a name from libexpat; one that can't be widened becomes empty. Throws bad_alloc.
    void Assign(std::string_view name);

    // Good until the next change.
    std::u16string_view Text() const { return {room.data(), length}; }

    // These stay as they are when the name is cleared.
    bool IsLink() const { return Has(Link); }
    bool IsInclude() const { return Has(Include); }
    bool IsReserves() const { return Has(Reserves); }
    bool EndsInPathOrDir() const { return Has(PathOrDir); }
    bool EndsInList() const { return Has(List); }

  private:
    enum Meaning : uint8_t { None = 0, Link = 1, Include = 2, Reserves = 4, PathOrDir = 8, List = 16 };

    bool Has(Meaning meaning) const { return (meanings & meaning) != 0; }
    static Meaning MeaningOfAscii(std::string_view name);
    uint8_t MeaningsByCompare() const;

    // Nearly every name ends as that of an entry or a type, so it is widened where it comes in. The room stays for the
    // next one, and its size has nothing to do with the length.
    std::u16string room;
    size_t length = 0;
    uint8_t meanings = None;
};

}  // namespace zkhw
