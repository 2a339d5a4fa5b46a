#include "support/EnvironmentScope.h"

#include <windows.h>

namespace qn::dsc::osdep {

EnvironmentScope::EnvironmentScope(const std::string& name, const std::string& value) : name(name) {
    SetEnvironmentVariableA(name.c_str(), value.c_str());
}

EnvironmentScope::~EnvironmentScope() {
    SetEnvironmentVariableA(name.c_str(), nullptr);
}

}  // namespace qn::dsc::osdep
