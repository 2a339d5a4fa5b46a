#include "cachebuilder/Installation.h"

#include <gtest/gtest.h>

#include "qn/dsc/osdep/path.h"
#include "support/ProcessEnd.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;

namespace {

const char* const toolFile = "Targets/QN/FPGA/tool/zkfpga_make_resource_cache";

}  // namespace

const char* const deviceSpecs =
    "<FpgaDeviceSpecs>"
    "<Virtex5><XIPINMenusPath>menus/v5</XIPINMenusPath></Virtex5>"
    "<Virtex6><XIPINMenusPath>menus/v6</XIPINMenusPath></Virtex6>"
    "<spartan6><XIPINMenusPath>menus/s6</XIPINMenusPath></spartan6>"
    "</FpgaDeviceSpecs>";

const char* const deviceSpecsInCache =
    "\n   <FpgaDeviceSpecs>"
    "\n      <Protocols></Protocols>"
    "\n      <FPGA_XMLSource>Targets\\QN\\FPGA\\specs_resource.xml</FPGA_XMLSource>"
    "\n   </FpgaDeviceSpecs>";

std::string TargetOfFamily(const std::string& name, const std::string& family) {
    return "<Target name=\"" + name + "\"><FPGACompilation><DeviceFamily>" + family +
           "</DeviceFamily></FPGACompilation></Target>";
}

std::string PlainTargetInCache(const std::string& name, const std::string& relativePath) {
    return "\n   <Target name=\"" + name +
           "\" ordered=\"true\">"
           "\n      <DeviceCategory></DeviceCategory>"
           "\n      <EIOItemIconName>fpga\\IO.png</EIOItemIconName>"
           "\n      <EIOItemTypeName>FPGA I/O</EIOItemTypeName>"
           "\n      <FPGAItemSubType></FPGAItemSubType>"
           "\n      <SupportedFPGAHostList></SupportedFPGAHostList>"
           "\n      <TargetClass>COM.QN.FPGA." +
           name + "</TargetClass>\n      <TargetXMLPath>" + relativePath +
           "</TargetXMLPath>"
           "\n      "
           "<LocalizedInformationToDisplayWhenAddingNewTarget></LocalizedInformationToDisplayWhenAddingNewTarget>"
           "\n      <FindTargetVIPath></FindTargetVIPath>"
           "\n      <DeviceIDs></DeviceIDs>"
           "\n      <CustomFPGAMethodList></CustomFPGAMethodList>"
           "\n   </Target>";
}

std::string CacheOf(const std::string& blocks) {
    return "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">" + blocks + "\n</ProviderResourceTreeRoot>";
}

Installation::Installation() {
    root.WriteFile("Zarvik.exe", "");
    root.MakeFolder("Targets/QN/FPGA/tool");
}

String Installation::System(const char16_t* below) const {
    return JoinPath(System(), below);
}

void Installation::WriteDeviceSpecs() const {
    Write("specs_resource.xml", deviceSpecs);
    for (const std::string family : {"v5", "v6", "s6"}) {
        root.WriteFile("menus/" + family + "/menu.txt", family);
    }
}

std::string Installation::Run(const std::vector<std::string>& arguments, const std::string& workingFolder) const {
    if (!root.Exists(toolFile)) {
        root.PlaceProgram(ZKFPGA_TOOL, toolFile);
    }
    const ProgramResult result = RunProgram(root.Native(toolFile), arguments, workingFolder);
    EXPECT_EQ(result.output, "");
    // The run-time says something itself when an exception ends the process.
    if (result.end != qn::dsc::osdep::endByAbort) {
        EXPECT_EQ(result.errors, "");
    }
    return result.end;
}

ExecutableScope::ExecutableScope(const Installation& installation, const char16_t* path) : scope(files) {
    files.SetExecutablePath(installation.Root().System(path));
}

}  // namespace zkhw
