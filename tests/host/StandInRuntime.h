#pragma once

// A run-time of a host for tests: a shared module that exports every function of the table, with real handles. Blocks
// move at every call, so that a pointer kept across one shows under a sanitizer; new bytes of a numeric array are
// garbage; a handle or path that isn't the module's, or no longer, ends the process with a message.
//
// The module exports this one object as `standInRuntime`: what it is to answer, and what has happened. LoadedRuntime.h
// finds it, HostTest.h makes a fixture of it.

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <set>
#include <string>
#include <vector>

struct StandInPath {
    std::string text;
};

struct StandInRuntime {
    enum class ErrorText { AsKnown, TrueWithoutText, FalseWithText };

    // From here on the `nth` call of `function` fails, once, with `code` (for a function that has no code: as it says
    // that it failed). Any number of these can stand at a time.
    void Fail(const std::string& function, int32_t code, uint64_t nth = 1) {
        faults[{function, counts[function] + nth}] = code;
    }

    // How often `function` was called.
    uint64_t Count(const std::string& function) { return counts[function]; }

    // Handles and paths that were made and not yet given back.
    size_t LiveHandleCount() const { return blockSizes.size(); }
    size_t LivePathCount() const { return paths.size(); }

    // As at first, but for what is alive.
    void Reset() {
        StandInRuntime fresh;
        fresh.blockSizes.swap(blockSizes);
        fresh.paths.swap(paths);
        *this = std::move(fresh);
    }

    // Answers. A special directory that isn't set fails with code 7.
    std::string language = "English";
    std::string behindTheLanguage;  // What else is put into the buffer of the name.
    std::map<int32_t, std::string> specialDirectories;
    std::map<int32_t, std::string> errorTexts;
    ErrorText errorTextAnswer = ErrorText::AsKnown;
    bool givesNoPathText = false;  // HostPathToString gives 0 and leaves the handle alone.
    bool movesAllBlocks = true;    // False: only a block that is resized; for many handles.
    // Gives the result code; 0x80004002 and null if there is none. The id is as in memory.
    std::function<int32_t(uint32_t refNum, const std::array<uint8_t, 16>& id, void** result)> queryInterface;

    // Every call with the arguments that aren't handles or paths: "HostResizeArray 5 1 12".
    std::vector<std::string> calls;

    // The module's own.
    std::map<char**, size_t> blockSizes;
    std::set<StandInPath*> paths;
    std::map<std::string, uint64_t> counts;
    std::map<std::pair<std::string, uint64_t>, int32_t> faults;
};
