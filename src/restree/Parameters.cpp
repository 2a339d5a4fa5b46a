#include "restree/Parameters.h"

#include <vector>

#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "restree/EntryWalk.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

using qn::dsc::osdep::Equal;

namespace {

constexpr std::u16string_view openMark = u"#{";
constexpr std::u16string_view nameKey = u"name";

std::u16string_view TrimBlanks(std::u16string_view text) {
    constexpr std::u16string_view blanks = u" \t\r\n";
    const size_t first = text.find_first_not_of(blanks);
    return first == std::u16string_view::npos ? std::u16string_view()
                                              : text.substr(first, text.find_last_not_of(blanks) + 1 - first);
}

}  // namespace

bool MapParameters::AppendValue(std::u16string_view name, std::u16string& text) const {
    const auto found = values.find(String(name));
    if (found == values.end()) {
        return false;
    }
    text.append(found->second.View());
    return true;
}

InstanceParameters::InstanceParameters(const String& name, const String& variable, int32_t index)
    : instanceName(name), variable(variable), index(qn::dsc::osdep::IntegerToString(index, 10)) {}

bool InstanceParameters::AppendValue(std::u16string_view name, std::u16string& text) const {
    if (Equal(name, nameKey)) {
        text.append(instanceName.View());
    } else if (!variable.IsEmpty() && Equal(name, variable.View())) {
        text.append(index.View());
    } else {
        return false;
    }
    return true;
}

bool HasVariables(const String& text) {
    return text.View().find(openMark) != std::u16string_view::npos;
}

String ExpandVariables(const String& text, const Parameters& parameters) {
    if (parameters.IsEmpty()) {
        return text;
    }
    const std::u16string_view source = text.View();
    // Kept from one text to the next: nearly every text of a copy comes through here.
    static thread_local std::u16string result;
    result.clear();
    size_t done = 0;
    size_t open = source.find(openMark);
    while (open != std::u16string_view::npos) {
        const size_t close = source.find(u'}', open + openMark.size());
        if (close == std::u16string_view::npos) {
            break;
        }
        result.append(source.substr(done, open - done));
        const std::u16string_view key =
            TrimBlanks(source.substr(open + openMark.size(), close - open - openMark.size()));
        if (!parameters.AppendValue(key, result)) {
            result.append(openMark).append(key).push_back(u'}');
        }
        done = close + 1;
        open = source.find(openMark, done);
    }
    result.append(source.substr(done));
    String expanded{std::u16string_view(result)};
    constexpr size_t keptCapacity = 65536;
    if (result.capacity() > keptCapacity) {
        result = std::u16string();
    }
    return expanded;
}

// --- Expansion in a subtree ---

void ResTreeNode::ApplyParameters(const Parameters& parameters) {
    struct Level {
        ResTreeNode* node;
        EntryWalk walk;
    };
    const ReleaseScope scope;
    std::vector<Level> levels;
    EnsureDeferredLoaded();
    levels.push_back({this, {}});
    while (!levels.empty()) {
        Level& level = levels.back();
        NodeEntry* entry = level.walk.Next(level.node->entries);
        if (entry == nullptr) {
            levels.pop_back();
        } else if (const String* text = entry->Text()) {
            if (HasVariables(*text)) {
                level.node->SetEntryText(entry, ExpandVariables(*text, parameters));
            }
        } else if (ResTreeNode* child = entry->Child()) {
            child->EnsureDeferredLoaded();
            levels.push_back({child, {}});
        }
    }
}

void ResTreeNode::ApplyInstance(const String& instanceName, const String& variable, int32_t index) {
    ApplyParameters(InstanceParameters(instanceName, variable, index));
}

}  // namespace zkhw
