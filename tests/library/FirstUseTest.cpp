// What concerns the first use of the library in a process: each test does it in a child, and the parent never does.

#include <new>

#include "library/PlainHostTest.h"
#include "support/AllocationFaultScope.h"
#include "support/ProcessEnd.h"
#include "zkfpga/host_interfaces.h"
#include "zkfpga/tree_owner.h"

namespace {

using support::AllocationFaultScope;

// Counts how often it is asked for what stands below it.
class ProjectItem final : public IzkProjectItem {
  public:
    HRESULT QueryInterface(const IID&, void**) override { return E_NOINTERFACE; }
    ULONG AddRef() override { return 2; }
    ULONG Release() override { return 1; }
    HRESULT GetItemInfo(ProjectItemRecord*) override { return S_OK; }
    HRESULT GetName(BSTR*) override { return S_OK; }
    HRESULT GetProject(IUnknown**) override { return E_FAIL; }
    HRESULT SelectItems(IzkProjectItemSelector*, IUnknown**) override {
        ++selections;
        return S_OK;
    }
    int selections = 0;
};

constexpr HRESULT refusal = static_cast<HRESULT>(0x80070057U);

// Stands for the tree by itself, and refuses to be a node.
class HostContext final : public IzkHostContext {
  public:
    HRESULT QueryInterface(const IID& id, void** result) override {
        ++queries;
        *result = id == IID_IUnknown ? this : nullptr;
        return *result != nullptr ? S_OK : refusal;
    }
    ULONG AddRef() override { return 2; }
    ULONG Release() override { return 1; }
    IzkProjectItemLocator* GetItemLocator() override { return nullptr; }
    int queries = 0;
};

using FirstUse = PlainHostTest;

TEST_F(FirstUse, OwnerIsAskedOfTheContext) {
    EXPECT_IN_CHILD([] {
        HostContext context;
        void* owner = nullptr;
        if (QueryResourceTreeInterface(&IID_IzkhwResourceTreeOwner, &context, nullptr, &owner) != S_OK) {
            return false;
        }
        IzkhwResourceTreeNode* node = nullptr;
        const bool wasAskedOnce = context.queries == 1;
        return wasAskedOnce && static_cast<IzkhwResourceTreeOwner*>(owner)->GetRootNode(&node) == refusal &&
               context.queries == 2;
    });
}

TEST_F(FirstUse, OwnerIsAskedOfTheItemIfThereIsOne) {
    EXPECT_IN_CHILD([] {
        HostContext context;
        ProjectItem item;
        void* owner = &item;
        // The item has no project to show.
        return QueryResourceTreeInterface(&IID_IzkhwResourceTreeOwner, &context, &item, &owner) == E_FAIL &&
               owner == nullptr && context.queries == 0;
    });
}

TEST_F(FirstUse, ItemOfTheFirstQueryGivesTheAliases) {
    EXPECT_IN_CHILD([] {
        HostContext context;
        ProjectItem first;
        ProjectItem second;
        void* tree = nullptr;
        for (ProjectItem* item : {&first, &second}) {
            QueryResourceTreeInterface(&IID_IzkEIOGResourceTree2, &context, item, &tree);
        }
        HostTexts list;
        unsigned char found = 0;
        return FPGAResTree_GetDescendantNames("", "", "includeAliases=true", &list.array, &found) == S_OK &&
               found == 1 && first.selections == 1 && second.selections == 0;
    });
}

TEST_F(FirstUse, ExportedQueriesHaveNoItem) {
    EXPECT_IN_CHILD([] {
        ProjectItem item;
        void* tree = nullptr;
        HostTexts list;
        unsigned char found = 0;
        FPGAResTree_GetProperty("a", "b", "", nullptr, &found);
        QueryResourceTreeInterface(&IID_IzkEIOGResourceTree2, nullptr, &item, &tree);
        return FPGAResTree_GetDescendantNames("", "", "includeAliases=true", &list.array, &found) == S_OK &&
               item.selections == 0;
    });
}

using FirstUseWithoutMemory = PlainHostTest;

TEST_F(FirstUseWithoutMemory, QueriesGiveOutOfMemoryAndTouchNothing) {
    EXPECT_IN_CHILD([] {
        const HostText text("before");
        HostTexts list;
        unsigned char found = 0xAA;
        bool isRight = true;
        const auto check = [&isRight](const auto& query) {
            const AllocationFaultScope fault(1, true);
            isRight = query() == E_OUTOFMEMORY && isRight;
        };
        check([&] { return FPGAResTree_GetProperty("a", "b", "", text.Get(), &found); });
        check([&] { return FPGAResTree_GetDescendantNames("a", "b", "", &list.array, &found); });
        check([&] { return FPGAResTree_GetMultipleProperties("a", "b", "", &list.array, &found); });
        check([&] { return FPGAResTree_Dump("a", "b", "", text.Get()); });
        return isRight && text.Bytes() == "before" && list.array == nullptr && found == 0xAA;
    });
}

TEST_F(FirstUseWithoutMemory, SingletonIsMadeOnceThereIsMemory) {
    EXPECT_IN_CHILD([] {
        bool wasNull = false;
        {
            const AllocationFaultScope fault(1, true);
            wasNull = gFPGAResTree() == nullptr;
        }
        const auto* const singleton = gFPGAResTree();
        return wasNull && singleton != nullptr && gFPGAResTree() == singleton;
    });
}

TEST_F(FirstUseWithoutMemory, QueryForAnInterfaceTraps) {
    const auto query = [] {
        void* result = nullptr;
        const AllocationFaultScope fault(1, true);
        QueryResourceTreeInterface(&IID_IzkEIOGResourceTree, nullptr, nullptr, &result);
    };
    EXPECT_EXIT(query(), qn::dsc::osdep::EndsByTrap, "^$");
}

// The first query with the `nth` allocation failing, and then a second one with memory.
bool FirstQueryEndsInOrder(uint64_t nth) {
    unsigned char found = 0xAA;
    bool isWhole = false;
    try {
        const AllocationFaultScope fault(nth);
        const HRESULT first = FPGAResTree_GetProperty("a", "b", "", nullptr, &found);
        if (first != S_OK && first != E_OUTOFMEMORY && first != E_FAIL) {
            return false;
        }
        // Without a root the next query builds anew; without an object around the root the tree is complete.
        isWhole = first == E_OUTOFMEMORY;
    } catch (const std::bad_alloc&) {
        if (found != 0xAA) {
            return false;
        }
    }
    const HRESULT second = FPGAResTree_GetProperty("a", "b", "", nullptr, &found);
    return second == S_OK && (found == 1 || (found == 0 && !isWhole));
}

TEST_F(FirstUseWithoutMemory, FirstQueryEndsInOrderWhicheverAllocationFails) {
    for (uint64_t nth = 1; nth <= 150; ++nth) {
        EXPECT_IN_CHILD([this, nth] { return FirstQueryEndsInOrder(nth) && LiveHandles() == 0; })
            << "allocation " << nth;
    }
}

}  // namespace
