#include "support/StrayByte.h"

namespace zkhw {

// The default character of the code page, for each of them.
std::string StrayByte(unsigned char) {
    return "{FFFD}";
}

}  // namespace zkhw
