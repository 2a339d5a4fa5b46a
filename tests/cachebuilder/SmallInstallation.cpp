#include "cachebuilder/SmallInstallation.h"

#include "cachebuilder/Tool.h"

namespace zkhw {

using qn::dsc::osdep::FileSystemScope;

SmallInstallation::SmallInstallation() {
    folder.WriteFile("Zarvik.exe", "MZ");
    folder.WriteFile("Targets/QN/FPGA/hosts_resource.xml",
                     "<FPGAHostSet><Host name=\"A\"><Text localize=\"true\">eng=a,jpn=b</Text></Host></FPGAHostSet>");
    folder.WriteFile("Targets/QN/FPGA/specs_resource.xml",
                     "<FpgaDeviceSpecs><Virtex5><XIPINMenusPath>Menus/V5</XIPINMenusPath></Virtex5>"
                     "<Virtex6/></FpgaDeviceSpecs>");
    folder.WriteFile("Targets/QN/FPGA/more/more_resource.xml",
                     "<FpgaDeviceSpecs><Virtex6><x/></Virtex6><spartan6 name=\"spartan6\"/></FpgaDeviceSpecs>");
    folder.WriteFile("Targets/QN/FPGA/one/one_resource.xml",
                     "<Target name=\"One\"><DeviceIDs>1,2</DeviceIDs>"
                     "<FPGACompilation><DeviceFamily>virtex5</DeviceFamily></FPGACompilation>"
                     "<:Include what=\"children\">Targets/QN/FPGA/shared.xml</:Include>"
                     "<Pin names=\"P[i=0..1]\"><Label>#{name} #{i}</Label></Pin>"
                     "<Bank name=\"B\" prototype=\"P0\" Kind=\"x\"/><:Link name=\"L\">P1</:Link></Target>");
    folder.WriteFile("Targets/QN/FPGA/two/two_resource.xml",
                     "<Target name=\"Two\"><FPGACompilation><DeviceFamily>kintex7</DeviceFamily></FPGACompilation>"
                     "<Reserves>/One/B</Reserves></Target>");
    folder.WriteFile("Targets/QN/FPGA/shared.xml", "<Shared><Clock name=\"C\"><Rate>40</Rate></Clock></Shared>");
    folder.WriteFile("Menus/V5/a.menu", "menu a");
    folder.WriteFile("Menus/V5/deep/b.menu", "menu b");
    files.SetExecutablePath(folder.System(u"Targets\\QN\\FPGA\\Utilities\\zkfpga_make_resource_cache"));
}

uint32_t SmallInstallation::Run() {
    return Run(nullptr);
}

uint32_t SmallInstallation::Run(const char* argument) {
    struct TakeDown {
        ~TakeDown() { DiscardTreeOfTheRun(); }
    };
    const TakeDown takeDown;
    const FileSystemScope scope(files);
    std::string program = "zkfpga_make_resource_cache";
    std::string given = argument == nullptr ? "" : argument;
    char* arguments[] = {program.data(), given.data(), nullptr};
    return static_cast<uint32_t>(RunTool(argument == nullptr ? 1 : 2, arguments));
}

std::string SmallInstallation::Cache() const {
    const std::string path = "Targets/QN/FPGA/resource_cache.xml";
    return folder.Exists(path) ? folder.ReadText(path) : "none";
}

void SmallInstallation::RemoveOutput() const {
    for (const char* path : {"Targets/QN/FPGA/resource_cache.xml", "Targets/QN/FPGA/one/a.menu",
                             "Targets/QN/FPGA/one/deep/b.menu", "Targets/QN/FPGA/one/deep"}) {
        if (folder.Exists(path)) {
            folder.Remove(path);
        }
    }
}

}  // namespace zkhw
