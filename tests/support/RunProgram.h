#pragma once

// Runs a program as a user would, and says what became of it.

#include <string>
#include <vector>

namespace qn::dsc::osdep {

struct ProgramResult {
    // What the program's end looks like from outside (ProcessEnd.h): EndWithResult, endByTrap, endByAbort, or "signal"
    // and its number. "not started" if the program can't be run.
    std::string end;
    std::string output;
    std::string errors;
};

// `program` and `workingFolder` are native paths. Waits for the end; both streams are read to theirs. No core is left.
ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::string& workingFolder);

}  // namespace qn::dsc::osdep
