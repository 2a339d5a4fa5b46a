#pragma once

// A folder of a test's own, made and filled past the system under test, through the operating system alone.

#include <cstdint>
#include <string>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// Empty at first; gone at the end with all that is in it, however deep. Native paths are below it, with slashes; names
// are bytes, taken as they are. Every operation fails the test if it can't do its work.
class TemporaryFolder {
  public:
    TemporaryFolder();
    ~TemporaryFolder();

    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

    // Its path, without a separator at the end, or the path of what is below it, in the two forms.
    const std::string& Native() const { return native; }
    std::string Native(const std::string& below) const { return native + "/" + below; }
    String System() const;
    String System(const char16_t* below) const;

    // With the folders above that are missing.
    void MakeFolder(const std::string& below) const;
    // `depth` folders named `name`, each in the one before, without a limit to the length of their path.
    void MakeNestedFolders(const std::string& name, uint32_t depth) const;
    // With the folders above that are missing.
    void WriteFile(const std::string& below, const std::string& bytes) const;
    std::string ReadFile(const std::string& below) const;
    // The same with the platform's line ends as line feeds: what was written as text.
    std::string ReadText(const std::string& below) const;
    // Links and pipes need Linux, be it below Wine. `target` is the text of the link, whether anything is there or not.
    void MakeLink(const std::string& target, const std::string& below) const;
    void MakePipe(const std::string& below) const;
    // Lets the program in the file `program` be started from there, in the place of what is there. The folder exists.
    void PlaceProgram(const std::string& program, const std::string& below) const;
    void Remove(const std::string& below) const;
    // Last-write time since 1970 UTC. Links are followed.
    void SetFileTime(const std::string& below, int64_t seconds, int64_t nanoseconds) const;
    // Without following a link.
    bool Exists(const std::string& below) const;
    // The permission bits. On Linux only.
    uint32_t Permissions(const std::string& below) const;

    // Everything in it, each path once, in byte order; folders with a slash at the end, links not entered.
    std::vector<std::string> Tree() const;

  private:
    std::string native;
};

// Makes `native` the working folder, until the end of the scope.
class WorkingFolderScope {
  public:
    explicit WorkingFolderScope(const std::string& native);
    ~WorkingFolderScope();

    WorkingFolderScope(const WorkingFolderScope&) = delete;
    WorkingFolderScope& operator=(const WorkingFolderScope&) = delete;

  private:
    // A path; on Linux that of a descriptor, since the folder's own may be too long to go back to.
    std::string before;
};

}  // namespace qn::dsc::osdep
