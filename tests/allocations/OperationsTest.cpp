// Every operation of the interfaces and every exported function, with each allocation of a call failing in turn, alone
// and with all behind it: of texts, of nodes, of views, of the boundary's strings and arrays, of the parser, and of the
// ordinary heap. What comes of it stands in the tables (*Operations.cpp), written from the headers. Nothing may change
// that the headers don't say changes, and once memory is there again, the same tree has to give the answer of a tree
// that never was without.

#include <gtest/gtest.h>

#include <algorithm>
#include <new>
#include <set>

#include "allocations/Operation.h"
#include "interfaces/support/HostMemory.h"
#include "support/AllocationFaultScope.h"
#include "support/PublicHeaders.h"

namespace allocations {
namespace {

using Names = std::set<std::string>;

bool BeginsWith(const std::string& text, const std::string& beginning) {
    return text.compare(0, beginning.size(), beginning) == 0;
}

std::string Ask(Scene& scene) {
    scene.GetReady();
    const HRESULT result = scene.Call();
    return zkhw::ResultName(result) + scene.Take();
}

// The states that a tree can be in: before the call, with its file read, and behind the call.
struct States {
    States(const Operation& operation, Contents contents) {
        const auto scene = operation.make(contents);
        untouched = scene->State();
        rest = scene->Rest();
        answer = contents == Contents::InFile ? operation.answerFromFile : operation.answer;
        EXPECT_EQ(Ask(*scene), answer);
        done = scene->State();
    }

    std::string untouched;
    std::string rest;
    std::string done;
    // In the state `untouched`.
    std::string answer;
};

class Trial {
  public:
    Trial(const Operation& operation, Contents contents, bool fromThenOn)
        : operation(operation), contents(contents), fromThenOn(fromThenOn), states(operation, contents) {}

    // Gives how many allocations failed.
    uint64_t Run() {
        uint64_t nth = 1;
        while (FailAt(nth) && !testing::Test::HasFatalFailure()) {
            ++nth;
        }
        return nth - 1;
    }

    Names outcomes;

  private:
    bool IsAllowed(const std::string& outcome) const {
        const auto& list = operation.withoutMemory;
        if (outcome == operation.answer || std::find(list.begin(), list.end(), outcome) != list.end()) {
            return true;
        }
        // Of a file that couldn't be read, or only in part, there is less to tell.
        return contents == Contents::InFile &&
               (BeginsWith(outcome, "S_") || outcome == "bad_alloc" || outcome == "bad_alloc []" ||
                outcome == "bad_alloc [] []" || outcome == "bad_alloc null" || outcome == "bad_alloc null 0");
    }

    // False if the call needs no `nth` allocation.
    bool FailAt(uint64_t nth) {
        SCOPED_TRACE("allocation " + std::to_string(nth) + (fromThenOn ? " and all behind it" : "") +
                     (contents == Contents::InFile ? ", contents in a file" : ""));
        if (scene == nullptr || operation.effect != Effect::None || contents == Contents::InFile) {
            scene = operation.make(contents);
        }
        scene->GetReady();
        std::string outcome;
        HRESULT result = S_OK;
        bool wasReached = false;
        bool hasThrown = false;
        {
            const support::AllocationFaultScope fault(nth, fromThenOn);
            try {
                result = scene->Call();
            } catch (const std::bad_alloc&) {
                hasThrown = true;
            }
            wasReached = qn::dsc::osdep::AllocationCount() >= nth;
        }
        outcome = (hasThrown ? thrown : zkhw::ResultName(result)) + scene->Take();
        if (!wasReached) {
            EXPECT_EQ(outcome, states.answer);
            return false;
        }
        outcomes.insert(outcome);
        EXPECT_TRUE(IsAllowed(outcome)) << outcome;
        CheckTree(outcome);
        return true;
    }

    bool MayStopHalfway() const {
        return contents == Contents::InFile || operation.effect == Effect::Stepwise ||
               operation.effect == Effect::Lasting || (operation.effect == Effect::TakenBack && fromThenOn);
    }

