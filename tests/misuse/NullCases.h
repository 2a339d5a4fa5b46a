#pragma once

// One case for each argument of an operation that is a pointer: all arguments are good but this one, which is null. Its
// name is "Scope::Operation argument".

#include <string>
#include <tuple>
#include <type_traits>
#include <utility>

#include "misuse/MisuseHost.h"

namespace misuse {

// Where operations store what they give.
struct Outputs {
    static constexpr ULONG untouched = 0xCDCDCDCD;

    ULONG count = untouched;
    ULONG otherCount = untouched;
    ULONG number = untouched;
    BOOL flag = -77;
    BSTR text = nullptr;
    BSTR* texts = nullptr;
    BSTR* displays = nullptr;
    IzkhwResourceTreeNode* node = nullptr;
    IzkhwResourceTreeNode** nodes = nullptr;
    IUnknown** items = nullptr;
};

// A case has a process of its own, so one will do.
inline Outputs outputs;

// What was given, in words, and given back: all that isn't as at first.
std::string TakeOutputs();

// Says the result of an operation, and unless it has failed what it gave.
void SayResult(HRESULT result);

template <typename Type>
concept Pointer = std::is_pointer_v<Type>;

// `Call` takes the operation's arguments and says what came of it. `names` are those of the arguments, all of them.
template <size_t Index, typename Call, typename... Arguments>
void AddNullAt(Cases& cases, const std::string& operation, const char* const* names, bool needsRuntime, Call call,
               const std::tuple<Arguments...>& good) {
    if constexpr (Index < sizeof...(Arguments)) {
        using Argument = std::tuple_element_t<Index, std::tuple<Arguments...>>;
        if constexpr (Pointer<Argument>) {
            cases[operation + " " + names[Index]] = {[call, good] {
                                                         auto arguments = good;
                                                         std::get<Index>(arguments) = nullptr;
                                                         std::apply(call, arguments);
                                                     },
                                                     needsRuntime};
        }
        AddNullAt<Index + 1>(cases, operation, names, needsRuntime, call, good);
    }
}

// The cases of an operation of an interface. `object` gives the object when the case runs.
template <typename Interface, typename Object, typename... Parameters>
void AddNulls(Cases& cases, const std::string& operation, Object* (*object)(),
              HRESULT (STDMETHODCALLTYPE Interface::*method)(Parameters...),
              const char* const (&names)[sizeof...(Parameters)], std::type_identity_t<Parameters>... good) {
    const auto call = [object, method](Parameters... arguments) { SayResult((object()->*method)(arguments...)); };
    AddNullAt<0>(cases, operation, names, false, call, std::tuple<Parameters...>(good...));
}

}  // namespace misuse
