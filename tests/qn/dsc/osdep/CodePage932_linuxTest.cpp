// What becomes of a conversion that ICU refuses.

#include "qn/dsc/osdep/CodePage932_linux.h"

#include <cstddef>
#include <cstdlib>
#include <new>

#include <gtest/gtest.h>
#include <unicode/uclean.h>

namespace {

using qn::dsc::osdep::CodePage932ToUnits;
using qn::dsc::osdep::UnitsToCodePage932;

constexpr int threwBadAlloc = 7;

void* AllocateNothing(const void*, size_t) {
    return nullptr;
}
void* ReallocateNothing(const void*, void*, size_t) {
    return nullptr;
}
void Free(const void*, void* block) {
    std::free(block);
}

// Ends the process, which is one of its own: ICU has no memory any more.
template <typename Conversion>
[[noreturn]] void ConvertWithoutMemory(Conversion conversion) {
    UErrorCode error = U_ZERO_ERROR;
    u_setMemoryFunctions(nullptr, AllocateNothing, ReallocateNothing, Free, &error);
    try {
        conversion();
    } catch (const std::bad_alloc&) {
        std::_Exit(threwBadAlloc);
    }
    std::_Exit(0);
}

TEST(CodePage932DeathTest, BytesAreABadAllocationWithoutMemory) {
    EXPECT_EXIT(ConvertWithoutMemory([] {
                    char16_t units[4];
                    CodePage932ToUnits("ab", units, 4);
                }),
                testing::ExitedWithCode(threwBadAlloc), "");
}

TEST(CodePage932DeathTest, UnitsAreABadAllocationWithoutMemory) {
    EXPECT_EXIT(ConvertWithoutMemory([] {
                    char bytes[4];
                    UnitsToCodePage932(u"ab", bytes, 4);
                }),
                testing::ExitedWithCode(threwBadAlloc), "");
}

}  // namespace
