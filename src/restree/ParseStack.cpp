#include "restree/ParseStack.h"

#include <utility>

#include "restree/ElementReader.h"
#include "restree/Instances.h"
#include "restree/Utf8Text.h"

namespace zkhw {

ParseStack::ParseStack(ResTreeNode& node, const String& rootType, const LoadChain& chain)
    : loadingNode(node), chain(chain) {
    top = std::make_unique<ParseFrame>();
    top->node = &node;
    top->typeTable = node.NearestTypeTable();
    top->rootTypeKnown = !rootType.IsEmpty();
}

ParseStack::~ParseStack() {
    // One by one: as many frames may be left as the document is deep.
    for (std::unique_ptr<ParseFrame>* stack : {&top, &spare}) {
        while (*stack) {
            *stack = std::move((*stack)->previous);
        }
    }
}

std::unique_ptr<ParseFrame> ParseStack::TakeSpare() {
    if (!spare) {
        return std::make_unique<ParseFrame>();
    }
    std::unique_ptr<ParseFrame> frame = std::move(spare);
    spare = std::move(frame->previous);
    return frame;
}

void ParseStack::PushFrame(ResTreeNode& node, std::string_view nextName, const char* const* nextAttributes) {
    std::unique_ptr<ParseFrame> frame = TakeSpare();
    frame->node = &node;
    frame->firstNode = nullptr;
    frame->position = nullptr;
    const TypeTable* ownTable = node.GetTypeTable();
    frame->typeTable = ownTable == nullptr ? top->typeTable : ownTable;
    frame->rootTypeKnown = top->rootTypeKnown;
    frame->mergeExisting = top->mergeExisting;
    frame->pendingName.Assign(nextName);
    frame->pendingAttributes.Assign(nextAttributes);
    frame->text.clear();
    frame->ForgetInstances();
    top->position = nullptr;
    frame->previous = std::move(top);
    top = std::move(frame);
    ++countOfFrames;
}

void ParseStack::PopFrame() {
    std::unique_ptr<ParseFrame> frame = std::move(top);
    top = std::move(frame->previous);
    frame->previous = std::move(spare);
    spare = std::move(frame);
    --countOfFrames;
    if (top) {
        top->position = nullptr;
        if (top->isInOpenAttributes) {
            openAttributes.Remove(*top);
        }
    }
}

void ParseStack::NoteNode(ResTreeNode& node) {
    if (top->firstNode != nullptr) {
        return;
    }
    top->firstNode = &node;
    if (!top->previous) {
        documentRoot = &node;
    }
}

void ParseStack::StartElement(std::string_view name, const char* const* attributes) {
    if (!top) {
        return;
    }
    if (!top->pendingName.IsEmpty()) {
        ElementReader(*this).FlushPendingElement(ElementMode::Container, name, attributes);
    } else {
        top->pendingName.Assign(name);
        top->pendingAttributes.Assign(attributes);
        top->text.clear();
        top->ForgetInstances();
    }
    WantText(IsTextAwaited());
}

void ParseStack::CharacterData(std::string_view text) {
    if (IsTextAwaited() && IsWidenable(text)) {
        top->text.append(text);
    }
}

void ParseStack::EndElement(const char* name) {
    if (top) {
        FinishElement(name);
        WantText(IsTextAwaited());
    }
}

void ParseStack::FinishElement(const char* name) {
    ParseFrame* frame = top.get();
    const bool wasPending = !frame->pendingName.IsEmpty();
    if (wasPending) {
        ElementReader(*this).FlushPendingElement(ElementMode::Leaf, {}, nullptr);
    }
    if (frame->position != nullptr) {
        if (frame->position->IsText() && frame->xmlDepth > 1) {
            String& value = frame->node->EditEntryText(*frame->position);
            value.Append(u"</");
            value.Append(Widen(name));
            value.Append(u">");
            --frame->xmlDepth;
        } else {
            frame->position = nullptr;
        }
    } else if (!wasPending && frame->node->GetParent() != nullptr) {
        // The end of this frame's container. The frame of a tree's root stays until the document ends.
        PopFrame();
        if (!top) {
            return;
        }
        frame = top.get();
    }
    if (frame->instances.size() > 1) {
        ReplicateInstances(*frame);
    }
    frame->ForgetInstances();
}

}  // namespace zkhw
