// What a host reads from the cache, what from the resource files, and when.

#include <gtest/gtest.h>

#include "host/LoadedRuntime.h"
#include "library/HostInstallation.h"

namespace {

using qn::dsc::osdep::ProgramResult;

class HostCache : public testing::Test {
  protected:
    // The stubs of the targets have other device ids than the files.
    static std::string StubBoard() {
        return TargetInCache("Board", "Targets\\QN\\FPGA\\Board\\Board_resource.xml", "99");
    }
    static std::string StubCard() { return TargetInCache("Card", "Targets\\QN\\FPGA\\Card\\Card_resource.xml", "98"); }
    static std::string StubParts() {
        return "\n   <Parts>\n      <Protocols></Protocols>"
               "\n      <FPGA_XMLSource>Targets\\QN\\FPGA\\parts_resource.xml</FPGA_XMLSource>\n   </Parts>";
    }
    void WriteFreshCache(const std::string& text) {
        installation.Write("resource_cache.xml", text);
        installation.SetFileTimes();
    }
    std::string WriteCommand(const std::string& below, const std::string& text) const {
        return "write|" + installation.Root().Native(HostInstallation::Below(below)) + "|" + text;
    }
    std::string RemoveCommand(const std::string& below) const {
        return "remove|" + installation.Root().Native(HostInstallation::Below(below));
    }

    void ExpectAnswers(const std::vector<std::string>& commands, const std::string& answers) {
        std::vector<std::string> all{std::string("runtime|") + STAND_IN_RUNTIME, installation.Special()};
        all.insert(all.end(), commands.begin(), commands.end());
        const ProgramResult result = installation.Run(all);
        EXPECT_EQ(result.end, "exit 0");
        EXPECT_EQ(result.output, "ready\n" + answers);
        EXPECT_EQ(result.errors, "");
    }

