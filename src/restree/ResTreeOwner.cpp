#include "restree/ResTreeOwner.h"

#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"

namespace zkhw {

ResTreeOwner::~ResTreeOwner() {
    delete rootNode;
}

int32_t ResTreeOwner::GetRootNode(ResTreeNode*& root) {
    if (rootNode == nullptr) {
        const int32_t created = CreateRootNode(rootNode);
        if (created < 0) {
            return created;
        }
        if (rootNode == nullptr) {
            return generalFailure;
        }
        const int32_t announced = OnRootNodeCreated(rootNode);
        if (announced < 0) {
            return announced;
        }
    }
    root = rootNode;
    return success;
}

int32_t ResTreeOwner::OnRootNodeCreated(ResTreeNode*) {
    return success;
}

}  // namespace zkhw
