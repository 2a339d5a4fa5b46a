#pragma once

// A run-time module for tests, as a shared library of its own: what it answers and what it was asked. The library
// exports this as `fakeRuntime`, beside some of the host's functions.

#include <cstdint>

struct FakeRuntime {
    const char* language;           // Given by HostGetLanguageName.
    const char* directory;          // Given for every special directory.
    int32_t specialDirectoryError;  // Result of HostGetSpecialDir.
    int32_t pathToStringError;      // Result of HostPathToString.
    bool givesNoText;               // HostPathToString leaves the handle null.
    int32_t languageCalls;
    int32_t askedCode;    // The last one of HostGetSpecialDir; -1: never asked.
    int32_t openPaths;    // Made and not yet destroyed.
    int32_t openHandles;  // Made and not yet disposed of.
};
