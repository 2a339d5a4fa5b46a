// Hosts that can't have a tree, have no run-time or a poor one, or break the contract.

#include <gtest/gtest.h>

#include "host/LoadedRuntime.h"
#include "library/HostInstallation.h"
#include "support/ProcessEnd.h"

namespace {

using qn::dsc::osdep::ProgramResult;

class HostFailure : public testing::Test {
  protected:
    ProgramResult Run(const std::vector<std::string>& commands) {
        std::vector<std::string> all{std::string("runtime|") + STAND_IN_RUNTIME, installation.Special()};
        all.insert(all.end(), commands.begin(), commands.end());
        return installation.Run(all);
    }

    void ExpectAnswers(const std::vector<std::string>& commands, const std::string& answers) {
        const ProgramResult result = Run(commands);
        EXPECT_EQ(result.end, "exit 0");
        EXPECT_EQ(result.output, "ready\n" + answers);
        EXPECT_EQ(result.errors, "");
    }

    static void ExpectFatal(const ProgramResult& result, const std::string& message) {
        EXPECT_EQ(result.end, "exit 1");
        EXPECT_EQ(result.output, "ready\n");
        EXPECT_EQ(result.errors, "Fatal Error: " + message + "\n");
    }

    static void ExpectTrap(const ProgramResult& result, const std::string& answers = "") {
        EXPECT_EQ(result.end, qn::dsc::osdep::endByTrap);
        EXPECT_EQ(result.output, "ready\n" + answers);
        EXPECT_EQ(result.errors, "");
    }

    HostInstallation installation;
};

const char* const emptyRoot = "\n<ProviderResourceTreeRoot name=\"\">\n</ProviderResourceTreeRoot>\n";

TEST_F(HostFailure, MissingFolderIsReportedOnceAndLeavesAnEmptyTree) {
    installation.Root().Remove("Targets");
    ExpectAnswers({"property|Board|Speed|", "property|Board|Speed|", "names|||", "properties|||", "dump|/||",
                   "query|Node", "live"},
                  "property 80004005 9 \"before\"\nproperty 00000000 0 \"\"\nnames 00000000 1\n"
                  "properties 00000000 1\ndump 00000000 " +
                      std::string(emptyRoot) + "query 00000000 Node object\nlive 0\n");
    EXPECT_FALSE(installation.Root().Exists("Targets"));
}

TEST_F(HostFailure, FirstCallOfEveryFunctionReportsTheMissingFolder) {
    installation.Root().Remove("Targets");
    ExpectAnswers({"names|||"}, "names 80004005 9\n");
    ExpectAnswers({"properties|||"}, "properties 80004005 9\n");
    ExpectAnswers({"dump|/||"}, "dump 80004005 before\n");
    ExpectAnswers({"query|Tree", "query|Tree"}, "query 80004005 Tree null\nquery 00000000 Tree object\n");
    ExpectAnswers({"query|Node5", "query|Node5"}, "query 80004005 Node5 null\nquery 00000000 Node5 object\n");
}

TEST_F(HostFailure, FolderWithoutItsFpgaFolderCountsAsMissing) {
    installation.Root().Remove("Targets/QN/FPGA");
    ExpectAnswers({"property|Board|Speed|"}, "property 80004005 9 \"before\"\n");
}

// A folder in the place of the cache: nobody may write there, root neither.
TEST_F(HostFailure, CacheThatCannotBeWrittenIsReportedOnceAndTheTreeStands) {
    installation.Root().MakeFolder(HostInstallation::Below("resource_cache.xml"));
    ExpectAnswers({"property|Board|Speed|", "property|Board|Speed|", "property|Board|C/Rate|"},
                  "property 80004005 9 \"before\"\nproperty 00000000 1 \"40\"\nproperty 00000000 1 \"40\"\n");
}

TEST_F(HostFailure, FileThatIsNoXmlIsPassedOver) {
    installation.Write("Board/Board_resource.xml", "no XML at all");
    ExpectAnswers({"found|Board|Speed|", "property|Card|Speed|", "found||XMLParseErrors|"},
                  "found 00000000 0\nproperty 00000000 1 \"50\"\nfound 00000000 1\n");
}

TEST_F(HostFailure, StoringWithoutARuntimeIsFatal) {
    ExpectFatal(installation.Run({"convert-foreign|mbstowcs", "query|Tree"}),
                "ZARVIKV.LIB was not called from a Zarvik process.");
    ExpectFatal(installation.Run({"names|/Board||"}), "ZARVIKV.LIB was not called from a Zarvik process.");
    ExpectFatal(installation.Run({"node|3"}), "ZARVIKV.LIB was not called from a Zarvik process.");
}

TEST_F(HostFailure, FunctionThatTheRuntimeLacksIsFatal) {
    const std::string poor = std::string("runtime|") + POOR_RUNTIME;
    ExpectFatal(installation.Run({poor, "query|Tree"}), "ZARVIKV.LIB could not locate \"HostEmptyPath\".");
    ExpectFatal(installation.Run({poor, "convert-foreign|wcstombs"}),
                "ZARVIKV.LIB could not locate \"HostResizeArray\".");
    ExpectFatal(installation.Run({poor, "node|3"}), "ZARVIKV.LIB could not locate \"QueryInterfaceForZKRefNum\".");
}

TEST_F(HostFailure, DumpOfAPathThatLeadsNowhereTraps) {
    ExpectTrap(Run({"dump|Board|Nothing|"}));
    ExpectTrap(Run({"dump|Nobody||"}));
    // A property is no node, the empty path is no path, and a base with a slash is one element.
    ExpectTrap(Run({"dump|Board|Speed|"}));
    ExpectTrap(Run({"dump|||"}));
    ExpectTrap(Run({"dump|/Board|C|"}));
}

TEST_F(HostFailure, NullResultOfAnInterfaceTraps) {
    for (const char* id : {"Node", "Node5", "Tree", "Tree2"}) {
        ExpectTrap(Run({std::string("query-null|") + id}));
    }
}

TEST_F(HostFailure, NullResultWithAnUnknownIdIsPassedOver) {
    ExpectAnswers({"query-null|Unknown"}, "query 80004002\n");
}

}  // namespace
