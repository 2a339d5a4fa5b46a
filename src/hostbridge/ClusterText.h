#pragma once

// Texts of the host's flattened data form. Names and values are escaped without regard to quotes (XmlEscape.h).

#include "qn/dsc/StringBase.h"

namespace zkhw {

// "<String><Name>", the name, "</Name><Val>", the value, "</Val></String>".
qn::dsc::String MakeStringElement(const qn::dsc::String& value, const qn::dsc::String& name);

// A cluster without a name of its own, of two string elements: "name" with the name, then "value" with the value.
// Replaces what was in `result`.
void MakeNameValueCluster(const qn::dsc::String& name, const qn::dsc::String& value, qn::dsc::String& result);

// A cluster without a name of its own, of three string elements: "resource", "alias" and "display name".
qn::dsc::String MakeResourceCluster(const qn::dsc::String& resource, const qn::dsc::String& alias,
                                    const qn::dsc::String& displayName);

}  // namespace zkhw
