#pragma once

// The system's record of why a call failed, and its texts: a number of the calling thread, which is only good until the
// next call into the system.

#include <cstdint>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// Error numbers that this code sets itself.
constexpr uint32_t systemErrorFileNotFound = 2;
constexpr uint32_t systemErrorPathNotFound = 3;
constexpr uint32_t systemErrorAccessDenied = 5;
constexpr uint32_t systemErrorNotEnoughMemory = 8;
constexpr uint32_t systemErrorGeneralFailure = 31;
constexpr uint32_t systemErrorInvalidParameter = 87;
constexpr uint32_t systemErrorNoMapping = 1113;

// The calling thread's last error number; 0 if there was none.
uint32_t LastSystemError();

// Records `number` as the calling thread's last error.
void SetLastSystemError(uint32_t number);

// The number that stands for the errno number `posixError`; systemErrorGeneralFailure if there is no better one.
uint32_t SystemErrorOf(int posixError);

// Puts the system's own text for `number` into `text`: it ends in a full stop and a line break. False, and `text` is as
// it was, if there is none.
bool GetSystemMessage(uint32_t number, NarrowString& text);

}  // namespace qn::dsc::osdep