    void CheckTree(const std::string& outcome) {
        const std::string state = scene->State();
        const bool isKnown = state == states.untouched || state == states.done;
        if (operation.effect == Effect::None) {
            EXPECT_EQ(scene->Rest(), states.rest);
        }
        EXPECT_TRUE(isKnown || MayStopHalfway()) << state;
        if (outcome == operation.answer && contents == Contents::InMemory) {
            EXPECT_EQ(state, states.done);
        }
        // Once more, with memory.
        const std::string answer = Ask(*scene);
        if (state == states.untouched) {
            EXPECT_EQ(answer, states.answer);
        } else if (isKnown && operation.effect == Effect::None) {
            EXPECT_EQ(answer, operation.answer);
        } else {
            EXPECT_TRUE(BeginsWith(answer, "S_OK") || BeginsWith(answer, "S_FALSE")) << answer;
        }
        if (state == states.untouched || (operation.effect != Effect::Lasting && contents == Contents::InMemory)) {
            EXPECT_EQ(scene->State(), states.done);
        }
    }

    const Operation& operation;
    const Contents contents;
    const bool fromThenOn;
    const States states;
    std::unique_ptr<Scene> scene;
};

using OperationsOutOfMemory = testing::TestWithParam<Operation>;

TEST_P(OperationsOutOfMemory, EndInOrder) {
    uint64_t failures = 0;
    for (const bool fromThenOn : {false, true}) {
        failures += Trial(GetParam(), Contents::InMemory, fromThenOn).Run();
        if (!GetParam().answerFromFile.empty()) {
            failures += Trial(GetParam(), Contents::InFile, fromThenOn).Run();
        }
    }
    RecordProperty("failures", std::to_string(failures));
}

// That the tables say nothing that never comes up. On Windows the boundary's memory is the system's: it can't be made
// to fail.
TEST_P(OperationsOutOfMemory, GiveEachOutcomeAsOnlyLinuxOwnsTheMemory) {
    Names outcomes;
    for (const bool fromThenOn : {false, true}) {
        Trial trial(GetParam(), Contents::InMemory, fromThenOn);
        trial.Run();
        outcomes.merge(trial.outcomes);
    }
    outcomes.erase(GetParam().answer);
    EXPECT_EQ(outcomes, Names(GetParam().withoutMemory.begin(), GetParam().withoutMemory.end()));
}

std::vector<Operation> AllOperations() {
    std::vector<Operation> all = NodeOperations();
    for (const auto& part : {TreeOperations(), ExportOperations()}) {
        all.insert(all.end(), part.begin(), part.end());
    }
    return all;
}

// "IzkhwResourceTreeNode_FindNode_with_consumed".
std::string NameOf(const testing::TestParamInfo<Operation>& info) {
    std::string name;
    for (const char each : info.param.name) {
        if (std::isalnum(static_cast<unsigned char>(each)) != 0) {
            name += each;
        } else if (name.back() != '_') {
            name += '_';
        }
    }
    return name;
}

INSTANTIATE_TEST_SUITE_P(All, OperationsOutOfMemory, testing::ValuesIn(AllOperations()), NameOf);

TEST(OperationsOutOfMemoryTables, HaveEveryOperationOfTheHeaders) {
    Names declared = {"IUnknown::QueryInterface", "IUnknown::AddRef", "IUnknown::Release"};
    for (const auto& part : {support::DeclaredOperations(), support::DeclaredFunctions()}) {
        for (const support::Declared& each : part) {
            declared.insert(each.name);
        }
    }
    // That the headers were read, and as they are: 3 of IUnknown, 56 of nodes, trees, owner and selector, 22 functions.
    EXPECT_EQ(declared.size(), 81U);
    Names tried;
    for (const Operation& each : AllOperations()) {
        tried.insert(each.name.substr(0, each.name.find(',')));
    }
    EXPECT_EQ(tried, declared);
}

}  // namespace
}  // namespace allocations
