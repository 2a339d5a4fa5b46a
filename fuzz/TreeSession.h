#pragma once

// A tree in the hands of a host with its observers, and the model that has to agree with it.

#include <array>
#include <cstdint>
#include <memory>
#include <vector>

#include "TreeModel.h"
#include "TreeQuestions.h"
#include "restree/ResTreeNode.h"
#include "restree/ResTreeOwner.h"
#include "zkfpga/tree_owner.h"

namespace fuzz {

using zkhw::ResTreeNode;

constexpr size_t observerCount = 6;
constexpr uint32_t allFlags = 0x7FF;

// What each observer does when it is called.
enum Habit : size_t { JustListens, ListensToo, SetsAProperty, EndsItself, BringsAnother, RemovesEntries };

// Removing observers can do anything; others only so much in one operation, or they would go on for ever.
constexpr int reactionsPerOperation = 4;

class Owner : public zkhw::ResTreeOwner {
  public:
    explicit Owner(bool ordered) : ordered(ordered) {}
    int32_t CreateRootNode(ResTreeNode*& root) override {
        root = new ResTreeNode(u"", u"Root", ordered);
        return 0;
    }

  private:
    bool ordered;
};

struct Session;

class Observer final : public IzkhwResourceTreeNodeObserver {
  public:
    Observer() = default;
    virtual ~Observer() = default;
    Observer(const Observer&) = delete;
    Observer& operator=(const Observer&) = delete;

    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID, void** result) override {
        *result = nullptr;
        return E_NOINTERFACE;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return static_cast<ULONG>(++references); }
    ULONG STDMETHODCALLTYPE Release() override { return static_cast<ULONG>(--references); }
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) override;

    Session* session = nullptr;
    size_t number = 0;
    int references = 0;
};

struct Session {
    explicit Session(bool ordered);

    View ViewOf(const model::Node& node) const { return MakeView(*node.real, set); }

    // The model's share of what an observer does.
    void React(model::Registration registration);

    std::array<Observer, observerCount> observers;
    std::unique_ptr<Owner> owner;
    ResTreeNode* root = nullptr;
    zkhw::AdapterObserverSet* set = nullptr;
    model::Tree model;
    std::vector<model::Call> calls;
    std::vector<View> kept;  // Views that outlive their nodes.
    int reactions = 0;
    int modelReactions = 0;
    size_t links = 0;
    bool isEnding = false;
    bool isWild = false;  // An observer has removed something under way: the model doesn't count any more.
};

// Ends the process unless the real node, and all below, is as the model says; notes in the model which node is which.
void SameNode(model::Node& node, ResTreeNode& real);

// The same for the calls of observers since the last time.
void SameCalls(Session& session);

// Takes the tree down. Every registration hears of its end, whatever it listens to, in the order of the set.
void End(Session& session);

}  // namespace fuzz
