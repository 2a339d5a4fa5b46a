// What an observer takes away in its call is gone, and the operation that it was called out of has its ordinary result:
// "may remove the node, end this and other registrations, and give back the last reference to anything".

#include <map>

#include "misuse/MisuseTest.h"

namespace {

const std::string itemKey = "{11223344-5566-7788-99AA-BBCCDDEEFF00}";

const std::string endsRegistration = ", ends its registration";
const std::string givesViewsBack = ", gives the last references to its views back";
const std::string removesNode = ", removes its node";
const std::string removesParent = ", removes the parent of all";
const std::string endsCopy = ", ends the copy that it hears of";

const std::string done = "00000000 observer gone";
const std::string copyEnded = "00000000 copy 0 observer gone";

// The link of T leads to what stands at the place of A.
std::string WithSlot(const std::string& a) {
    return Now("S{Height=7,Label=Name;" + a + slotB + "}T{;" + a + "}");
}

const std::string nowWithoutA = Now("S{Height=7,Label=Name;" + slotB + "}T{;}");
const std::string nowWithoutS = Now("T{;}");
const std::string nowWithoutQ = WithSlot("A{Width=1;}");

// By operations: what they leave if the observer takes nothing away but itself.
const std::map<std::string, std::string> heardAtA = {
    {"SetProperty", WithSlot("A{Width=5;Q{Speed=9;}}")},
    {"SetPropertyAt", WithSlot("A{Width=5;Q{Speed=9;}}")},
    {"LoadContent", WithSlot("A{Made=1,Width=1;Q{Speed=9;}}")},
    {"RemoveEntry", WithSlot("A{;Q{Speed=9;}}")},
    {"SetName", Now("S{Height=7,Label=Name;" + slotB + "U{Width=1;Q{Speed=9;}}}T{;}")},
    {"Reserve", WithSlot("A{Width=1,ZKHWReservation=me:=r;Q{Speed=9;}}")},
    {"Unreserve", ""},
    {"ReserveForItem", WithSlot("A{Width=1,ZKHWReservation=" + itemKey + ":=r;Q{Speed=9;}}")},
    {"UnreserveForItem", ""},
    {"EndChange", WithSlot("A{Width=5;Q{Speed=9;}}")},
};
const std::map<std::string, std::string> heardAtQ = {
    {"ReserveDescendants", WithSlot("A{Width=1;Q{Speed=9,ZKHWReservation=me:=r;}}")},
    {"UnreserveDescendants", ""},
    {"ReserveDescendantsForItem", WithSlot("A{Width=1;Q{Speed=9,ZKHWReservation=" + itemKey + ":=r;}}")},
    {"UnreserveDescendantsForItem", ""},
};

void AppendOperation(Expectations& all, const std::string& operation, const std::string& effect,
                     const std::string& nowWithoutNode) {
    all.push_back(Answers(operation + endsRegistration, done + effect));
    all.push_back(Answers(operation + givesViewsBack, done + effect));
    all.push_back(Answers(operation + removesNode, done + nowWithoutNode));
    all.push_back(Answers(operation + removesParent, done + nowWithoutS));
    all.push_back(Answers(operation + endsCopy, copyEnded));
}

}  // namespace

Expectations NoticeExpectations() {
    Expectations all;
    for (const auto& [operation, effect] : heardAtA) {
        AppendOperation(all, operation, effect, nowWithoutA);
    }
    for (const auto& [operation, effect] : heardAtQ) {
        AppendOperation(all, operation, effect, nowWithoutQ);
    }
    for (const char* const notice :
         {"NodeDeleting of A", "NodeDeleted of A", "NodeDeleting of Q", "NodeDeleted of Q"}) {
        AppendOperation(all, notice, nowWithoutA, nowWithoutA);
    }
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfNotices, Misuse, testing::ValuesIn(NoticeExpectations()), TestName);
