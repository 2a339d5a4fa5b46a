#include "support/PrintedLines.h"

#include <sstream>

#include <gtest/gtest.h>

#include "support/ProcessEnd.h"
#include "support/RunProgram.h"

namespace qn::dsc::osdep {

std::vector<std::string> PrintedLines(const std::string& program, const std::vector<std::string>& arguments) {
    std::vector<std::string> all{"LC_ALL=C", program};
    all.insert(all.end(), arguments.begin(), arguments.end());
    const ProgramResult result = RunProgram("/usr/bin/env", all, "/");
    EXPECT_EQ(result.end, EndWithResult(0)) << program << ": " << result.errors;
    std::vector<std::string> lines;
    std::istringstream text(result.output);
    for (std::string line; result.end == EndWithResult(0) && std::getline(text, line);) {
        lines.push_back(line);
    }
    return lines;
}

}  // namespace qn::dsc::osdep
