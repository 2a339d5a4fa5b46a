#pragma once

// A host's observer. It notes every call, and then does what the test has asked for.

#include <functional>
#include <string>
#include <utility>

#include "interfaces/support/HostObject.h"
#include "support/ChangeLog.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {

class HostObserver : public HostObject<IzkhwResourceTreeNodeObserver> {
  public:
    explicit HostObserver(std::string label = "observer", ChangeLog* log = nullptr)
        : label(std::move(label)), log(log != nullptr ? log : &own) {}

    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) override {
        ++calls;
        lastNode = node;
        log->Add(label + ": " + FlagNames(changes) + " #" + std::to_string(id));
        if (reaction) {
            reaction(*node, changes);
        }
        // Nobody looks at it.
        return E_FAIL;
    }

    // "observer: PropertyAdded|ChildAdded #7", a line for each call since the last Take.
    std::string Take() { return log->Take(); }

    std::function<void(IzkhwResourceTreeNode& node, ULONG changes)> reaction;
    IzkhwResourceTreeNode* lastNode = nullptr;  // No reference.
    size_t calls = 0;

  private:
    std::string label;
    ChangeLog own;
    ChangeLog* log;
};

}  // namespace zkhw
