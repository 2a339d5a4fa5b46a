#include "restree/Instances.h"

#include "restree/Parameters.h"

namespace zkhw {

void ReplicateInstances(ParseFrame& frame) {
    ResTreeNode& node = *frame.node;
    frame.position = nullptr;
    const NodeEntry* last = node.Find(frame.instances.front().name.View());
    ResTreeNode* pattern = last == nullptr ? nullptr : last->Child();
    if (pattern == nullptr) {
        return;
    }
    for (size_t i = 1; i < frame.instances.size(); ++i) {
        const InstanceRecord& record = frame.instances[i];
        const InstanceParameters parameters(record.name.View(), record.variable, record.index);
        if (const NodeEntry* copy =
                node.CloneExpandedBehind(last, record.name.View(), *pattern, frame.mergeExisting, parameters)) {
            last = copy;
        }
    }
    // The pattern stays unexpanded until all copies have been made from it.
    const InstanceRecord& first = frame.instances.front();
    pattern->ApplyInstance(first.name.View(), first.variable, first.index);
}

}  // namespace zkhw
