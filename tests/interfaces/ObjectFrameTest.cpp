#include <gtest/gtest.h>

#include <cstring>
#include <thread>

#include "interfaces/CQNComObject.h"
#include "interfaces/support/NodeViewTest.h"
#include "support/ProcessEnd.h"

namespace zkhw {
namespace {

constexpr IID probeId = {0x11111111, 0x2222, 0x3333, {1, 2, 3, 4, 5, 6, 7, 8}};
constexpr IID otherId = {0x11111111, 0x2222, 0x3333, {1, 2, 3, 4, 5, 6, 7, 9}};
constexpr IID unknownId = {0, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
// The third 32-bit word is 0xC000 here, that is 0x00C0 in the byte order of memory.
constexpr IID unknownTwinId = {0, 0, 0, {0x00, 0xC0, 0, 0, 0, 0, 0, 0x46}};

struct IProbe : public IUnknown {
    virtual ULONG STDMETHODCALLTYPE Touch() = 0;

  protected:
    ~IProbe() = default;
};

// A concrete class of either thread model, with a map of its test's choice.
template <typename ThreadModel>
class Probe : public IProbe, public CQNComObjectRootEx<ThreadModel> {
  public:
    static InterfaceMapEntry interfaceMap[4];

    ULONG STDMETHODCALLTYPE Touch() override { return ++touched; }
    int32_t Count() const { return this->count; }
    void SetCount(int32_t value) { this->count = value; }

    // Called by the leaf when the last reference has gone.
    void FinalRelease() {
        countInDestruction = this->count;
        if (pairsInDestruction) {
            this->AddRef();
            this->Release();
        }
    }

    ULONG touched = 0;
    bool pairsInDestruction = false;

    static inline int destroyed = 0;
    static inline int32_t countInDestruction = 0;

  protected:
    virtual ~Probe() { ++destroyed; }
};

template <typename ThreadModel>
InterfaceMapEntry Probe<ThreadModel>::interfaceMap[4] = {{&probeId, 0, InterfaceMapEntry::plain},
                                                         {nullptr, 0, InterfaceMapEntry::closing}};

template <typename ThreadModel>
class ObjectFrame : public ::testing::Test {
  protected:
    using TestProbe = Probe<ThreadModel>;
    using Object = CQNComObject<TestProbe>;

    ObjectFrame() {
        TestProbe::destroyed = 0;
        TestProbe::countInDestruction = 0;
    }

    static Object* Make() {
        Object* object = nullptr;
        EXPECT_EQ(Object::Create(&object), S_OK);
        return object;
    }
};

using ThreadModels = ::testing::Types<CQNComSingleThreadModel, CQNComMultiThreadModelNoCS>;
TYPED_TEST_SUITE(ObjectFrame, ThreadModels);

TYPED_TEST(ObjectFrame, AnObjectIsBornWithACountOfZeroAndClearedFields) {
    auto* object = TestFixture::Make();
    EXPECT_EQ(object->Count(), 0);
    EXPECT_EQ(object->touched, 0U);
    object->AddRef();
    object->Release();
}

TYPED_TEST(ObjectFrame, TheFirstQueryTakesTheFirstReference) {
    auto* object = TestFixture::Make();
    void* result = nullptr;
    EXPECT_EQ(object->QueryInterface(probeId, &result), S_OK);
    EXPECT_EQ(object->Count(), 1);
    EXPECT_EQ(result, static_cast<IProbe*>(object));
    object->Release();
}

TYPED_TEST(ObjectFrame, CountsGoUpAndDownByOne) {
    auto* object = TestFixture::Make();
    EXPECT_EQ(object->AddRef(), 1U);
    EXPECT_EQ(object->AddRef(), 2U);
    EXPECT_EQ(object->AddRef(), 3U);
    EXPECT_EQ(object->Release(), 2U);
    EXPECT_EQ(object->Release(), 1U);
    EXPECT_EQ(TestFixture::TestProbe::destroyed, 0);
    EXPECT_EQ(object->Release(), 0U);
    EXPECT_EQ(TestFixture::TestProbe::destroyed, 1);
}

TYPED_TEST(ObjectFrame, APairOfCallsDuringDestructionDoesNotDestroyAgain) {
    auto* object = TestFixture::Make();
    object->pairsInDestruction = true;
    object->AddRef();
    EXPECT_EQ(object->Release(), 0U);
    EXPECT_EQ(TestFixture::TestProbe::countInDestruction, 1);
    EXPECT_EQ(TestFixture::TestProbe::destroyed, 1);
}

TYPED_TEST(ObjectFrame, TheGreatestSignedCountIsCountedOn) {
    auto* object = TestFixture::Make();
    object->SetCount(0x7FFFFFFF);
    EXPECT_EQ(object->AddRef(), 0x80000000U);
    object->SetCount(1);
    object->Release();
}

TYPED_TEST(ObjectFrame, TheLastCountThatCanBeRaisedBecomesTheGreatest) {
    auto* object = TestFixture::Make();
    object->SetCount(static_cast<int32_t>(0xFFFFFFFE));
    EXPECT_EQ(object->AddRef(), 0xFFFFFFFFU);
    object->SetCount(1);
    object->Release();
}

TYPED_TEST(ObjectFrame, AnIdThatIsNotInTheMapGivesNoInterfaceAndNull) {
    auto* object = TestFixture::Make();
    object->AddRef();
    void* result = object;
    EXPECT_EQ(object->QueryInterface(otherId, &result), E_NOINTERFACE);
    EXPECT_EQ(result, nullptr);
    EXPECT_EQ(object->Count(), 1);
    object->Release();
}

TYPED_TEST(ObjectFrame, OnCreateGivesZeroAndDoesNothing) {
    auto* object = TestFixture::Make();
    EXPECT_EQ(object->OnCreate(nullptr, nullptr), S_OK);
    EXPECT_EQ(object->Count(), 0);
    object->AddRef();
    object->Release();
}

TYPED_TEST(ObjectFrame, EveryBrokenContractTraps) {
    ::testing::FLAGS_gtest_death_test_style = "fast";
    const auto trapped = qn::dsc::osdep::EndsByTrap;
    auto* object = TestFixture::Make();
    object->AddRef();
    void* result = nullptr;
    EXPECT_EXIT(object->QueryInterface(probeId, nullptr), trapped, "");
    EXPECT_EXIT(object->QueryInterface(unknownId, nullptr), trapped, "");
    EXPECT_EXIT((object->SetCount(-1), object->AddRef()), trapped, "");
    EXPECT_EXIT((object->SetCount(0), object->Release()), trapped, "");
    EXPECT_EXIT((object->SetCount(-1), object->Release()), trapped, "");
    EXPECT_EXIT((object->SetCount(INT32_MIN), object->Release()), trapped, "");
    using QuerySlot = HRESULT (*)(void*, REFIID, void**);
    auto* const query = reinterpret_cast<QuerySlot>((*reinterpret_cast<void***>(static_cast<IUnknown*>(object)))[0]);
    EXPECT_EQ(query(object, probeId, &result), S_OK);
    EXPECT_EXIT(query(nullptr, probeId, &result), trapped, "");
    EXPECT_EXIT(
        {
            TestFixture::TestProbe::interfaceMap[0].kind = InterfaceMapEntry::closing;
            object->QueryInterface(probeId, &result);
        },
        trapped, "");
    object->Release();
    object->Release();
}

TEST(MultiThreadModel, CountsEveryCallOfTwoThreads) {
    using Object = CQNComObject<Probe<CQNComMultiThreadModelNoCS>>;
    Object* object = nullptr;
    ASSERT_EQ(Object::Create(&object), S_OK);
    Object::destroyed = 0;
    object->AddRef();
    constexpr int calls = 100'000;
    const auto work = [object] {
        for (int i = 0; i < calls; ++i) {
            object->AddRef();
        }
        for (int i = 0; i < calls; ++i) {
            object->Release();
        }
    };
    std::thread first(work);
    std::thread second(work);
    first.join();
    second.join();
    EXPECT_EQ(object->Count(), 1);
    EXPECT_EQ(object->Release(), 0U);
    EXPECT_EQ(Object::destroyed, 1);
}

// --- The walk over a map ---

struct FunctionCall {
    int calls = 0;
    void* object = nullptr;
    IID id{};
    void** result = nullptr;
    uint32_t offset = 0;
    HRESULT answer = S_OK;
};
FunctionCall lastCall;

HRESULT MapFunction(void* object, REFIID id, void** result, uint32_t offset) {
    ++lastCall.calls;
    lastCall.object = object;
    lastCall.id = id;
    lastCall.result = result;
    lastCall.offset = offset;
    return lastCall.answer;
}

// One object whose map is set entry by entry behind a plain first one of `probeId`.
class InterfaceMap : public ::testing::Test {
  protected:
    using TestProbe = Probe<CQNComSingleThreadModel>;

    InterfaceMap() {
        lastCall = {};
        CQNComObject<TestProbe>::Create(&object);
        object->AddRef();
    }
    ~InterfaceMap() override {
        object->SetCount(1);
        object->Release();
        SetMap({nullptr, 0, InterfaceMapEntry::closing}, {nullptr, 0, InterfaceMapEntry::closing});
    }

    static void SetMap(InterfaceMapEntry second, InterfaceMapEntry third) {
        TestProbe::interfaceMap[1] = second;
        TestProbe::interfaceMap[2] = third;
        TestProbe::interfaceMap[3] = {nullptr, 0, InterfaceMapEntry::closing};
    }

    static InterfaceMapEntry Function(const IID* id, HRESULT answer) {
        lastCall.answer = answer;
        return {id, 5, reinterpret_cast<uintptr_t>(&MapFunction)};
    }

    static constexpr InterfaceMapEntry plainOther = {&otherId, 0, InterfaceMapEntry::plain};

    CQNComObject<TestProbe>* object = nullptr;
    void* result = this;
};

TEST_F(InterfaceMap, AnEntryWithoutAnIdMatchesEveryId) {
    SetMap({nullptr, 0, InterfaceMapEntry::plain}, {nullptr, 0, InterfaceMapEntry::closing});
    EXPECT_EQ(object->QueryInterface(IID_IzkItemMarker, &result), S_OK);
    EXPECT_EQ(result, static_cast<IProbe*>(object));
    EXPECT_EQ(object->Count(), 2);
}

TEST_F(InterfaceMap, TheFirstMatchCounts) {
    SetMap(Function(&probeId, S_OK), plainOther);
    EXPECT_EQ(object->QueryInterface(probeId, &result), S_OK);
    EXPECT_EQ(lastCall.calls, 0);
}

TEST_F(InterfaceMap, AFunctionGetsObjectIdResultAndOffset) {
    SetMap(Function(&otherId, S_OK), {nullptr, 0, InterfaceMapEntry::closing});
    EXPECT_EQ(object->QueryInterface(otherId, &result), S_OK);
    EXPECT_EQ(lastCall.calls, 1);
    EXPECT_EQ(lastCall.object, object);
    EXPECT_TRUE(lastCall.id == otherId);
    EXPECT_EQ(lastCall.result, &result);
    EXPECT_EQ(lastCall.offset, 5U);
    EXPECT_EQ(result, nullptr);
    EXPECT_EQ(object->Count(), 1);
}

TEST_F(InterfaceMap, AFunctionIsNotCalledForAnotherId) {
    SetMap(Function(&otherId, S_OK), {nullptr, 0, InterfaceMapEntry::closing});
    EXPECT_EQ(object->QueryInterface(IID_IzkItemMarker, &result), E_NOINTERFACE);
    EXPECT_EQ(lastCall.calls, 0);
}

TEST_F(InterfaceMap, AFunctionThatSucceedsEndsTheWalk) {
    SetMap(Function(&otherId, S_OK), plainOther);
    EXPECT_EQ(object->QueryInterface(otherId, &result), S_OK);
    EXPECT_EQ(object->Count(), 1);
}

TEST_F(InterfaceMap, AFunctionWithAnIdThatFailsEndsTheWalk) {
    SetMap(Function(&otherId, E_FAIL), plainOther);
    EXPECT_EQ(object->QueryInterface(otherId, &result), E_FAIL);
    EXPECT_EQ(object->Count(), 1);
}

TEST_F(InterfaceMap, AFunctionWithoutAnIdThatFailsLetsTheWalkGoOn) {
    SetMap(Function(nullptr, E_FAIL), plainOther);
    EXPECT_EQ(object->QueryInterface(otherId, &result), S_OK);
    EXPECT_EQ(lastCall.calls, 1);
    EXPECT_EQ(object->Count(), 2);
}

TEST_F(InterfaceMap, AFunctionThatGivesAPositiveResultLetsTheWalkGoOn) {
    SetMap(Function(&otherId, S_FALSE), plainOther);
    EXPECT_EQ(object->QueryInterface(otherId, &result), S_OK);
    EXPECT_EQ(lastCall.calls, 1);
    EXPECT_EQ(object->Count(), 2);
}

TEST_F(InterfaceMap, FunctionsThatAllDeclineEndInNoInterface) {
    SetMap(Function(nullptr, S_FALSE), Function(&otherId, S_FALSE));
    EXPECT_EQ(object->QueryInterface(otherId, &result), E_NOINTERFACE);
    EXPECT_EQ(lastCall.calls, 2);
    EXPECT_EQ(result, nullptr);
}

TEST_F(InterfaceMap, UnknownIsTheFirstEntryAndAsksNoFunction) {
    SetMap(Function(nullptr, E_FAIL), {nullptr, 0, InterfaceMapEntry::closing});
    EXPECT_EQ(object->QueryInterface(unknownId, &result), S_OK);
    EXPECT_EQ(result, static_cast<IProbe*>(object));
    EXPECT_EQ(object->QueryInterface(unknownTwinId, &result), S_OK);
    EXPECT_EQ(result, static_cast<IProbe*>(object));
    EXPECT_EQ(lastCall.calls, 0);
    EXPECT_EQ(object->Count(), 3);
}

TEST_F(InterfaceMap, IdsThatOnlyResembleUnknownAreOrdinaryOnes) {
    for (const IID& id : {IID{1, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}}, IID{0, 1, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}},
                          IID{0, 0, 1, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}}, IID{0, 0, 0, {0xC0, 0xC0, 0, 0, 0, 0, 0, 0x46}},
                          IID{0, 0, 0, {0xC1, 0, 0, 0, 0, 0, 0, 0x46}}, IID{0, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x47}},
                          IID{0, 0, 0, {0, 0, 0xC0, 0, 0, 0, 0, 0x46}}, IID{0, 0, 0, {0xC0, 0, 0, 0, 0x46, 0, 0, 0}}}) {
        EXPECT_EQ(object->QueryInterface(id, &result), E_NOINTERFACE);
    }
}

