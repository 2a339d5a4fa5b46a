#pragma once

// What scripts/mutate builds changes of the sources in with. It is included in front of every file of such a build, and
// read by nothing else. ZKFPGA_MUTANT is the number of the change that a process makes, and ZKFPGA_MUTANTS_REACHED a
// file in which the bytes of those numbers are set that a run came by.

#include <fcntl.h>
#include <stdlib.h>
#include <sys/mman.h>
#include <unistd.h>

#include <type_traits>
#include <utility>

namespace mutants {

inline constinit int chosen = -1;
inline constinit unsigned char own[65536] = {};
inline constinit unsigned char* reached = own;
inline constinit bool isReady = false;

[[gnu::constructor(101)]] static void Begin() {
    if (isReady) {
        return;
    }
    isReady = true;
    if (const char* number = getenv("ZKFPGA_MUTANT"); number != nullptr) {
        chosen = atoi(number);
    }
    if (const char* path = getenv("ZKFPGA_MUTANTS_REACHED"); path != nullptr) {
        const int file = open(path, O_RDWR | O_CLOEXEC);
        void* pages = mmap(nullptr, sizeof(own), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
        if (pages != MAP_FAILED) {
            reached = static_cast<unsigned char*>(pages);
        }
        close(file);
    }
}

// Whether the change of this number is to be made. What the compiler works out is never changed.
constexpr bool Is(int number) {
    if (std::is_constant_evaluated()) {
        return false;
    }
    reached[number] = 1;
    return chosen == number;
}

#define MUTANTS_BINARY(name, sign, other)                              \
    template <typename A, typename B>                                  \
        requires requires(A&& a, B&& b) {                              \
            a sign b;                                                  \
            a other b;                                                 \
        }                                                              \
    constexpr auto name(int number, A&& a, B&& b) {                    \
        return Is(number) ? (a other b) : (a sign b);                  \
    }

MUTANTS_BINARY(Times, *, +)
MUTANTS_BINARY(Over, /, *)
MUTANTS_BINARY(Rest, %, /)
MUTANTS_BINARY(Plus, +, -)
MUTANTS_BINARY(Minus, -, +)
MUTANTS_BINARY(Left, <<, >>)
MUTANTS_BINARY(Right, >>, <<)
MUTANTS_BINARY(Less, <, <=)
MUTANTS_BINARY(LessOrEqual, <=, <)
MUTANTS_BINARY(Greater, >, >=)
MUTANTS_BINARY(GreaterOrEqual, >=, >)
MUTANTS_BINARY(Equal, ==, !=)
MUTANTS_BINARY(NotEqual, !=, ==)
MUTANTS_BINARY(And, &, |)
MUTANTS_BINARY(Either, ^, &)
MUTANTS_BINARY(Or, |, &)

#define MUTANTS_ASSIGNMENT(name, sign, other)                          \
    template <typename A, typename B>                                  \
        requires requires(A& a, B&& b) {                               \
            a sign b;                                                  \
            a other b;                                                 \
        }                                                              \
    constexpr A& name(int number, A& a, B&& b) {                       \
        if (Is(number)) {                                              \
            a other b;                                                 \
        } else {                                                       \
            a sign b;                                                  \
        }                                                              \
        return a;                                                      \
    }

MUTANTS_ASSIGNMENT(Add, +=, -=)
MUTANTS_ASSIGNMENT(Subtract, -=, +=)
MUTANTS_ASSIGNMENT(Multiply, *=, +=)
MUTANTS_ASSIGNMENT(Divide, /=, *=)
MUTANTS_ASSIGNMENT(Join, |=, &=)
MUTANTS_ASSIGNMENT(Mask, &=, |=)
MUTANTS_ASSIGNMENT(Flip, ^=, |=)
MUTANTS_ASSIGNMENT(ShiftLeft, <<=, >>=)
MUTANTS_ASSIGNMENT(ShiftRight, >>=, <<=)

#define MUTANTS_STEP(name, sign, other)                                \
    template <typename A>                                              \
        requires requires(A& a) {                                      \
            sign a;                                                    \
            other a;                                                   \
        }                                                              \
    constexpr A& name(int number, A& a) {                              \
        return Is(number) ? other a : sign a;                          \
    }                                                                  \
    template <typename A>                                              \
        requires requires(A& a) {                                      \
            a sign;                                                    \
            a other;                                                   \
        }                                                              \
    constexpr A name##After(int number, A& a) {                        \
        return Is(number) ? a other : a sign;                          \
    }

MUTANTS_STEP(Up, ++, --)
MUTANTS_STEP(Down, --, ++)

// Another result: the opposite, one more, or null.
template <typename A>
    requires std::is_arithmetic_v<std::remove_cvref_t<A>> || std::is_pointer_v<std::remove_cvref_t<A>>
constexpr auto Another(int number, A&& a) {
    using Result = std::remove_cvref_t<A>;
    if constexpr (std::is_same_v<Result, bool>) {
        return Is(number) != a;
    } else if constexpr (std::is_pointer_v<Result>) {
        return Is(number) ? Result{} : Result{a};
    } else {
        return static_cast<Result>(a + (Is(number) ? 1 : 0));
    }
}

}  // namespace mutants
