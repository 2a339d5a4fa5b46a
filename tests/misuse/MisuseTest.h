#pragma once

// Runs one case of misuse_host, and holds how it ended against what the headers say.

#include <string>
#include <vector>

#include <gtest/gtest.h>

struct Expectation {
    std::string name;
    std::string output;  // Lines, each with its line feed; "answers" is the last of a case that doesn't trap.
    bool traps = false;
};

using Expectations = std::vector<Expectation>;

// `answer` is what stands in front of "answers".
Expectation Answers(const std::string& name, const std::string& answer);
// `answer` is what is said until then.
Expectation Traps(const std::string& name, const std::string& answer = "");

// What is there at first (MisuseHost.h), and its parts.
extern const std::string slotA;
extern const std::string slotB;
extern const std::string shelfS;
extern const std::string shelfT;

// The line that says what /Rack is now.
std::string Now(const std::string& shelves);

// All of each kind.
Expectations NullExpectations();
Expectations ExportNullExpectations();
Expectations NumberExpectations();
Expectations IdExpectations();
Expectations NoticeExpectations();
Expectations SequenceExpectations();

class Misuse : public testing::TestWithParam<Expectation> {};

// "GetNameNameGives80004003": a name of a test.
std::string TestName(const testing::TestParamInfo<Expectation>& info);

// The names of all cases that the host has.
std::vector<std::string> NamesOfCases();
