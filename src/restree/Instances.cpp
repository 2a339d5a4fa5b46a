#include "restree/Instances.h"

namespace zkhw {

void ReplicateInstances(ParseFrame& frame) {
    ResTreeNode& node = *frame.node;
    frame.position = nullptr;
    EntryIterator last = node.FindEntry(frame.instances.front().name.View());
    ResTreeNode* pattern = last.IsEnd() ? nullptr : last->Child();
    if (pattern == nullptr) {
        return;
    }
    for (size_t i = 1; i < frame.instances.size(); ++i) {
        const InstanceRecord& record = frame.instances[i];
        ResTreeNode* copy = nullptr;
        ++last;
        last = node.CloneSubtreeInto(last, record.name.View(), *pattern, frame.mergeExisting, copy);
        if (copy != nullptr) {
            copy->ApplyInstance(record.name, record.variable, record.index);
        }
    }
    // The pattern stays unexpanded until all copies have been made from it.
    const InstanceRecord& first = frame.instances.front();
    pattern->ApplyInstance(first.name, first.variable, first.index);
}

}  // namespace zkhw
