#pragma once

// A copy of the example installation with a host's program in its root.

#include <string>
#include <vector>

#include "support/RunProgram.h"
#include "support/TemporaryFolder.h"

namespace zkhw {

// The bytes of a file; fails the test if it can't be read.
std::string ReadText(const std::string& path);

// tests/data/host/NAME.
std::string ExpectedText(const std::string& name);

class ExampleHost {
  public:
    // `program` is a native path. On Windows the installed library comes beside it, where the system looks for it.
    explicit ExampleHost(const std::string& program);

    // The installation's folder as an argument: a native path on Linux, in the system's form on Windows.
    std::string Root() const;

    // Runs it by its path, in the root of the file system. In what it prints, the installation's folder is shown as
    // "{root}", in either form.
    qn::dsc::osdep::ProgramResult Run(const std::vector<std::string>& arguments) const;

    // The same under the leak checker; by itself where the program brings one of its own.
    qn::dsc::osdep::ProgramResult RunForLeaks(const std::vector<std::string>& arguments) const;

    // Gives all files named *resource.xml this content and a time long past.
    void ReplaceAllDescriptions(const std::string& content) const;
    // Gives one file below the installation this content and a time long past.
    void ReplaceDescription(const std::string& below, const std::string& content) const;

    const qn::dsc::osdep::TemporaryFolder& Folder() const { return folder; }

  private:
    qn::dsc::osdep::ProgramResult RunHere(const std::string& program, const std::vector<std::string>& arguments) const;

    qn::dsc::osdep::TemporaryFolder folder;
    std::string host;
};

// Expects that a program printed `output`, complained of nothing, and gave 0.
void ExpectSuccess(const qn::dsc::osdep::ProgramResult& result, const std::string& output);

}  // namespace zkhw
