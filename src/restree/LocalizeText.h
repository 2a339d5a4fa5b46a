#pragma once

#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

// `text` is a comma list of "code=text". Gives the text for the user's language (the last match for English if there
// is none for that language), a NUL, and the whole list; or the list alone if neither language is in it.
qn::dsc::String LocalizeText(std::u16string_view text);

}  // namespace zkhw
