#include "restree/OpenElementParameters.h"

#include <algorithm>
#include <vector>

#include "qn/dsc/osdep/Compare.h"
#include "restree/ParseStack.h"
#include "restree/SoughtName.h"

namespace zkhw {

using qn::dsc::osdep::Equal;

namespace {

constexpr std::u16string_view nameKey = u"name";
constexpr std::u16string_view documentRootKey = u"document-root";

bool IsAmong(const std::vector<String>& variables, std::u16string_view name) {
    return std::any_of(variables.begin(), variables.end(),
                       [name](const String& variable) { return Equal(variable.View(), name); });
}

inline bool HasLoopVariable(const ParseFrame& frame, std::u16string_view name) {
    return !frame.loopVariables.empty() && IsAmong(frame.loopVariables, name);
}

}  // namespace

OpenElementParameters CollectParameters(ParseStack& stack) {
    return OpenElementParameters(stack);
}

OpenElementParameters::~OpenElementParameters() {
    // The top frame goes on changing.
    if (stack.Top()->isInOpenAttributes) {
        stack.GetOpenAttributes().Remove(*stack.Top());
    }
}

// Takes in what is not to be looked at frame by frame.
void OpenElementParameters::Gather() const {
    if (questions > questionsToTheTopFrame) {
        stack.GetOpenAttributes().Add(stack.Top());
    } else if (stack.CountOfFrames() > framesToWalk) {
        stack.GetOpenAttributes().Add(stack.Top()->previous.get());
    }
}

bool OpenElementParameters::IsLoopVariable(std::u16string_view name) const {
    Gather();
    for (const ParseFrame* frame = stack.Top(); frame != nullptr && !frame->isInOpenAttributes;
         frame = frame->previous.get()) {
        if (HasLoopVariable(*frame, name)) {
            return true;
        }
    }
    return stack.GetOpenAttributes().IsLoopVariable(name);
}

bool OpenElementParameters::IsEmpty() const {
    if (!isEmpty.has_value()) {
        const bool hasDocumentRoot = stack.GetDocumentRoot() != nullptr && !IsLoopVariable(documentRootKey);
        isEmpty = !hasDocumentRoot && !HasAttribute();
    }
    return *isEmpty;
}

// True if an open element has an attribute that is a parameter.
bool OpenElementParameters::HasAttribute() const {
    questions = questionsToTheTopFrame + 1;
    Gather();
    return stack.GetOpenAttributes().HasAnyBut(nameKey);
}

const String& OpenElementParameters::DocumentRootPath() const {
    if (!documentRootPath.has_value()) {
        documentRootPath = stack.GetDocumentRoot()->GetPath();
    }
    return *documentRootPath;
}

bool OpenElementParameters::AppendValue(std::u16string_view name, TextBuilder& text) const {
    const SoughtName sought(name);
    if (sought.Equals("name", true)) {
        return false;
    }
    ++questions;
    Gather();
    // From the innermost outward: the last hit stands.
    OpenAttributes::Place outermost;
    for (const ParseFrame* frame = stack.Top(); frame != nullptr && !frame->isInOpenAttributes;
         frame = frame->previous.get()) {
        if (HasLoopVariable(*frame, name)) {
            return false;
        }
        const AttributeList::Place found = frame->pendingAttributes.Find(sought);
        if (found != AttributeList::nowhere) {
            outermost = {frame, found};
        }
    }
    if (const OpenAttributes& gathered = stack.GetOpenAttributes(); !gathered.IsEmpty()) {
        if (gathered.IsLoopVariable(name)) {
            return false;
        }
        const OpenAttributes::Place further = gathered.Find(name);
        outermost = further.frame == nullptr ? outermost : further;
    }
    if (outermost.frame != nullptr) {
        outermost.frame->pendingAttributes.AppendValueAt(outermost.place, text);
        return true;
    }
    if (stack.GetDocumentRoot() != nullptr && Equal(name, documentRootKey)) {
        text.Append(DocumentRootPath().View());
        return true;
    }
    return false;
}

}  // namespace zkhw
