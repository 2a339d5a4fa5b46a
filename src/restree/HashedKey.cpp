#include "restree/HashedKey.h"

#include <cstring>

namespace zkhw::detail {

uint8_t HashKeyAtRunTime(std::u16string_view key) {
    return HashKeyBy(key, [](const char16_t* units) {
        // The first unit in the lowest bits, as on every machine that this runs on.
        uint64_t word;
        std::memcpy(&word, units, sizeof(word));
        return word;
    });
}

}  // namespace zkhw::detail
