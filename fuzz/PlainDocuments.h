#pragma once

// Which resource files read alike as a child of the root and, later, into the stub of that child.

#include <cctype>
#include <initializer_list>
#include <string>
#include <string_view>

namespace fuzz {

inline bool Contains(std::string_view text, std::initializer_list<std::string_view> words) {
    for (const std::string_view word : words) {
        if (text.find(word) != std::string_view::npos) {
            return true;
        }
    }
    return false;
}

// The bytes without blanks and letter case, so that words can be looked for.
inline std::string Squeezed(std::string_view bytes) {
    std::string squeezed;
    for (const char byte : bytes) {
        const auto unit = static_cast<unsigned char>(byte);
        if (unit > 0x20) {
            squeezed.push_back(static_cast<char>(std::tolower(unit)));
        }
    }
    return squeezed;
}

// The first start tag; empty if there is none.
inline std::string_view DocumentTag(std::string_view squeezed) {
    size_t open = squeezed.find('<');
    while (open != std::string_view::npos && open + 1 < squeezed.size() &&
           (squeezed[open + 1] == '?' || squeezed[open + 1] == '!')) {
        open = squeezed.find('<', squeezed.find('>', open));
    }
    if (open == std::string_view::npos) {
        return {};
    }
    return squeezed.substr(open, squeezed.find('>', open) - open);
}

// Whether every link is text alone: one with a name and elements in it ends the element around it.
inline bool HasPlainLinks(std::string_view squeezed) {
    constexpr std::string_view link = "<:link";
    for (size_t at = squeezed.find(link); at != std::string_view::npos; at = squeezed.find(link, at + 1)) {
        const size_t next = squeezed.find('<', at + 1);
        if (next == std::string_view::npos || squeezed.substr(next, 7) != "</:link") {
            return false;
        }
    }
    return true;
}

// False if in doubt. What reads differently, by the rules of the language:
// - a path that leads out of the document's own node finds other nodes there: the scan has read the files ahead of this
//   one in full, and a lookup can load the files behind it too;
// - on the document element of a stub, `names`, `prototype` and `type` have no effect;
// - an end tag too many, that of a value with elements in it, leaves the document's node for the root;
// - entries that the scan itself stamps on a node, or the cache keeps of it, that are set by the file otherwise.
inline bool IsPlain(std::string_view bytes) {
    // Other encodings, and characters that are written as numbers, can hide any of these.
    if (Contains(bytes, {std::string_view("\0", 1), "\xFE", "\xFF", "&#", "<!DOCTYPE", "<!ENTITY"})) {
        return false;
    }
    const std::string squeezed = Squeezed(bytes);
    const bool leadsOut =
        Contains(squeezed, {"..", "=\"/", "='/", ",/", "[/"}) || squeezed.find(">/") != std::string::npos;
    const bool popsEarly = Contains(squeezed, {"\"xml\"", "'xml'"}) || !HasPlainLinks(squeezed);
    const bool isStamped = Contains(squeezed, {"fpga_xmlsource", "targetxmlpath", "targetdir", ":deferredloadpath",
                                               "targetclassshortclassname", "xmlparseerrors"});
    const bool isOtherAsDocument = Contains(DocumentTag(squeezed), {"names=", "prototype=", "type=", "replace="});
    return !leadsOut && !popsEarly && !isStamped && !isOtherAsDocument;
}

}  // namespace fuzz