// --- The node's own map ---

using NodeIdentity = NodeViewTest;

TEST_F(NodeIdentity, AllFiveIdsAndUnknownGiveOnePointer) {
    const NodeView view = Root();
    ULONG references = 1;
    for (const IID& id :
         {IID_IzkhwResourceTreeNode, IID_IzkhwResourceTreeNode2, IID_IzkhwResourceTreeNode3, IID_IzkhwResourceTreeNode4,
          IID_IzkhwResourceTreeNode5, IID_IUnknown, unknownId, unknownTwinId}) {
        void* result = nullptr;
        EXPECT_EQ(view->QueryInterface(id, &result), S_OK);
        EXPECT_EQ(result, view.Get());
        ++references;
    }
    while (references > 1) {
        EXPECT_EQ(view->Release(), --references);
    }
}

TEST_F(NodeIdentity, IdsOfOtherObjectsGiveNoInterfaceAndNull) {
    const NodeView view = Root();
    for (const IID& id : {IID_IzkhwResourceTreeOwner, IID_IzkEIOGResourceTree, IID_IzkEIOGResourceTree2,
                          IID_IzkProjectItemSelector, IID_IzkItemMarker, IID_IzkItemResourceLink, IID{}}) {
        void* result = this;
        EXPECT_EQ(view->QueryInterface(id, &result), E_NOINTERFACE);
        EXPECT_EQ(result, nullptr);
    }
    EXPECT_EQ(view->AddRef(), 2U);
    EXPECT_EQ(view->Release(), 1U);
}

