// The whole tool with every single allocation failing in turn: of texts, of nodes, of the ordinary heap and of the
// parser. A run may end with a result code or with an exception, and nothing else; no file stays open and nothing
// leaks.

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <new>
#include <string>
#include <vector>

#include "cachebuilder/SmallInstallation.h"
#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/exception/Exception.h"
#include "support/AllocationFaultScope.h"

namespace zkhw {
namespace {

using support::AllocationCounter;
using support::AllocationFaultScope;

std::string OutcomeOf(SmallInstallation& installation) {
    try {
        switch (const uint32_t result = installation.Run()) {
            case 0:
                return "0";
            case 0x80004005:
                return "failure";
            case 0x8007000e:
                return "out of memory";
            default:
                return "result " + std::to_string(result);
        }
    } catch (const std::bad_alloc&) {
        return "bad_alloc";
    } catch (const qn::dsc::exception::Exception&) {
        // IsDirectory never throws: without memory it finds none, and the copy of the menus then fails in its own way.
        return "failed copy";
    }
}

std::ptrdiff_t OpenDescriptors() {
    const std::filesystem::directory_iterator begin("/proc/self/fd");
    return std::distance(begin, std::filesystem::directory_iterator());
}

uint64_t CountAllocations(SmallInstallation& installation) {
    // The first run also fills what lives to the end of the process.
    EXPECT_EQ(OutcomeOf(installation), "0");
    const AllocationCounter counter;
    EXPECT_EQ(OutcomeOf(installation), "0");
    return counter.Count();
}

void FailEachInTurn(bool fromThenOn) {
    SmallInstallation installation;
    const uint64_t total = CountAllocations(installation);
    ASSERT_GT(total, 500U);
    const std::string cache = installation.Cache();
    uint64_t failures = 0;
    for (uint64_t nth = 1; nth <= total; ++nth) {
        std::string outcome;
        bool wasReached = false;
        {
            const AllocationFaultScope fault(nth, fromThenOn);
            outcome = OutcomeOf(installation);
            wasReached = qn::dsc::osdep::AllocationCount() >= nth;
        }
        ASSERT_TRUE(outcome == "0" || outcome == "failure" || outcome == "out of memory" || outcome == "bad_alloc" ||
                    outcome == "failed copy")
            << "allocation " << nth << ": " << outcome;
        ASSERT_TRUE(wasReached) << "allocation " << nth;
        failures += outcome == "0" ? 0U : 1U;
        ASSERT_EQ(installation.files.OpenFiles(), 0) << "allocation " << nth;
        ASSERT_EQ(installation.files.OpenSearches(), 0) << "allocation " << nth;
        ASSERT_EQ(installation.files.OpenWalks(), 0) << "allocation " << nth;
    }
    EXPECT_GT(failures, total / 2);
    // With the failure lifted all is as before.
    EXPECT_EQ(OutcomeOf(installation), "0");
    EXPECT_EQ(installation.Cache(), cache);
}

TEST(ToolOutOfMemory, EndsWithAResultOrAnExceptionWhereverOneAllocationFails) {
    FailEachInTurn(false);
}

TEST(ToolOutOfMemory, EndsWithAResultOrAnExceptionWhereverAllocationsFailFromThenOn) {
    FailEachInTurn(true);
}

TEST(ToolOutOfMemory, GivesOutOfMemoryWhenTheRootCannotBeAllocated) {
    SmallInstallation installation;
    const uint64_t total = CountAllocations(installation);
    uint64_t found = 0;
    for (uint64_t nth = 1; nth <= total && nth <= 100; ++nth) {
        const AllocationFaultScope fault(nth);
        found += OutcomeOf(installation) == "out of memory" ? 1U : 0U;
    }
    EXPECT_EQ(found, 1U);
}

// Folders, a link to one of them, and one that is met after as many nested ones.
void FillForAWalk(const qn::dsc::osdep::TemporaryFolder& folder, uint32_t nested) {
    folder.WriteFile("0_resource.xml", "");
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("a/in/d_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    folder.MakeLink("../b", "a/to");
    folder.MakeNestedFolders(std::string(120, 'c'), nested);
    folder.WriteFile("d/d_resource.xml", "");
}

// More than fit into a path that a call of Linux takes.
constexpr uint32_t deepWalk = 40;
constexpr uint32_t shallowWalk = 2;

// `openDescriptors` counts what the process has open.
void FailEachAllocationOfAWalk(uint32_t nested, std::ptrdiff_t (*openDescriptors)()) {
    const qn::dsc::osdep::TemporaryFolder folder;
    FillForAWalk(folder, nested);
    const qn::dsc::String directory = folder.System();
    const qn::dsc::String pattern(u"*resource.xml");
    std::vector<qn::dsc::String> all;
    FindResourceFiles(directory, pattern, all);
    ASSERT_EQ(all.size(), 6U);
    const std::ptrdiff_t openBefore = openDescriptors();
    for (const bool fromThenOn : {false, true}) {
        bool wasReached = true;
        for (uint64_t nth = 1; wasReached; ++nth) {
            std::vector<qn::dsc::String> found;
            {
                const AllocationFaultScope fault(nth, fromThenOn);
                EXPECT_NO_THROW(FindResourceFiles(directory, pattern, found)) << "allocation " << nth;
                wasReached = qn::dsc::osdep::AllocationCount() >= nth;
            }
            auto next = all.begin();
            for (const qn::dsc::String& file : found) {
                next = std::find(next, all.end(), file);
                ASSERT_NE(next, all.end()) << "allocation " << nth;
                ++next;
            }
            EXPECT_TRUE(wasReached || found.size() == all.size());
            ASSERT_EQ(openDescriptors(), openBefore) << "allocation " << nth;
        }
    }
}

TEST(WalkOutOfMemory, NeverThrowsAndKeepsWhatWasFound) {
    FailEachAllocationOfAWalk(shallowWalk, [] { return std::ptrdiff_t{0}; });
}

// The system below Wine takes no path of more than 4,095 bytes, and Windows has no list of open descriptors.
TEST(WalkOutOfMemory, LeavesNothingOpenHoweverDeepAsOnlyLinuxHasThem) {
    FailEachAllocationOfAWalk(deepWalk, &OpenDescriptors);
}

void FailEachAllocationOfATestForNewerFiles(uint32_t nested) {
    const qn::dsc::osdep::TemporaryFolder folder;
    FillForAWalk(folder, nested);
    folder.SetFileTime("b/b_resource.xml", 5000000000, 0);
    const qn::dsc::String directory = folder.System();
    const qn::dsc::String pattern(u"*resource.xml");
    const qn::dsc::osdep::TimeStamp time{2082844800 + 4900000000, 0};
    ASSERT_TRUE(IsAnyResourceFileNewer(directory, pattern, time));
    bool wasReached = true;
    uint64_t timesFound = 0;
    for (uint64_t nth = 1; wasReached; ++nth) {
        const AllocationFaultScope fault(nth);
        EXPECT_NO_THROW(timesFound += IsAnyResourceFileNewer(directory, pattern, time) ? 1U : 0U);
        wasReached = qn::dsc::osdep::AllocationCount() >= nth;
    }
    // The file is there by two paths, so hardly any failure hides it.
    EXPECT_GT(timesFound, 1U);
}

TEST(WalkOutOfMemory, TheTestForNewerFilesNeverThrows) {
    FailEachAllocationOfATestForNewerFiles(shallowWalk);
}

// The system below Wine takes no path of more than 4,095 bytes.
TEST(WalkOutOfMemory, TheTestForNewerFilesNeverThrowsHoweverDeepAsOnlyLinuxNestsSoDeep) {
    FailEachAllocationOfATestForNewerFiles(deepWalk);
}

}  // namespace
}  // namespace zkhw
