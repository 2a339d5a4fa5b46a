#pragma once

// Parameters of the resource language: what "#{name}" in a text stands for. Most texts ask for one or two of the many
// attributes that are open, so values are looked for when they are asked for.

#include <cstddef>
#include <cstdint>
#include <map>
#include <string_view>
#include <utility>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextBuilder.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::TextBuilder;

class Parameters {
  public:
    Parameters() = default;
    Parameters(const Parameters&) = delete;
    Parameters& operator=(const Parameters&) = delete;
    virtual ~Parameters() = default;

    // True if there is no parameter at all. Texts then stay as they are, to the last blank.
    virtual bool IsEmpty() const = 0;

    // Appends the value of the parameter `name`, blind to letter case. False if there is none.
    virtual bool AppendValue(std::u16string_view name, TextBuilder& text) const = 0;
};

// From name to value, blind to letter case.
using ParameterMap = std::map<String, String>;

class MapParameters : public Parameters {
  public:
    explicit MapParameters(ParameterMap&& values) : values(std::move(values)) {}

    bool IsEmpty() const override { return values.empty(); }
    bool AppendValue(std::u16string_view name, TextBuilder& text) const override;

  private:
    ParameterMap values;
};

// Those of one copy that `names` stands for.
class InstanceParameters : public Parameters {
  public:
    // `variable` may be empty. Both texts outlive the object.
    InstanceParameters(std::u16string_view name, std::u16string_view variable, int32_t index)
        : instanceName(name), variable(variable), index(index) {}

    bool IsEmpty() const override { return false; }
    bool AppendValue(std::u16string_view name, TextBuilder& text) const override;

  private:
    std::u16string_view instanceName;
    std::u16string_view variable;
    int32_t index;
};

// Appends `text` with every "#{name}" that has a parameter replaced by its value, in one pass. An unknown one stays,
// without the blanks inside its braces; a "#{" that isn't closed stays with all that follows. `from` is what
// FindVariable gave, for who has it.
void ExpandVariables(std::u16string_view text, const Parameters& parameters, TextBuilder& result, size_t from = 0);

// The offset of the first "#{"; npos if there is nothing to expand.
size_t FindVariable(std::u16string_view text);

}  // namespace zkhw
