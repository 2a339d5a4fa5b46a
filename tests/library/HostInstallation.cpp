#include "library/HostInstallation.h"

#include <algorithm>
#include <filesystem>

#include <gtest/gtest.h>

using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;

namespace {

const char* const hostFile = "TheHost";

}  // namespace

std::string TargetInCache(const std::string& name, const std::string& xmlPath, const std::string& deviceIds) {
    return "\n   <Target name=\"" + name +
           "\" ordered=\"true\">"
           "\n      <DeviceCategory></DeviceCategory>"
           "\n      <EIOItemIconName>fpga\\IO.png</EIOItemIconName>"
           "\n      <EIOItemTypeName>FPGA I/O</EIOItemTypeName>"
           "\n      <FPGAItemSubType></FPGAItemSubType>"
           "\n      <SupportedFPGAHostList></SupportedFPGAHostList>"
           "\n      <TargetClass>COM.QN.FPGA." +
           name + "</TargetClass>\n      <TargetXMLPath>" + xmlPath +
           "</TargetXMLPath>"
           "\n      "
           "<LocalizedInformationToDisplayWhenAddingNewTarget></LocalizedInformationToDisplayWhenAddingNewTarget>"
           "\n      <FindTargetVIPath></FindTargetVIPath>"
           "\n      <DeviceIDs>" +
           deviceIds +
           "</DeviceIDs>"
           "\n      <CustomFPGAMethodList></CustomFPGAMethodList>"
           "\n   </Target>";
}

std::string CacheOf(const std::string& blocks) {
    return "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">" + blocks + "\n</ProviderResourceTreeRoot>";
}

HostInstallation::HostInstallation() {
    Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    Write("parts_resource.xml", "<Parts><Part name=\"P\"><Size>3</Size></Part></Parts>");
    Write("Board/Board_resource.xml",
          "<Target name=\"Board\"><DeviceIDs>7</DeviceIDs><Speed>40</Speed>"
          "<Label localize=\"true\">eng=Clock,jpn=Tokei</Label>"
          "<:Include what=\"children\">Targets/QN/FPGA/shared.xml</:Include>"
          "<Bank name=\"B/1\"><Pins>8</Pins></Bank><:Link name=\"L\">C</:Link></Target>");
    Write("Card/Card_resource.xml",
          "<Target name=\"Card\"><DeviceIDs>8</DeviceIDs><Speed>50</Speed>"
          "<:Include what=\"children\">Targets/QN/FPGA/shared.xml</:Include></Target>");
    Write("shared.xml", "<Shared><Clock name=\"C\"><Rate>40</Rate></Clock></Shared>");
}

std::string HostInstallation::SystemPath(const std::string& below) const {
    std::string path = "\\" + Below(below);
    std::replace(path.begin(), path.end(), '/', '\\');
    return qn::dsc::NarrowString(root.System()).CStr() + path;
}

std::string HostInstallation::Special(const std::string& folder) const {
    return std::string("special|") + qn::dsc::NarrowString(root.System()).CStr() + "\\" + folder;
}

void HostInstallation::SetFileTimes() const {
    for (const char* file :
         {"hosts_resource.xml", "parts_resource.xml", "Board/Board_resource.xml", "Card/Card_resource.xml"}) {
        root.SetFileTime(Below(file), 1000, 0);
    }
    if (HasCache()) {
        root.SetFileTime(Below("resource_cache.xml"), 1000, 0);
    }
}

std::string HostInstallation::SoundCache() const {
    return CacheOf(TargetInCache("Board", SystemPath("Board/Board_resource.xml"), "7") +
                   TargetInCache("Card", SystemPath("Card/Card_resource.xml"), "8") +
                   "\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>"
                   "\n   <Parts>\n      <Protocols></Protocols>\n      <FPGA_XMLSource>" +
                   SystemPath("parts_resource.xml") + "</FPGA_XMLSource>\n   </Parts>");
}

ProgramResult HostInstallation::Run(const std::vector<std::string>& commands, const std::string& workingFolder) const {
    std::vector<std::string> arguments{ZKFPGA_LIBRARY};
    arguments.insert(arguments.end(), commands.begin(), commands.end());
    return RunAsHost(LOADING_HOST, arguments, workingFolder);
}

ProgramResult HostInstallation::RunLinked(const std::vector<std::string>& commands) const {
    // Windows looks for the library beside the program; on Linux the program knows where it is.
    const std::filesystem::path library = LIBRARY_BESIDE_HOST;
    if (!library.empty()) {
        std::filesystem::copy_file(library, root.Native(library.filename().string()));
    }
    std::vector<std::string> arguments{"-", "own-runtime"};
    arguments.insert(arguments.end(), commands.begin(), commands.end());
    return RunAsHost(LINKED_HOST, arguments, "/");
}

ProgramResult HostInstallation::RunAsHost(const char* program, const std::vector<std::string>& arguments,
                                          const std::string& workingFolder) const {
    root.PlaceProgram(program, hostFile);
    return RunProgram(root.Native(hostFile), arguments, workingFolder);
}
