// Brackets that don't match, objects that outlive what they were made from, what is given back twice, names and paths
// that stand for something else.

#include "misuse/MisuseTest.h"

namespace {

const std::string withoutA = Now("S{Height=7,Label=Name;" + slotB + "}T{;}");
const std::string voidView = "counts 2 1 0";

// An EndChange too many is made good by a BeginChange: until then notices wait.
Expectations OfBrackets() {
    return {
        Answers("EndChange unmatched, then BeginChange",
                "00000000\n00000000\n00000000 pending 00000004\nnotice 00000004\n00000001"),
        Answers("EndChange unmatched twice, then BeginChange twice",
                "00000000\n00000000\n00000000 pending 00000000\n00000000 pending 00000004\nnotice 00000004"),
        Answers("EndChange twice for one BeginChange",
                "00000000 pending 00000000\nnotice 00000004\n00000000\n00000000\n00000000 pending 00000004"),
        Answers("EndChange unmatched in a notice", "notice 00000004\n00000000\nnotice 00000004"),
        Answers("EndChange unmatched, then the node is removed", "00000000\n00000000\nobserver 0" + Now("T{;}")),
        Answers("BeginChange unmatched, then the node is removed",
                "00000000 pending 00000000\n00000000\nobserver 0" + Now("T{;}")),
        Answers("BeginChange 100000 times", "notice 00000004\nnotice 00000004"),
    };
}

Expectations OfCopies() {
    return {
        Answers("copy released before views of it", "copy 0\n" + voidView + "\n" + voidView + "\n" + voidView),
        Answers("copy released before a view with a registration", "copy 0, observer 0\n" + voidView),
        Answers("copy released while a registration holds it",
                "copy 1\nnotice 00000004 id 5\n00000000\n00000000 observer 0"),
        Answers("copy of a copy outlives it", "copy 0\n" + shelfS + "\ncopy 0"),
        Answers("copy outlives its original", shelfS + "\ncopy 0" + Now("T{;}")),
        Answers("copy counted while it ends", "counted\ncopy 0\n" + voidView),
    };
}

Expectations OfRemovals() {
    return {
        Answers("view of a removed node", "00000000\n" + voidView + withoutA),
        Answers("view below a removed node", "00000000\n" + voidView + withoutA),
        Answers("view of a replaced node",
                "00000000\n" + voidView + Now("S{Height=7,Label=Name;A{;}" + slotB + "}T{;A{;}}")),
        Answers("RemoveEntry twice", "00000000\n00000000" + withoutA),
        Answers("Unadvise twice", "00000000 0\n00000000 0\n00000000 0"),
        Answers("Unreserve twice", "00000000\n00000001"),
        Traps("Release of a selector"),
    };
}

// The tree ends after the host's last word.
Expectations OfExits() {
    return {
        Answers("views left at the exit", "left"),
        {"registrations left at the exit", "answers\nnotice 00000001 id 0\n"},
        {"registrations left at the exit, whose observer removes nodes", "answers\nnotice 00000001 id 0\n00000000\n"},
        {"registrations left at the exit, whose observer ends them", "answers\nnotice 00000001 id 0\n00000000\n"},
        Answers("copy left at the exit", shelfS),
    };
}

Expectations OfWrongKinds() {
    return {
        Answers("SetProperty of a child", "00000000"),
        Answers("SetProperty of a link", "00000000"),
        Answers("GetProperty of a child", "00000001"),
        Answers("GetProperty of a link", "00000001"),
        Answers("IsLocalizedProperty of a child", "00000001"),
        Answers("IsLocalizedProperty of a plain property", "00000001"),
        Answers("FindNode of a property", "00000001"),
        Answers("FindNode through a property", "00000001 @S number=00000000 flag=0"),
        Answers("RemoveEntry of a link", "00000000" + Now(shelfS + "T{;}")),
        // Its entry is lost.
        Answers("SetName to the name of a sibling", "00000001" + Now("S{Height=7,Label=Name;" + slotA + "}" + shelfT)),
        // What stood in front of the fault has been read.
        Answers("LoadContent of what isn't well formed",
                "80004005" + Now("S{Height=7,Label=Name,Made=1,XMLParseErrors=Error on line 1 at column 48|"
                                 "   mismatched tag|   <Shelf name=\"S\" ordered=\"false\"><Made>1</Made></Oops>"
                                 "</Shelf>|;" +
                                 slotA + slotB + "}" + shelfT)),
        Answers("IsCompatibleWith itself", "00000000 flag=1"),
        Answers("Reserve with a property in Reserves", "00000000 number=00000002\n00000000"),
        Answers("Reserve with a path that leads nowhere in Reserves", "00000000 number=00000002\n00000000"),
        Answers("Reserve with the node itself in Reserves", "00000000 number=00000002\n00000000"),
        Answers("ResolveReservations of an owner that is no GUID",
                "threw" + Now("S{Height=7,Label=Name,ZKHWReservation=me:=r;" + slotA + slotB + "}" + shelfT)),
    };
}

Expectations OfHosts() {
    return {
        Answers("FPGAResTree_GetProperty of a node", "00000000 found=0"),
        Answers("FPGAResTree_GetProperty of nothing", "00000000 found=0"),
        Answers("FPGAResTree_GetDescendantNames of a property", "00000000 [] found=0"),
        Answers("FPGAResTree_GetMultipleProperties of a property", "00000000 [] found=0"),
        Traps("FPGAResTree_Dump of a property"),
        Traps("FPGAResTree_Dump of nothing"),
        Traps("FPGAResTree_Dump of the empty path"),
        Answers("owner of an item without a project", "80004005 null"),
        Answers("owner of an item whose project fails", "8007000e null"),
        Answers("owner of a context without the node interface", "00000000 object\n80004002"),
        Traps("owner of a context that gives no object", "00000000 object"),
    };
}

// The memory that crosses the boundary is the system's on Windows, which doesn't trap.
Expectations OfStringsAsOnlyLinuxOwnsTheMemory() {
    Expectations all = {Traps("SysFreeString of task memory")};
    // Under the address checker it is that which ends the process.
    if (FREED_MEMORY_IS_WATCHED == 0) {
        all.push_back(Traps("SysFreeString twice"));
        all.push_back(Traps("SysStringLen of a freed string"));
    }
    return all;
}

}  // namespace

Expectations SequenceExpectations() {
    Expectations all;
    for (const Expectations& each : {OfBrackets(), OfCopies(), OfRemovals(), OfExits(), OfWrongKinds(), OfHosts()}) {
        all.insert(all.end(), each.begin(), each.end());
    }
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfSequences, Misuse, testing::ValuesIn(SequenceExpectations()), TestName);
INSTANTIATE_TEST_SUITE_P(AsOnlyLinuxOwnsTheMemory, Misuse, testing::ValuesIn(OfStringsAsOnlyLinuxOwnsTheMemory()),
                         TestName);
