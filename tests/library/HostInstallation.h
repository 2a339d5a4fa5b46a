#pragma once

// A folder of a host with descriptions of targets, and programs that run in it as the host.

#include <string>
#include <vector>

#include "support/RunProgram.h"
#include "support/TemporaryFolder.h"

class HostInstallation {
  public:
    // With two targets "Board" and "Card", a host set, "Parts", and a file that both targets include.
    HostInstallation();

    const qn::dsc::osdep::TemporaryFolder& Root() const { return root; }
    // Files of the folder "Targets/QN/FPGA": the path below the root, and the path in the system's form. `below` has
    // slashes.
    static std::string Below(const std::string& below) { return "Targets/QN/FPGA/" + below; }
    std::string SystemPath(const std::string& below) const;
    // The command by which a host tells that its folder of targets is `folder`, a path below the root.
    std::string Special(const std::string& folder = "Targets") const;

    void Write(const std::string& below, const std::string& text) const { root.WriteFile(Below(below), text); }
    std::string Cache() const { return root.ReadText(Below("resource_cache.xml")); }
    bool HasCache() const { return root.Exists(Below("resource_cache.xml")); }
    // Every resource file gets the time 1000; the cache too, if there is one: it is fresh.
    void SetFileTimes() const;

    // The cache as a host writes it for these files.
    std::string SoundCache() const;

    // Runs the host program that loads the library, with these commands (HostProgram.cpp), from the root.
    qn::dsc::osdep::ProgramResult Run(const std::vector<std::string>& commands,
                                      const std::string& workingFolder = "/") const;
    // The one that is linked to it.
    qn::dsc::osdep::ProgramResult RunLinked(const std::vector<std::string>& commands) const;
    // Any program as the host, with these arguments.
    qn::dsc::osdep::ProgramResult RunAsHost(const char* program, const std::vector<std::string>& arguments,
                                            const std::string& workingFolder) const;

  private:
    qn::dsc::osdep::TemporaryFolder root;
};

// A target as it stands in a cache.
std::string TargetInCache(const std::string& name, const std::string& xmlPath, const std::string& deviceIds);
// A cache with these blocks.
std::string CacheOf(const std::string& blocks);
