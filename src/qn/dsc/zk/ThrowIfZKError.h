#pragma once

// Error codes of the host as exceptions. 0 is success; what any other code means is the host's to say.

#include <cstdint>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"

namespace qn::dsc::zk {

// The text begins with the code in both forms, "Error Code: -1 (ffffffff): ".
class ZKErrorException : public exception::Exception {
  public:
    // Goes on with the host's words for `code`, which the host must be there to give (HostErrorText.h).
    explicit ZKErrorException(int32_t code);

    // Goes on with `text`; null counts as empty. Asks nothing of the host.
    ZKErrorException(int32_t code, const char* text);

    const char* what() const noexcept override;

    // The host's code.
    int32_t GetErrorCode() const override;

  private:
    NarrowString message;
    int32_t code;
};

// Nothing if `code` is 0; otherwise throws the exception of that code, with the host's words or the caller's.
// The place of the throw is this unit, whoever calls.
void ThrowIfZKError(int32_t code);
void ThrowIfZKError(int32_t code, const char* text);

}  // namespace qn::dsc::zk
