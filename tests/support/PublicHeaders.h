#pragma once

// The public headers as text, so that a test can tell whether it has forgotten something of them. PUBLIC_HEADERS is
// their folder, with a slash at its end.

#include <string>
#include <vector>

namespace support {

// Without comments, and with one blank for each run of white space.
std::string HeaderText(const std::string& name);

struct Declared {
    std::string name;       // "IzkhwResourceTreeNode::GetName", "FPGAResTree_Dump".
    std::string arguments;  // As they stand between the brackets.
};

// The operations of the interfaces that this library implements, without those of IUnknown.
std::vector<Declared> DeclaredOperations();

// The functions that this library exports.
std::vector<Declared> DeclaredFunctions();

}  // namespace support
