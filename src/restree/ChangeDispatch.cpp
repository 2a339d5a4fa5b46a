#include "restree/ChangeDispatch.h"

#include <new>

#include "restree/NodeAttachments.h"

namespace zkhw {

namespace {

// What a watching node passes on.
constexpr uint32_t nameChanges = NodeNameChanged | AncestorChanged;

}  // namespace

void ChangeDispatch::Run(ResTreeNode& node, uint32_t mask) {
    ChangeDispatch dispatch;
    dispatch.Open(node, mask);
    while (!dispatch.steps.empty()) {
        dispatch.Advance();
    }
    if (dispatch.isIncomplete) {
        throw std::bad_alloc();
    }
}

ChangeDispatch::~ChangeDispatch() {
    for (; !steps.empty(); steps.pop_back()) {
        const Step& step = steps.back();
        if (step.raised == 0 && step.node->attachments) {
            step.node->attachments->dispatch = step.outer;
        }
    }
}

// Throws bad_alloc, and nothing has changed.
void ChangeDispatch::Open(ResTreeNode& node, uint32_t mask) {
    // Before the pass begins: with room for the node and for both turns of one that watches it, no step of it fails.
    constexpr size_t room = 3;
    if (steps.capacity() - steps.size() < room) {
        steps.reserve(steps.size() * 2 + room);
    }
    steps.push_back({&node, 0, mask, 0, 0, 0, false, nullptr});
    if (node.attachments) {
        steps.back().outer = node.attachments->dispatch;
        node.attachments->dispatch = this;
    }
    BeginPass(steps.back());
}

void ChangeDispatch::BeginPass(Step& step) {
    ResTreeNode& node = *step.node;
    step.saved = node.pendingChanges;
    step.wasSuspended = node.suspendCount != 0;
    step.delivered = step.saved & step.mask;
    step.next = 0;
    node.suspendCount = 1;
    node.pendingChanges = 0;
    if (node.attachments) {
        node.attachments->observers.SetNotifying(true);
    }
}

// True if the pass was the last.
bool ChangeDispatch::EndPass(Step& step) const {
    ResTreeNode& node = *step.node;
    if (step.delivered != 0) {
        step.saved &= ~step.delivered;
        // Not while an outer run goes through the same records: it does the sweep.
        if (node.attachments && step.outer == nullptr) {
            node.attachments->observers.Sweep();
        }
    }
    node.pendingChanges |= step.saved;
    node.suspendCount = step.wasSuspended ? 1 : 0;
    if (node.attachments) {
        node.attachments->observers.SetNotifying(step.outer != nullptr);
    }
    if (node.suspendCount == 0 && (node.pendingChanges & step.mask) != 0) {
        return false;
    }
    if (node.attachments) {
        node.attachments->dispatch = step.outer;
    }
    return true;
}

void ChangeDispatch::RaiseInTurn(ResTreeNode& node, uint32_t changes) {
    if (node.isDefunct) {
        return;
    }
    // A node that is open further down the stack has raised this itself: a cycle of "Reserves" ends here.
    if (node.attachments && node.attachments->dispatch == this) {
        return;
    }
    node.pendingChanges |= changes;
    if (node.suspendCount == 0) {
        try {
            Open(node, allChanges);
        } catch (const std::bad_alloc&) {
            // The others are told all the same, so that none stays held back. What waits here comes with the next
            // change of the node.
            isIncomplete = true;
        }
    }
}

void ChangeDispatch::Advance() {
    Step& step = steps.back();
    ResTreeNode& node = *step.node;
    if (step.raised != 0) {
        const uint32_t raised = step.raised;
        steps.pop_back();
        RaiseInTurn(node, raised);
        return;
    }
    if (node.isDefunct) {
        steps.pop_back();
        return;
    }
    const ObserverRecord* next = step.delivered == 0 || !node.attachments
                                     ? nullptr
                                     : node.attachments->observers.NextActive(step.next, step.delivered);
    if (next != nullptr) {
        // A copy: the call may register observers and so move the records.
        const ObserverRecord record = *next;
        const uint32_t delivered = step.delivered;
        if (record.chained == nullptr) {
            record.observer->OnNodeChanged(&node, delivered, record.context);
            return;
        }
        // A watching node hears in two turns, names first: the top of the stack is next.
        if ((delivered & ReservationChanged) != 0) {
            steps.push_back({record.chained, ReservationChanged, 0, 0, 0, 0, false, nullptr});
        }
        if ((delivered & nameChanges) != 0) {
            steps.push_back({record.chained, delivered & nameChanges, 0, 0, 0, 0, false, nullptr});
        }
        return;
    }
    if (EndPass(step)) {
        steps.pop_back();
    } else {
        BeginPass(step);
    }
}

}  // namespace zkhw
