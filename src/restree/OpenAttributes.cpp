#include "restree/OpenAttributes.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "qn/dsc/osdep/Compare.h"
#include "restree/ParseFrame.h"

namespace zkhw {

void OpenAttributes::Add(ParseFrame* frame) {
    std::vector<ParseFrame*> missing;
    for (; frame != nullptr && !frame->isInOpenAttributes; frame = frame->previous.get()) {
        missing.push_back(frame);
    }
    // Outermost first: what is there stays.
    for (auto next = missing.rbegin(); next != missing.rend(); ++next) {
        ParseFrame& added = **next;
        marks.push_back({enteredAttributes.size(), enteredLoopVariables.size()});
        added.isInOpenAttributes = true;
        added.pendingAttributes.ForEach([&](String&& name, AttributeList::Place place) {
            const auto [entered, isNew] = attributes.try_emplace(std::move(name), Place{&added, place});
            if (isNew) {
                enteredAttributes.push_back(entered);
            }
        });
        for (const String& variable : added.loopVariables) {
            enteredLoopVariables.push_back(loopVariables.insert(variable));
        }
    }
}

void OpenAttributes::Remove(ParseFrame& frame) noexcept {
    frame.isInOpenAttributes = false;
    const Mark mark = marks.back();
    marks.pop_back();
    for (; enteredAttributes.size() > mark.attributes; enteredAttributes.pop_back()) {
        attributes.erase(enteredAttributes.back());
    }
    for (; enteredLoopVariables.size() > mark.loopVariables; enteredLoopVariables.pop_back()) {
        loopVariables.erase(enteredLoopVariables.back());
    }
}

OpenAttributes::Place OpenAttributes::Find(std::u16string_view name) const {
    const auto found = attributes.find(String(name));
    return found == attributes.end() ? Place{} : found->second;
}

bool OpenAttributes::IsLoopVariable(std::u16string_view name) const {
    return !loopVariables.empty() && loopVariables.count(String(name)) != 0;
}

bool OpenAttributes::HasAnyBut(std::u16string_view hidden) const {
    return std::any_of(attributes.begin(), attributes.end(), [&](const auto& attribute) {
        return !qn::dsc::osdep::Equal(attribute.first.View(), hidden) && loopVariables.count(attribute.first) == 0;
    });
}

}  // namespace zkhw