TEST_F(NodeIdentity, AViewHasNoReferenceBeforeItsFirstQuery) {
    ResTreeNodeAdapter* const made = ResTreeNodeAdapter::Make(root.get(), &observers);
    void* result = nullptr;
    EXPECT_EQ(made->QueryInterface(IID_IzkhwResourceTreeNode, &result), S_OK);
    EXPECT_EQ(result, made);
    EXPECT_EQ(made->Release(), 0U);
}

TEST_F(NodeIdentity, TwoViewsOfANodeAreTwoObjects) {
    const NodeView first = Root();
    const NodeView second = Root();
    EXPECT_NE(first.Get(), second.Get());
}

TEST_F(NodeIdentity, AViewOutlivesItsNodeForRelease) {
    NodeView view = View(*AddChild(*root, u"Gone"));
    root->RemoveEntryByName(u"Gone");
    EXPECT_EQ(view->AddRef(), 2U);
    EXPECT_EQ(view->Release(), 1U);
}

TEST(InterfaceIds, HaveTheBytesOfTheirTexts) {
    struct Case {
        IID id;
        uint8_t bytes[16];
    };
    const Case cases[] = {
        {IID_IUnknown, {0, 0, 0, 0, 0, 0, 0, 0, 0xC0, 0, 0, 0, 0, 0, 0, 0x46}},
        {IID_IzkhwResourceTreeNode,
         {0xB5, 0x63, 0x86, 0x23, 0x4F, 0xBA, 0x53, 0x4A, 0x82, 0xEE, 0x98, 0x6B, 0x3E, 0x80, 0xC8, 0xF2}},
        {IID_IzkhwResourceTreeNode2,
         {0x92, 0x85, 0xE4, 0xA0, 0xB7, 0x79, 0xC2, 0x41, 0xBA, 0x2A, 0x7C, 0x18, 0x28, 0xEF, 0xE2, 0xD5}},
        {IID_IzkhwResourceTreeNode3,
         {0x3F, 0xD6, 0x78, 0xA6, 0x7C, 0xC8, 0xFF, 0x4E, 0x90, 0x58, 0xC3, 0x61, 0x0A, 0x1B, 0x11, 0x0F}},
        {IID_IzkhwResourceTreeNode4,
         {0xEC, 0x5A, 0xF9, 0xFE, 0x75, 0x4F, 0x23, 0x41, 0xBA, 0xA9, 0xB8, 0xA0, 0xBD, 0x3F, 0x8A, 0xB1}},
        {IID_IzkhwResourceTreeNode5,
         {0xA8, 0xAB, 0x4A, 0x2C, 0x50, 0x45, 0x9D, 0x47, 0xB8, 0x4A, 0x06, 0xFB, 0xE9, 0x20, 0x4F, 0x97}},
        {IID_IzkhwResourceTreeOwner,
         {0x5D, 0xE9, 0x9B, 0x36, 0x55, 0xFD, 0x08, 0x47, 0x89, 0x15, 0xF7, 0x10, 0xBE, 0x89, 0xAC, 0x12}},
        {IID_IzkEIOGResourceTree,
         {0xA0, 0xD3, 0xCA, 0xD5, 0xEB, 0x9C, 0x45, 0x4A, 0xB5, 0x64, 0xBE, 0x4E, 0xAF, 0xD0, 0x44, 0x83}},
        {IID_IzkEIOGResourceTree2,
         {0xA4, 0x76, 0xE6, 0x93, 0x6B, 0x16, 0xAD, 0x48, 0xA3, 0x52, 0x1F, 0x9D, 0xC1, 0x01, 0x85, 0xC7}},
        {IID_IzkProjectItemSelector,
         {0x44, 0x66, 0xAF, 0x4E, 0xFB, 0x35, 0x1A, 0x44, 0x8E, 0xC2, 0x14, 0x4B, 0x44, 0x34, 0x80, 0xC8}},
        {IID_IzkItemMarker,
         {0xA0, 0xEE, 0x8C, 0x06, 0x09, 0xD8, 0xD2, 0x11, 0x95, 0x4B, 0x00, 0x60, 0x97, 0xB7, 0x7F, 0xC1}},
        {IID_IzkItemResourceLink,
         {0x8D, 0x10, 0x02, 0xB4, 0x34, 0x14, 0x79, 0x40, 0x9A, 0x55, 0x42, 0xC4, 0xF1, 0xE8, 0x56, 0x4C}},
    };
    for (const Case& each : cases) {
        EXPECT_EQ(std::memcmp(&each.id, each.bytes, 16), 0) << std::hex << each.id.Data1;
    }
}

}  // namespace
}  // namespace zkhw
