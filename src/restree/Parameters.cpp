#include "restree/Parameters.h"

#include <utility>
#include <vector>

#include "qn/dsc/osdep/IntegerToString.h"
#include "restree/ParseStack.h"
#include "restree/ReleaseScope.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr std::u16string_view openMark = u"#{";

}  // namespace

ParameterMap CollectParameters(const ParseStack& stack) {
    std::vector<const ParseFrame*> frames;
    for (const ParseFrame* frame = stack.Top(); frame != nullptr; frame = frame->previous.get()) {
        frames.push_back(frame);
    }
    ParameterMap parameters;
    for (auto frame = frames.rbegin(); frame != frames.rend(); ++frame) {
        for (AttributeList::Attribute& attribute : (*frame)->pendingAttributes.InOrder()) {
            parameters.insert(std::move(attribute));
        }
    }
    if (const ResTreeNode* documentRoot = stack.GetDocumentRoot()) {
        parameters.emplace(String(u"document-root"), documentRoot->GetPath());
    }
    for (const ParseFrame* frame : frames) {
        for (const InstanceRecord& record : frame->instances) {
            if (!record.variable.IsEmpty()) {
                parameters.erase(record.variable);
            }
        }
    }
    parameters.erase(String(u"name"));
    return parameters;
}

String ExpandVariables(const String& text, const ParameterMap& parameters) {
    if (parameters.empty()) {
        return text;
    }
    const std::u16string_view source = text.View();
    String result;
    size_t done = 0;
    size_t open = source.find(openMark);
    while (open != std::u16string_view::npos) {
        const size_t close = source.find(u'}', open + openMark.size());
        if (close == std::u16string_view::npos) {
            break;
        }
        result.Append(source.substr(done, open - done));
        const String key = TrimWhitespace(source.substr(open + openMark.size(), close - open - openMark.size()));
        const auto found = parameters.find(key);
        if (found != parameters.end()) {
            result.Append(found->second);
        } else {
            result.Append(openMark);
            result.Append(key);
            result.Append(u"}");
        }
        done = close + 1;
        open = source.find(openMark, done);
    }
    result.Append(source.substr(done));
    return result;
}

// --- Expansion in a subtree ---

void ResTreeNode::ApplyParameters(const ParameterMap& parameters) {
    struct Level {
        ResTreeNode* node;
        EntryPosition next;
    };
    const ReleaseScope scope;
    std::vector<Level> levels;
    EnsureDeferredLoaded();
    levels.push_back({this, entries.Begin()});
    while (!levels.empty()) {
        Level& level = levels.back();
        if (level.next.IsEnd()) {
            levels.pop_back();
            continue;
        }
        NodeEntry* entry = level.node->entries.At(level.next);
        level.next = level.node->entries.Next(level.next);
        if (const String* text = entry->Text()) {
            if (HasVariables(*text)) {
                level.node->SetEntryText(entry, ExpandVariables(*text, parameters));
            }
        } else if (ResTreeNode* child = entry->Child()) {
            child->EnsureDeferredLoaded();
            levels.push_back({child, child->entries.Begin()});
        }
    }
}

void ResTreeNode::ApplyInstance(const String& instanceName, const String& variable, int32_t index) {
    ParameterMap parameters;
    parameters.emplace(u"name", instanceName);
    if (!variable.IsEmpty()) {
        parameters.emplace(variable, qn::dsc::osdep::IntegerToString(index, 10));
    }
    ApplyParameters(parameters);
}

}  // namespace zkhw
