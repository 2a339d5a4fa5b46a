#pragma once

// Parameters of the resource language: "#{name}" in texts.

#include "restree/ParseFrame.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

class ParseStack;

// The attributes of all elements that are open in the top frame and below, of which the outermost wins, and
// "document-root". Without "name" and the loop variables of open `names`, which are filled in per copy.
ParameterMap CollectParameters(const ParseStack& stack);

// `text` with every "#{name}" that has a parameter replaced by its value, in one pass. An unknown one stays, without
// the blanks inside its braces; a "#{" that isn't closed stays with all that follows.
String ExpandVariables(const String& text, const ParameterMap& parameters);

// True if there is anything to expand.
inline bool HasVariables(const String& text) {
    return text.View().find(u"#{") != std::u16string_view::npos;
}

}  // namespace zkhw
