#pragma once

// Turns the events of one document into calls on the tree, with one frame for every open container. What an element
// means is decided in ElementReader. A ParseStack lives for one load; a load inside it has a stack of its own.

#include <memory>

#include "restree/ExPatHandler.h"
#include "restree/OpenAttributes.h"
#include "restree/ParseFrame.h"

namespace zkhw {

class LoadChain;

class ParseStack final : public ExPatHandler {
  public:
    // Reads into `node`. `rootType` empty: the document element stands for `node`; else it becomes a child of it.
    // `chain` tells of the file that is read.
    ParseStack(ResTreeNode& node, const String& rootType, const LoadChain& chain);
    ~ParseStack();

    ParseFrame* Top() const { return top.get(); }
    // The node that the document is read into; all nodes of the frames are in its tree.
    ResTreeNode& LoadingNode() const { return loadingNode; }

    uint32_t CountOfFrames() const { return countOfFrames; }
    const LoadChain& Chain() const { return chain; }

    // What is known by name of the frames. A frame that is on top again has been taken out.
    OpenAttributes& GetOpenAttributes() { return openAttributes; }

    // The node of the document element, or null before there is one.
    ResTreeNode* GetDocumentRoot() const { return documentRoot; }

    // Makes a frame for `node`, in which the element that has just begun, if any, is pending.
    void PushFrame(ResTreeNode& node, std::string_view nextName, const char* const* nextAttributes);

    // Notes a node made or taken in the top frame.
    void NoteNode(ResTreeNode& node);

    void StartElement(std::string_view name, const char* const* attributes) override;
    void EndElement(const char* name) override;
    void CharacterData(std::string_view text) override;
    void ProcessingInstruction(std::string_view, std::string_view) override {}
    void Comment(std::string_view) override {}
    void StartCdataSection() override {}
    void EndCdataSection() override {}

  private:
    // Text that no element is waiting for is the white space between elements.
    bool IsTextAwaited() const { return top && !top->pendingName.IsEmpty(); }
    void FinishElement(const char* name);
    void PopFrame();
    std::unique_ptr<ParseFrame> TakeSpare();

    ResTreeNode& loadingNode;
    const LoadChain& chain;
    std::unique_ptr<ParseFrame> top;    // Null when the last frame has been popped; later events are ignored.
    std::unique_ptr<ParseFrame> spare;  // Frames to use again, with the room that their texts have.
    uint32_t countOfFrames = 1;
    ResTreeNode* documentRoot = nullptr;
    OpenAttributes openAttributes;
};

}  // namespace zkhw
