#pragma once

// Descriptions of boards as text, of any size, for the benchmarks of what reads and writes them.

#include <cstdint>
#include <memory>
#include <string>

#include "qn/dsc/StringBase.h"
#include "restree/ResTreeNode.h"

namespace bench {

// A board with `resources` plain resources of six values each.
inline std::string PlainBoard(int resources) {
    std::string text = "<?xml version=\"1.0\"?>\n<Target name=\"Board\">\n";
    for (int i = 0; i < resources; ++i) {
        const std::string number = std::to_string(i);
        text += "  <IOResource name=\"Line" + number + "\">\n    <Kind>digital</Kind>\n    <Pin>AB" + number +
                "</Pin>\n    <Bank>" + std::to_string(i % 16) +
                "</Bank>\n    <Standard>LVCMOS33</Standard>\n    <Label localize=\"true\">eng=Line " + number +
                ",jpn=\xE7\xB7\x9A " + number +
                "</Label>\n    <HelpPath>help/lines/digital.html</HelpPath>\n  </IOResource>\n";
    }
    return text + "</Target>\n";
}

// A prototype of twelve entries, and `instances` elements that name it.
inline std::string PrototypeBoard(int instances) {
    std::string text = "<Board><Prototypes><Line name=\"P\">";
    for (int i = 0; i < 10; ++i) {
        text += "<Value" + std::to_string(i) + ">#{Pin} of " + std::to_string(i) + "</Value" + std::to_string(i) + ">";
    }
    text += "<Options><Pull>none</Pull></Options></Line></Prototypes><Lines>";
    for (int i = 0; i < instances; ++i) {
        text += "<Line name=\"L" + std::to_string(i) + "\" prototype=\"#{document-root}/Prototypes/P\" Pin=\"A" +
                std::to_string(i) + "\"/>";
    }
    return text + "</Lines></Board>";
}

// One element with four values that `names` makes `copies` of.
inline std::string NamesBoard(int copies) {
    return "<Board><Bit names=\"Bit[i=1.." + std::to_string(copies) +
           "]\"><Index>#{i}</Index><Label>#{name} of the port</Label><Pull>up</Pull><Drive>12</Drive></Bit></Board>";
}

inline std::u16string Number(int64_t number) {
    const std::string digits = std::to_string(number);
    return std::u16string(digits.begin(), digits.end());
}

inline qn::dsc::String Wide(const std::string& utf8) {
    return qn::dsc::String::FromUtf8(utf8.data(), static_cast<uint32_t>(utf8.size()));
}

// A root that has read `text`.
inline std::unique_ptr<zkhw::ResTreeNode> Loaded(const std::string& text) {
    auto root = std::make_unique<zkhw::ResTreeNode>(u"", u"Root", false);
    root->LoadResourceText(Wide(text), true, nullptr);
    return root;
}

}  // namespace bench
