#pragma once

// A variable of the environment, for the programs that a test starts.

#include <string>

namespace qn::dsc::osdep {

// The variable has the value until the end of the scope, and is gone behind it.
class EnvironmentScope {
  public:
    EnvironmentScope(const std::string& name, const std::string& value);
    ~EnvironmentScope();

    EnvironmentScope(const EnvironmentScope&) = delete;
    EnvironmentScope& operator=(const EnvironmentScope&) = delete;

  private:
    std::string name;
};

}  // namespace qn::dsc::osdep
