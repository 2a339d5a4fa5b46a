#pragma once

// The text of node paths: "/" is the root, "/a/b" a node below it, "../b" one that is seen from another. A "/" or a
// backslash that belongs to a name has a backslash before it. Nothing here looks at a tree. All linear in the texts.

#include <optional>
#include <string_view>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextArgument.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::TextArgument;

// The path of the child `name`, which is put in with its escapes, of the node at `parentPath`.
String JoinEscapedPath(TextArgument parentPath, TextArgument name);

// The same with names for display: `displayName`, if there is one, stands for `name`. A node with an empty display
// name leaves no trace: the result is `parentPath`.
String JoinDisplayPath(TextArgument parentPath, TextArgument name, std::optional<std::u16string_view> displayName);

// The path that leads from the node at `base` to the node at `target`: ".." for each component of `base` that `target`
// does not share, then the components of `target` that are left. Components are compared blind to letter case. Empty
// for equal paths.
// "/" has two components, both empty, so that it shares but the first with any other path: from "/" to "/a" it is
// "../a".
// Without a ".." in front the first component stands in the result without its escapes: from "/a" to "/a/b\/c" it is
// "b/c".
String MakeRelativeNodePath(TextArgument target, TextArgument base);

// A list of paths, separated by commas and trimmed, with each path that begins with "/" made relative to the node at
// `base`. The paths are escaped as pieces of a list.
String RebaseListPaths(TextArgument list, TextArgument base);

}  // namespace zkhw
