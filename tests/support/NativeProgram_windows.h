#pragma once

// Programs of the system that Wine runs on, for what Wine itself can't do: it has no way to make a link.

#include <string>
#include <vector>

namespace qn::dsc::osdep {

std::u16string Widened(const std::string& utf8);
std::string Narrowed(const std::u16string& text);

// The path outside of Wine for an absolute one in it, of either kind of separator.
std::string PathOutsideWine(const std::string& path);

// Starts the program `path` of the system below, with paths of that system as arguments. It can't be waited for: look
// for what it does. False if it can't be started, which is so where the system is Windows itself.
bool StartOutsideWine(const std::string& path, const std::vector<std::string>& arguments);

}  // namespace qn::dsc::osdep
