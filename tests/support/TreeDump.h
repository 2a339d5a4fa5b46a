#pragma once

// A whole tree as text, so that a test can state what it expects in one piece:
//
//     Board:Target ordered        a node: name, type, and whether its entries keep their order
//       Speed=40                  a text
//       Label~Clock{0000}eng=...  a localised text; controls and what isn't ASCII stand as their units in braces
//       Partner->../Other         a link
//       Clock:Clock               a child, with its entries two blanks further in
//
// A child whose key isn't its name stands as "key=>name:type". A child that doesn't know its parent is marked.

#include <string>

#include "restree/ResTreeNode.h"

namespace zkhw {

// As the entries stand: nothing deferred is loaded. Each line ends with a line feed. The stack doesn't grow with the
// depth of the tree.
std::string DumpTree(ResTreeNode& root);

}  // namespace zkhw
