// Whether one node offers all that another asks for. Both are asked only through their interfaces: the other one may be
// an object of the host.

#include <set>
#include <string_view>
#include <utility>
#include <vector>

#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

using qn::dsc::osdep::Equal;
using NodePointer = InterfacePointer<IzkhwResourceTreeNode>;
using Node5Pointer = InterfacePointer<IzkhwResourceTreeNode5>;

// Takes an array of strings apart into ones that free themselves.
class ReceivedTexts {
  public:
    ReceivedTexts() = default;
    ReceivedTexts(const ReceivedTexts&) = delete;
    ReceivedTexts& operator=(const ReceivedTexts&) = delete;
    ~ReceivedTexts() { FreeTexts(count, array); }

    ULONG count = 0;
    BSTR* array = nullptr;
};

// The same for an array of nodes. What is taken out of it is to be set to null there.
class ReceivedNodes {
  public:
    ReceivedNodes() = default;
    ReceivedNodes(const ReceivedNodes&) = delete;
    ReceivedNodes& operator=(const ReceivedNodes&) = delete;
    ~ReceivedNodes() {
        for (ULONG i = 0; i < count; ++i) {
            NodePointer(array[i]).Reset();
        }
        CoTaskMemFree(array);
    }

    ULONG count = 0;
    IzkhwResourceTreeNode** array = nullptr;
};

std::vector<NodePointer> ReceiveChildren(IzkhwResourceTreeNode& node, bool& succeeded) {
    ReceivedNodes nodes;
    succeeded = SUCCEEDED(node.GetChildren(&nodes.count, &nodes.array));
    std::vector<NodePointer> children;
    children.reserve(nodes.count);
    for (ULONG i = 0; i < nodes.count; ++i) {
        children.emplace_back(std::exchange(nodes.array[i], nullptr));
    }
    return children;
}

bool IsSubset(std::u16string_view part, std::u16string_view whole) {
    std::set<String> offered;
    SplitList(whole, u",", offered, false);
    PieceReader wanted(part, u",", false);
    while (wanted.Next()) {
        if (offered.count(UnescapeText(wanted.Raw(), u',')) == 0) {
            return false;
        }
    }
    return true;
}

// Whether `b` meets what the property `name` of `a` asks for.
bool IsPropertyMet(IzkhwResourceTreeNode5& a, IzkhwResourceTreeNode5& b, BSTR name, bool skipLocalized) {
    if (skipLocalized && (a.IsLocalizedProperty(name) != S_FALSE || b.IsLocalizedProperty(name) != S_FALSE)) {
        return true;
    }
    if (Equal(ViewOf(name), u"Value") || Equal(ViewOf(name), u"Interface")) {
        return true;
    }
    OwnedBstr valueOfA;
    OwnedBstr valueOfB;
    if (a.GetProperty(name, valueOfA.Receive()) != S_OK || b.GetProperty(name, valueOfB.Receive()) != S_OK ||
        valueOfA.Get() == nullptr || valueOfB.Get() == nullptr) {
        return false;
    }
    return Equal(ViewOf(name), u"SupportedValues") ? IsSubset(valueOfA.View(), valueOfB.View())
                                                   : Equal(valueOfA.View(), valueOfB.View());
}

bool ArePropertiesMet(IzkhwResourceTreeNode& a, IzkhwResourceTreeNode& b, bool skipLocalized) {
    ReceivedTexts names;
    if (FAILED(a.GetPropertyNames(&names.count, &names.array))) {
        return false;
    }
    Node5Pointer latestA;
    Node5Pointer latestB;
    if (FAILED(a.QueryInterface(IID_IzkhwResourceTreeNode5, latestA.ReceiveAny())) ||
        FAILED(b.QueryInterface(IID_IzkhwResourceTreeNode5, latestB.ReceiveAny()))) {
        return false;
    }
    for (ULONG i = 0; i < names.count; ++i) {
        if (!IsPropertyMet(*latestA.Get(), *latestB.Get(), names.array[i], skipLocalized)) {
            return false;
        }
    }
    return true;
}

// Walks `a` and the nodes of `b` that stand at the same places. The children of a node are done before its properties.
class CompatibilityWalk {
  public:
    explicit CompatibilityWalk(bool skipLocalized) : skipLocalized(skipLocalized) {}

    bool Run(NodePointer a, NodePointer b) {
        if (!Enter(std::move(a), std::move(b))) {
            return false;
        }
        while (!levels.empty()) {
            Level& level = levels.back();
            if (level.next == level.children.size()) {
                if (!ArePropertiesMet(*level.a.Get(), *level.b.Get(), skipLocalized)) {
                    return false;
                }
                nodesOfA.erase(NodeOf(level.a));
                levels.pop_back();
                continue;
            }
            NodePointer child = std::move(level.children[level.next++]);
            NodePointer counterpart = FindCounterpart(*child.Get(), *level.b.Get());
            if (!counterpart) {
                return false;
            }
            // A link back to where the walk stands asks for nothing more.
            if (nodesOfA.count(NodeOf(child)) == 0 && !Enter(std::move(child), std::move(counterpart))) {
                return false;
            }
        }
        return true;
    }

  private:
    struct Level {
        NodePointer a;
        NodePointer b;
        std::vector<NodePointer> children;
        size_t next = 0;
    };

    // All nodes of the asking side are views of this library.
    static const ResTreeNode* NodeOf(const NodePointer& a) {
        return static_cast<const ResTreeNodeAdapter*>(a.Get())->GetNode();
    }

    static NodePointer FindCounterpart(IzkhwResourceTreeNode& child, IzkhwResourceTreeNode& b) {
        NodePointer counterpart;
        OwnedBstr name;
        if (SUCCEEDED(child.GetName(name.Receive()))) {
            const String path = EscapeText(name.View(), CharacterSet{u"/"});
            b.FindNode(reinterpret_cast<LPCWSTR>(path.CStr()), nullptr, nullptr, counterpart.Receive());
        }
        return counterpart;
    }

    bool Enter(NodePointer a, NodePointer b) {
        bool succeeded = false;
        std::vector<NodePointer> children = ReceiveChildren(*a.Get(), succeeded);
        if (!succeeded) {
            return false;
        }
        nodesOfA.insert(NodeOf(a));
        levels.push_back({std::move(a), std::move(b), std::move(children)});
        return true;
    }

    bool skipLocalized;
    std::vector<Level> levels;
    std::set<const ResTreeNode*> nodesOfA;  // Of the open levels.
};

}  // namespace

HRESULT ResTreeNodeAdapter::IsCompatibleWith(IzkhwResourceTreeNode* other, BOOL* result) {
    return IsCompatibleWithEx(other, result, 0);
}

HRESULT ResTreeNodeAdapter::IsCompatibleWithEx(IzkhwResourceTreeNode* other, BOOL* result, BOOL skipLocalized) {
    if (result == nullptr) {
        return E_POINTER;
    }
    *result = other != nullptr &&
                      CompatibilityWalk(skipLocalized != 0).Run(NodePointer::Share(this), NodePointer::Share(other))
                  ? 1
                  : 0;
    return S_OK;
}

}  // namespace zkhw
