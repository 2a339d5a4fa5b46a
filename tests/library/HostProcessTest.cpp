// Host programs in processes of their own, from the first call of the library to the end of the process.

#include <gtest/gtest.h>

#include "host/LoadedRuntime.h"
#include "library/HostInstallation.h"

namespace {

using qn::dsc::osdep::ProgramResult;

const std::string runtime = std::string("runtime|") + STAND_IN_RUNTIME;

class HostProcess : public testing::Test {
  protected:
    std::string Special(const std::string& folder = "Targets") const { return installation.Special(folder); }

    // Runs a host that must come to its natural end and have nothing to say but `answers`.
    void ExpectAnswers(const std::vector<std::string>& commands, const std::string& answers) {
        const ProgramResult result = installation.Run(commands);
        EXPECT_EQ(result.end, "exit 0");
        EXPECT_EQ(result.output, "ready\n" + answers);
        EXPECT_EQ(result.errors, "");
    }

    std::string BoardXml() const {
        return "\n<Target name=\"Board\" ordered=\"true\">"
               "\n   <DeviceIDs>7</DeviceIDs>"
               "\n   <Speed>40</Speed>"
               "\n   <Label localize=\"true\">eng=Clock,jpn=Tokei</Label>"
               "\n   <Clock name=\"C\">\n      <Rate>40</Rate>\n   </Clock>"
               "\n   <Bank name=\"B/1\">\n      <Pins>8</Pins>\n   </Bank>"
               "\n   <:Link  name=\"L\">C</:Link>"
               "\n   <TargetXMLPath>" +
               installation.SystemPath("Board/Board_resource.xml") + "</TargetXMLPath>\n   <TargetDir>" +
               installation.SystemPath("Board") +
               "</TargetDir>"
               "\n   <TargetClassShortClassName>Board</TargetClassShortClassName>"
               "\n   <TargetClass>COM.QN.FPGA.Board</TargetClass>"
               "\n   <EIOItemTypeName>FPGA I/O</EIOItemTypeName>"
               "\n   <EIOItemIconName>fpga\\IO.png</EIOItemIconName>"
               "\n</Target>";
    }

