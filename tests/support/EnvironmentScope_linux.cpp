#include "support/EnvironmentScope.h"

#include <cstdlib>

namespace qn::dsc::osdep {

EnvironmentScope::EnvironmentScope(const std::string& name, const std::string& value) : name(name) {
    setenv(name.c_str(), value.c_str(), 1);
}

EnvironmentScope::~EnvironmentScope() {
    unsetenv(name.c_str());
}

}  // namespace qn::dsc::osdep
