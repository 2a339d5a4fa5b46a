#pragma once

// What is open while a document is read: one frame per container, linked downward. The last element of a container
// stands parked in its frame until the next event tells whether it has children.

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "restree/AttributeList.h"
#include "restree/ElementName.h"
#include "restree/NameRange.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

struct ParseFrame {
    void ForgetInstances() {
        // Called twice for each element, and hardly any has some.
        if (!instances.empty()) {
            instances.clear();
            loopVariables.clear();
        }
    }

    std::unique_ptr<ParseFrame> previous;  // The frame below; null for the bottom frame.
    ResTreeNode* node = nullptr;           // Receives what is read at this level.
    ResTreeNode* firstNode = nullptr;      // The first node made or taken at this level.

    // The value that is being filled, or has just been stored; null stands for the end of `node`.
    NodeEntry* position = nullptr;

    // The type table that holds for `node`; null if there is none.
    const TypeTable* typeTable = nullptr;

    // False until the document element has been handled, in a load where that stands for the loading node.
    bool rootTypeKnown = false;
    // What is there already is merged with; until a `replace` says otherwise.
    bool mergeExisting = true;
    // Nesting inside an xml value; meaningful only while `position` is set.
    int32_t xmlDepth = 0;

    ElementName pendingName;  // Empty: no element is pending.
    // They stay when the element has become a node: all open elements' attributes are parameters.
    AttributeList pendingAttributes;
    std::string text;                       // Since the last start tag at this level, in UTF-8.
    std::vector<InstanceRecord> instances;  // What `names` of the pending element stands for.
    std::vector<String> loopVariables;      // Those of `instances`; consecutive equal ones stand here once.

    // Attributes and loop variables stand in the OpenAttributes of the stack, and don't change until they are taken
    // out.
    bool isInOpenAttributes = false;
};

}  // namespace zkhw
