// 0, 1 and the greatest for every number that goes in.

#include <array>

#include "misuse/MisuseTest.h"

namespace {

const std::array<std::string, 4> values = {"00000000", "00000001", "7fffffff", "ffffffff"};

void AppendEach(Expectations& all, const std::string& argument, const std::array<std::string, 4>& answers) {
    for (size_t i = 0; i < values.size(); ++i) {
        all.push_back(Answers(argument + "=" + values[i], answers[i]));
    }
}

void AppendProperties(Expectations& all) {
    AppendEach(all, "IzkhwResourceTreeNode::GetPropertyAt index",
               {"00000000 \"7\"", "00000000 \"Name\"", "00000001", "00000001"});
    // Localised ones aren't counted.
    AppendEach(all, "IzkhwResourceTreeNode::SetPropertyAt index",
               {"00000000" + Now("S{Height=8,Label=Name;" + slotA + slotB + "}" + shelfT), "00000001", "00000001",
                "00000001"});
}

std::string ShelfHeld(const std::string& text) {
    return Now("S{Height=7,Label=Name,ZKHWReservation=" + text + ";" + slotA + slotB + "}" + shelfT);
}

std::string SlotsHeld(const std::string& text) {
    const std::string held = ",ZKHWReservation=" + text;
    const std::string a = "A{Width=1" + held + ";Q{Speed=9;}}";
    return Now("S{Height=7,Label=Name;" + a + "B{Width=2" + held + ";}}T{;" + a + "}");
}

// Bits without a meaning are kept. Without any there is nothing to hold.
void AppendModes(Expectations& all) {
    const std::string me = "me:=";
    const std::string item = "{11223344-5566-7788-99AA-BBCCDDEEFF00}:=";
    for (const auto& [operation, owner] : {std::pair{"IzkhwResourceTreeNode::Reserve mode", me},
                                           {"IzkhwResourceTreeNode5::ReserveForItem mode", item}}) {
        AppendEach(all, operation,
                   {"00000001 number=00000000", "00000000 number=00000001" + ShelfHeld(owner + "r"),
                    "00000000 number=7fffffff" + ShelfHeld(owner + "!wr"),
                    "00000000 number=ffffffff" + ShelfHeld(owner + "!wr")});
    }
    for (const auto& [operation, owner] : {std::pair{"IzkhwResourceTreeNode::ReserveDescendants mode", me},
                                           {"IzkhwResourceTreeNode5::ReserveDescendantsForItem mode", item}}) {
        AppendEach(all, operation,
                   {"00000001", "00000000" + SlotsHeld(owner + "r"), "00000000" + SlotsHeld(owner + "!wr"),
                    "00000000" + SlotsHeld(owner + "!wr")});
    }
}

std::string Notice(const std::string& changes, const std::string& id) {
    return "notice " + changes + " id " + id + "\n";
}

void AppendChanges(Expectations& all) {
    const std::string ok = "00000000\n";
    const std::string gone = "observer 0";
    const std::string heard = ok + Notice("00000004", "00000005") + ok + gone;
    AppendEach(all, "IzkhwResourceTreeNode::Advise mask", {ok + ok + gone, ok + ok + gone, heard, heard});
    for (const std::string& id : values) {
        all.push_back(Answers("IzkhwResourceTreeNode::Advise id=" + id, ok + Notice("00000004", id) + ok + gone));
    }
    // The registration has the id 5.
    const std::string stillHeard = ok + Notice("00000004", "00000005") + gone;
    AppendEach(all, "IzkhwResourceTreeNode::Unadvise id", {stillHeard, stillHeard, stillHeard, ok + gone});
    // All flags are delivered, those without a meaning too; then none wait.
    all.push_back(Answers("IzkhwResourceTreeNode::EndChange flags=00000000", ok + ok + "00000001"));
    for (const char* const flags : {"00000001", "7fffffff", "ffffffff"}) {
        all.push_back(Answers(std::string("IzkhwResourceTreeNode::EndChange flags=") + flags,
                              ok + Notice(flags, "00000005") + ok + "00000001"));
    }
}

// Of the names that are handed in only so many count.
void AppendFilters(Expectations& all) {
    const std::string none = "00000000 \"|<Shelf name=\"S\">|</Shelf>\"";
    const std::string withA = "00000000 \"|<Shelf name=\"S\">|   <Slot name=\"A\">|   </Slot>|</Shelf>\"";
    const std::string withHeight = "00000000 \"|<Shelf name=\"S\">|   <Height>7</Height>|</Shelf>\"";
    for (const std::string operation :
         {"IzkhwResourceTreeNode3::GetFilteredXml", "IzkhwResourceTreeNode4::GetFilteredXmlEx",
          "IzkEIOGResourceTree2::GetFilteredXml"}) {
        all.push_back(Answers(operation + " nodeNameCount=00000000", none));
        all.push_back(Answers(operation + " nodeNameCount=00000001", withA));
        all.push_back(Answers(operation + " propertyNameCount=00000000", none));
        all.push_back(Answers(operation + " propertyNameCount=00000001", withHeight));
    }
    all.push_back(Answers("IzkhwResourceTreeNode4::GetFilteredXmlEx null among the names", none));
}

void AppendExports(Expectations& all) {
    for (const std::string& value : values) {
        all.push_back(Answers("ZkhwResTree_GetNode refNum=" + value, "00000001\n55"));
        all.push_back(Answers("SetZKRTTLSIndexHook index=" + value, "done"));
    }
    const Expectations others = {
        Answers("SetZKRTTLSIndex index=ffffffff", "done"),
        Answers("CoTaskMemAlloc size=00000000", "block"),
        Answers("CoTaskMemAlloc size=00000001", "block"),
        Answers("CoTaskMemAlloc size=max", "null"),
        Answers("CoTaskMemRealloc size=00000000", "null"),
        Answers("CoTaskMemRealloc size=00000001", "block a"),
        Answers("CoTaskMemRealloc size=max", "null, and the block still a"),
        Answers("SysAllocStringLen length=00000000", "length 0"),
        Answers("SysAllocStringLen length=00000001", "length 1"),
        // One byte more than the string's length can tell.
        Answers("SysAllocStringLen length=80000000", "null"),
        Answers("SysAllocStringLen length=ffffffff", "null"),
    };
    all.insert(all.end(), others.begin(), others.end());
}

}  // namespace

Expectations NumberExpectations() {
    Expectations all;
    AppendProperties(all);
    AppendModes(all);
    AppendChanges(all);
    AppendFilters(all);
    AppendExports(all);
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfNumbers, Misuse, testing::ValuesIn(NumberExpectations()), TestName);
