#pragma once

// The parameters of a document that is being read: what is open in its ParseStack.

#include <cstdint>
#include <optional>
#include <string_view>

#include "restree/OpenAttributes.h"
#include "restree/Parameters.h"

namespace zkhw {

class ParseStack;

// Those of the elements that are open in `stack`: their attributes, of which the outermost wins, and "document-root",
// the path of the document element's node. Without "name" and the loop variables of open `names`, which are filled in
// per copy. Only good while the same elements are open, and one at a time for a stack.
//
// A few questions in a flat document are answered by a look at each frame, more or deeper ones through the stack's
// OpenAttributes.
class OpenElementParameters : public Parameters {
  public:
    explicit OpenElementParameters(ParseStack& stack) : stack(stack) {}
    ~OpenElementParameters() override;

    bool IsEmpty() const override;
    bool AppendValue(std::u16string_view name, TextBuilder& text) const override;

  private:
    // After so many questions the top frame is taken in too: it may have as many attributes as there are questions.
    static constexpr uint32_t questionsToTheTopFrame = 16;
    // With so many frames the lower ones are taken in at once.
    static constexpr uint32_t framesToWalk = 8;

    void Gather() const;
    bool IsLoopVariable(std::u16string_view name) const;
    bool HasAttribute() const;
    const String& DocumentRootPath() const;

    ParseStack& stack;
    mutable uint32_t questions = 0;
    mutable std::optional<bool> isEmpty;
    mutable std::optional<String> documentRootPath;
};

// The parameters that hold at this moment.
OpenElementParameters CollectParameters(ParseStack& stack);

}  // namespace zkhw