    HostInstallation installation;
};

const char* const includeOfShared = "<:Include what=\"children\">Targets/QN/FPGA/shared.xml</:Include>";

TEST_F(HostCache, MissingCacheIsWrittenFromTheFiles) {
    ExpectAnswers({"property|Board|DeviceIDs|"}, "property 00000000 1 \"7\"\n");
    EXPECT_EQ(installation.Cache(), installation.SoundCache());
}

TEST_F(HostCache, WrittenCacheServesTheNextProcess) {
    ExpectAnswers({"query|Tree"}, "query 00000000 Tree object\n");
    installation.SetFileTimes();
    ExpectAnswers(
        {RemoveCommand("Card/Card_resource.xml"), "property|Board|DeviceIDs|", "property|Board|C/Rate|",
         "property|Card|DeviceIDs|", "found|Card|Speed|", "property|Parts|P/Size|", "property|FPGAHostSet|HostA|"},
        "property 00000000 1 \"7\"\nproperty 00000000 1 \"40\"\nproperty 00000000 1 \"8\"\n"
        "found 00000000 0\nproperty 00000000 1 \"3\"\nproperty 00000000 1 \"1\"\n");
}

TEST_F(HostCache, FreshCacheIsReadInPlaceOfTheFiles) {
    const std::string cache = CacheOf(StubBoard() + StubCard());
    WriteFreshCache(cache);
    ExpectAnswers({"property|Board|DeviceIDs|", "property|Card|DeviceIDs|", "property|Board|TargetDir|",
                   "property|Board|TargetClassShortClassName|", "names|||"},
                  "property 00000000 1 \"99\"\nproperty 00000000 1 \"98\"\nproperty 00000000 1 \"" +
                      installation.SystemPath("Board") +
                      "\"\nproperty 00000000 1 \"Board\"\nnames 00000000 1 [/Board] [/Card]\n");
    EXPECT_EQ(installation.Cache(), cache);
}

// The files get what they are to say only when the host has had its first answers.
TEST_F(HostCache, FilesOfATargetAreReadAtTheFirstDeepLookUpAndThoseOfOthersNot) {
    WriteFreshCache(CacheOf(StubBoard() + StubCard() + StubParts()));
    const auto target = [](const char* name, const char* speed) {
        return std::string("<Target name=\"") + name + "\"><Speed>" + speed + "</Speed>" + includeOfShared +
               "</Target>";
    };
    ExpectAnswers({"names|||", "property|Board|DeviceIDs|", "property|Card|DeviceIDs|",
                   "property|Parts|FPGA_XMLSource|",  //
                   WriteCommand("Board/Board_resource.xml", target("Board", "41")),
                   WriteCommand("shared.xml", "<Shared><Clock name=\"C\"><Rate>44</Rate></Clock></Shared>"),
                   "property|Board|Speed|", "property|Board|C/Rate|", "property|Board|DeviceIDs|",
                   // The board is complete now.
                   WriteCommand("Board/Board_resource.xml", target("Board", "42")),
                   WriteCommand("Card/Card_resource.xml", target("Card", "51")),
                   WriteCommand("shared.xml", "<Shared><Clock name=\"C\"><Rate>45</Rate></Clock></Shared>"),
                   "property|Card|Speed|", "property|Card|C/Rate|", "property|Board|Speed|", "property|Board|C/Rate|",
                   WriteCommand("parts_resource.xml", "<Parts><Part name=\"P\"><Size>9</Size></Part></Parts>"),
                   "property|Parts|P/Size|"},
                  "names 00000000 1 [/Board] [/Card] [/Parts]\n"
                  "property 00000000 1 \"99\"\nproperty 00000000 1 \"98\"\n"
                  "property 00000000 1 \"Targets\\QN\\FPGA\\parts_resource.xml\"\n"
                  "property 00000000 1 \"41\"\nproperty 00000000 1 \"44\"\nproperty 00000000 1 \"99\"\n"
                  "property 00000000 1 \"51\"\nproperty 00000000 1 \"45\"\n"
                  "property 00000000 1 \"41\"\nproperty 00000000 1 \"44\"\n"
                  "property 00000000 1 \"9\"\n");
}

TEST_F(HostCache, DumpReadsTheFilesOfWhatItShows) {
    WriteFreshCache(CacheOf(StubBoard() + StubParts()));
    ExpectAnswers({"dump|Parts||"},
                  "dump 00000000 \n<Parts>\n   <Protocols></Protocols>"
                  "\n   <FPGA_XMLSource>Targets\\QN\\FPGA\\parts_resource.xml</FPGA_XMLSource>"
                  "\n   <Part name=\"P\">\n      <Size>3</Size>\n   </Part>"
                  "\n   <Protocols></Protocols>\n</Parts>\n");
}

TEST_F(HostCache, FileThatIsGoneAtTheDeepLookUpIsNotLookedForAgain) {
    WriteFreshCache(CacheOf(StubBoard()));
    ExpectAnswers({"property|Board|DeviceIDs|", RemoveCommand("Board/Board_resource.xml"), "property|Board|Speed|",
                   WriteCommand("Board/Board_resource.xml", "<Target name=\"Board\"><Speed>1</Speed></Target>"),
                   "property|Board|Speed|", "property|Board|DeviceIDs|"},
                  "property 00000000 1 \"99\"\nproperty 00000000 0 \"\"\nproperty 00000000 0 \"\"\n"
                  "property 00000000 1 \"99\"\n");
}

TEST_F(HostCache, StaleCacheIsWrittenAnew) {
    WriteFreshCache(CacheOf(StubBoard() + StubCard()));
    installation.Root().SetFileTime(HostInstallation::Below("Card/Card_resource.xml"), 1001, 0);
    ExpectAnswers({"property|Board|DeviceIDs|", "property|Card|DeviceIDs|"},
                  "property 00000000 1 \"7\"\nproperty 00000000 1 \"8\"\n");
    EXPECT_EQ(installation.Cache(), installation.SoundCache());
}

TEST_F(HostCache, CacheThatBreaksOffBehindATargetIsUsedAsFarAsItGoes) {
    const std::string cache =
        "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">" + StubBoard() + "\n   <Target name=\"Ca";
    WriteFreshCache(cache);
    ExpectAnswers({"property|Board|DeviceIDs|", "found|Card|DeviceIDs|", "found||XMLParseErrors|", "names|||",
                   "property|Board|Speed|"},
                  "property 00000000 1 \"99\"\nfound 00000000 0\nfound 00000000 1\nnames 00000000 1 [/Board]\n"
                  "property 00000000 1 \"40\"\n");
    EXPECT_EQ(installation.Cache(), cache);
}

TEST_F(HostCache, CacheThatIsNoXmlIsWrittenAnew) {
    WriteFreshCache("no XML at all");
    ExpectAnswers({"property|Board|DeviceIDs|", "found||XMLParseErrors|"},
                  "property 00000000 1 \"7\"\nfound 00000000 0\n");
    EXPECT_EQ(installation.Cache(), installation.SoundCache());
}

TEST_F(HostCache, CacheWithoutATargetIsWrittenAnew) {
    WriteFreshCache(CacheOf(StubParts()));
    ExpectAnswers({"property|Board|DeviceIDs|", "property|Parts|P/Size|"},
                  "property 00000000 1 \"7\"\nproperty 00000000 1 \"3\"\n");
    EXPECT_EQ(installation.Cache(), installation.SoundCache());
}

}  // namespace
