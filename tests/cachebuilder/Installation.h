#pragma once

// Installations for tests: a host's folder with a working directory "Targets/QN/FPGA" of target descriptions, in which
// the tool stands in a folder of its own.

#include <string>
#include <vector>

#include "support/FaultyFileSystem.h"
#include "support/RunProgram.h"
#include "support/TemporaryFolder.h"

namespace zkhw {

// The device specifications with the menu folders menus/v5, menus/v6 and menus/s6, and the same as they stand in a
// cache for the file "specs_resource.xml".
extern const char* const deviceSpecs;
extern const char* const deviceSpecsInCache;

// A target of a device family.
std::string TargetOfFamily(const std::string& name, const std::string& family);

// The block of a target in a cache of which the file says nothing but its name.
std::string PlainTargetInCache(const std::string& name, const std::string& relativePath);

// A cache with these blocks.
std::string CacheOf(const std::string& blocks);

class Installation {
  public:
    // With the host's executable, and the folder of the tool.
    Installation();

    const qn::dsc::osdep::TemporaryFolder& Root() const { return root; }
    // The working directory, as a native path below the root.
    static std::string Below(const std::string& path) { return "Targets/QN/FPGA/" + path; }
    // Its path in the system's form, and that of what is in it.
    qn::dsc::String System() const { return root.System(u"Targets\\QN\\FPGA"); }
    qn::dsc::String System(const char16_t* below) const;

    // Files of the working directory.
    void Write(const std::string& path, const std::string& text) const { root.WriteFile(Below(path), text); }
    std::string Read(const std::string& path) const { return root.ReadFile(Below(path)); }
    bool Has(const std::string& path) const { return root.Exists(Below(path)); }
    std::string Cache() const { return root.ReadText(Below("resource_cache.xml")); }
    bool HasCache() const { return Has("resource_cache.xml"); }

    // The device specifications, and a file "menu.txt" in each menu folder.
    void WriteDeviceSpecs() const;

    // Runs the tool from its folder in this installation. It must print nothing.
    std::string Run(const std::vector<std::string>& arguments = {}, const std::string& workingFolder = "/") const;

  private:
    qn::dsc::osdep::TemporaryFolder root;
};

// Lets this process pass for the executable at a path below the root of an installation, to the end of the scope.
class ExecutableScope {
  public:
    ExecutableScope(const Installation& installation, const char16_t* path);

    qn::dsc::osdep::FaultyFileSystem& Files() { return files; }

  private:
    qn::dsc::osdep::FaultyFileSystem files;
    qn::dsc::osdep::FileSystemScope scope;
};

// The tool in its usual place; a host.
inline constexpr const char16_t* toolPath = u"Targets\\QN\\FPGA\\tool\\zkfpga_make_resource_cache";
inline constexpr const char16_t* hostPath = u"Zarvik.exe";

}  // namespace zkhw