    HostInstallation installation;
};

constexpr const char* sizeCluster =
    "<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>P/Size</Val></String>"
    "<String><Name>value</Name><Val>3</Val></String></Cluster>";

TEST_F(HostProcess, EveryFunctionAnswersFromTheLibraryAsItIsLoaded) {
    ExpectAnswers({runtime,
                   Special(),
                   "property|Board|Speed|",
                   "property|Board|/Speed|",
                   "property|Board|None|",
                   "property|Board|Label|",
                   "property|Board|L/Rate|",
                   "property|Board|B\\/1/Pins|",
                   "property|Board/Speed||",
                   "names|/Board||",
                   "names|/Board||protocol=Bank",
                   "names|Nobody||",
                   "properties|Parts|P|",
                   "properties|Parts|Q|",
                   "dump|Board||",
                   "dump|Parts|P|any",
                   "node|5",
                   "convert|mbstowcs|61C384",
                   "convert|wcstombs|6100C400",
                   "convert|MbsToUtf8|F09F9880",
                   "convert|Utf8ToMbs|EDA0BDEDB880",
                   "same|mbstowcs|6162",
                   "live"},
                  "property 00000000 1 \"40\"\n"
                  "property 00000000 1 \"40\"\n"
                  "property 00000000 0 \"\"\n"
                  "property 00000000 1 \"Clock\"\n"
                  "property 00000000 1 \"40\"\n"
                  "property 00000000 1 \"8\"\n"
                  "property 00000000 1 \"40\"\n"
                  "names 00000000 1 [C] [B\\/1] [L]\n"
                  "names 00000000 1 [B\\/1]\n"
                  "names 00000000 0\n"
                  "properties 00000000 1 [" +
                      std::string(sizeCluster) +
                      "]\n"
                      "properties 00000000 0\n"
                      "dump 00000000 " +
                      BoardXml() +
                      "\n"
                      "dump 00000000 \n<Part name=\"P\">\n   <Size>3</Size>\n</Part>\n"
                      "node 1 55\n"
                      "convert 0 6100C400\n"
                      "convert 0 61C384\n"
                      "convert 0 EDA0BDEDB880\n"
                      "convert 0 F09F9880\n"
                      "same 0 61006200\n"
                      "live 0\n");
}

TEST_F(HostProcess, LinkedHostThatIsItsOwnRuntimeGetsTheSameAnswers) {
    const ProgramResult result =
        installation.RunLinked({Special(), "property|Board|Speed|", "names|/Board||", "properties|Parts|P|",
                                "dump|Parts|P|", "node|5", "query|Tree", "convert|mbstowcs|61", "convert|wcstombs|6100",
                                "convert|MbsToUtf8|61", "convert|Utf8ToMbs|61", "live"});
    EXPECT_EQ(result.end, "exit 0");
    EXPECT_EQ(result.output,
              "ready\n"
              "property 00000000 1 \"40\"\n"
              "names 00000000 1 [C] [B\\/1] [L]\n"
              "properties 00000000 1 [" +
                  std::string(sizeCluster) +
                  "]\n"
                  "dump 00000000 \n<Part name=\"P\">\n   <Size>3</Size>\n</Part>\n"
                  "node 1 55\n"
                  "query 00000000 Tree object\n"
                  "convert 0 6100\nconvert 0 61\nconvert 0 61\nconvert 0 61\n"
                  "live 0\n");
    EXPECT_EQ(result.errors, "");
}

TEST_F(HostProcess, EveryNodeAndTreeIdIsServedWithoutContextAndItem) {
    ExpectAnswers({runtime, Special(), "query|Node", "query|Node2", "query|Node3", "query|Node4", "query|Node5",
                   "query|Tree", "query|Tree2", "live"},
                  "query 00000000 Node object\nquery 00000000 Node2 object\nquery 00000000 Node3 object\n"
                  "query 00000000 Node4 object\nquery 00000000 Node5 object\nquery 00000000 Tree object\n"
                  "query 00000000 Tree2 object\nlive 0\n");
}

TEST_F(HostProcess, OtherIdsAreNotServedAndBuildNothing) {
    ExpectAnswers({runtime, Special(), "query|Unknown", "query|Selector", "calls"},
                  "query 80004002 Unknown null\nquery 80004002 Selector null\n");
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(HostProcess, OwnerNeedsAContextOrAnItem) {
    ExpectAnswers({runtime, Special(), "query|Owner", "calls"}, "query 80004003 Owner null\n");
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(HostProcess, SpecialDirectoryIsAskedForAtTheFirstQueryAndNeverAgain) {
    ExpectAnswers({runtime, Special(), "calls", "query|Tree", "calls", "query|Node", "query|Tree2",
                   "found|Board|Speed|", "found|Parts|P/Size|", "calls"},
                  "query 00000000 Tree object\n"
                  "call HostEmptyPath\n"
                  "call HostGetSpecialDir 28\n"
                  "call HostPathToString\n"
                  "call HostDisposeHandle\n"
                  "call HostDestroyPath\n"
                  "call HostGetLanguageName\n"  // For the localised text of a target, once the scan comes to it.
                  "query 00000000 Node object\n"
                  "query 00000000 Tree2 object\n"
                  "found 00000000 1\n"
                  "found 00000000 1\n");
}

// On Windows paths are in the system's form from the outset.
TEST_F(HostProcess, RuntimeMayNameAnotherFolderByANativePathAsOnlyLinuxHasNativePaths) {
    installation.Root().WriteFile("Elsewhere/QN/FPGA/x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    ExpectAnswers(
        {runtime, "special|" + installation.Root().Native("Elsewhere"), "property|X|K|", "found|Board|Speed|"},
        "property 00000000 1 \"v\"\nfound 00000000 0\n");
    EXPECT_TRUE(installation.Root().Exists("Elsewhere/QN/FPGA/resource_cache.xml"));
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(HostProcess, RuntimeMayNameAnotherFolderInTheFormOfTheSystem) {
    installation.Root().WriteFile("Elsewhere/QN/FPGA/x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    ExpectAnswers({runtime, Special("Elsewhere"), "property|X|K|"}, "property 00000000 1 \"v\"\n");
}

TEST_F(HostProcess, WithoutASpecialDirectoryTheWorkingFolderCounts) {
    const ProgramResult result =
        installation.Run({runtime, "property|Board|Speed|"}, installation.Root().Native("Targets"));
    EXPECT_EQ(result.output, "ready\nproperty 00000000 1 \"40\"\n");
    EXPECT_TRUE(installation.HasCache());
}

TEST_F(HostProcess, NamedRuntimeIsUsed) {
    ExpectAnswers({std::string("name-runtime|") + UNNAMED_RUNTIME, Special(), "property|Board|Speed|", "live"},
                  "property 00000000 1 \"40\"\nlive 0\n");
}

TEST_F(HostProcess, WithoutARuntimeTheTargetsStandBesideTheExecutable) {
    ExpectAnswers({"found|Board|Speed|", "found|Board|None|", "query|Tree"},
                  "found 00000000 1\nfound 00000000 0\nquery 00000000 Tree object\n");
    EXPECT_EQ(installation.Cache(), installation.SoundCache());
}

TEST_F(HostProcess, ErrorOfTheRuntimeReachesTheHostAsAnException) {
    ExpectAnswers({runtime, Special(), "fail|HostResizeArray|9", "convert|mbstowcs|61", "convert|mbstowcs|61", "live"},
                  "threw Error Code: 9 (00000009): Unknown error code or error text unavailable.\n"
                  "convert 0 6100\nlive 0\n");
}

}  // namespace
