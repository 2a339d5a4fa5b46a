#pragma once

// Change notices as text, in the order in which they arrive:
//
//     watcher: Board PropertyChanged #7       who heard, of which node, what was delivered, the context
//     watcher: gone                           the observer died (only one that is owned by its node)

#include <cstdint>
#include <functional>
#include <string>
#include <utility>

#include "restree/ResTreeNode.h"
#include "support/ExactText.h"

namespace zkhw {

// The flags of a set in ascending order, with "|" between them; "0" for none.
inline std::string FlagNames(uint32_t changes) {
    struct Name {
        uint32_t flag;
        const char* name;
    };
    constexpr Name names[] = {
        {NodeDeleted, "NodeDeleted"},
        {NodeNameChanged, "NodeNameChanged"},
        {PropertyChanged, "PropertyChanged"},
        {PropertyAdded, "PropertyAdded"},
        {PropertyRemoved, "PropertyRemoved"},
        {AncestorChanged, "AncestorChanged"},
        {ReservationChanged, "ReservationChanged"},
        {ChildRemoved, "ChildRemoved"},
        {ChildAdded, "ChildAdded"},
        {ChildNameChanged, "ChildNameChanged"},
        {NodeDeleting, "NodeDeleting"},
    };
    std::string text;
    for (const Name& name : names) {
        if ((changes & name.flag) != 0) {
            text += (text.empty() ? "" : "|");
            text += name.name;
            changes &= ~name.flag;
        }
    }
    if (changes != 0 || text.empty()) {
        text += (text.empty() ? "" : "|") + std::to_string(changes);
    }
    return text;
}

class ChangeLog {
  public:
    void Add(const std::string& line) { text += line + "\n"; }

    // What was logged since the last call.
    std::string Take() { return std::exchange(text, std::string()); }

  private:
    std::string text;
};

// Logs what it hears, and then does what the test has asked for.
class LoggingObserver : public ResTreeNodeChangeObserver {
  public:
    LoggingObserver(ChangeLog& log, std::string label, bool isOwned = false)
        : log(log), label(std::move(label)), isOwned(isOwned) {}
    ~LoggingObserver() override {
        if (isOwned) {
            log.Add(label + ": gone");
        }
    }

    void OnNodeChanged(ResTreeNode* node, uint32_t changes, int32_t context) override {
        log.Add(label + ": " + qn::dsc::ExactText(node->GetName()) + " " + FlagNames(changes) + " #" +
                std::to_string(context));
        if (reaction) {
            reaction(*node, changes);
        }
    }
    bool DeleteWithNode() override { return isOwned; }

    std::function<void(ResTreeNode& node, uint32_t changes)> reaction;

  private:
    ChangeLog& log;
    std::string label;
    bool isOwned;
};

// Counts what it hears, for trees too large for a log.
class CountingObserver : public ResTreeNodeChangeObserver {
  public:
    void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override { ++calls; }

    uint64_t calls = 0;
};

}  // namespace zkhw
