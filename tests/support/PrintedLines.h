#pragma once

// What a program of the system says of a file of ours: nm, readelf.

#include <string>
#include <vector>

namespace qn::dsc::osdep {

// The lines that `program`, a native path, prints in English, without their line feeds. The test fails, and has none,
// if the program does. Linux alone has such programs.
std::vector<std::string> PrintedLines(const std::string& program, const std::vector<std::string>& arguments);

}  // namespace qn::dsc::osdep
