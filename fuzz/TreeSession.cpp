#include "TreeSession.h"

#include <algorithm>
#include <tuple>

#include "FuzzInput.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/ChangeFlags.h"

namespace fuzz {

Session::Session(bool ordered) : owner(std::make_unique<Owner>(ordered)), model(ordered) {
    owner->GetRootNode(root);
    View view;
    owner->GetRootNodeInterface(view.ReceiveAny());
    set = static_cast<zkhw::ResTreeNodeAdapter*>(view.Get())->GetObservers();
    for (size_t i = 0; i < observerCount; ++i) {
        observers[i].session = this;
        observers[i].number = i;
    }
    model.reaction = [this](model::Registration registration) { React(registration); };
}

void Session::React(model::Registration registration) {
    if (isEnding || modelReactions == 0 || registration.observer < SetsAProperty) {
        return;
    }
    --modelReactions;
    if (registration.observer == SetsAProperty) {
        model.Set(*registration.node, u"Seen", u"1");
    } else if (registration.observer == EndsItself) {
        model.Unadvise(*registration.node, registration.observer, registration.id, false);
    } else if (registration.observer == BringsAnother) {
        model.Advise(*registration.node, JustListens, allFlags, 5);
    }
}

HRESULT Observer::NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) {
    session->calls.push_back({number, changes, id, static_cast<zkhw::ResTreeNodeAdapter*>(node)->GetNode()});
    if (session->isEnding || session->reactions == 0 || number < SetsAProperty) {
        return S_OK;
    }
    --session->reactions;
    if (number == SetsAProperty) {
        node->SetProperty(In(u"Seen"), In(u"1"));
    } else if (number == EndsItself) {
        node->Unadvise(this, id, 0);
    } else if (number == BringsAnother) {
        node->Advise(&session->observers[JustListens], allFlags, 5);
    } else {
        session->isWild = true;
        View parent;
        node->GetParent(Receive(parent));
        node->RemoveEntry(In((changes & zkhw::ChildAdded) != 0 ? u"b" : u"a"));
        if (parent && (id & 1) != 0) {
            parent->RemoveEntry(In(u"a"));
        }
    }
    return E_FAIL;
}

// --- Comparison ---

void SameNode(model::Node& node, ResTreeNode& real) {
    node.real = &real;
    Require(real.GetName() == node.name && real.GetType() == node.type, "name and type are the same");
    Require(real.IsOrdered() == node.ordered, "both keep the order or neither");
    Require(real.HasNoPendingChanges() == (node.pending == 0), "changes wait in both or in neither");
    const std::vector<zkhw::Reservation>& held = real.GetReservations();
    Require(held.size() == node.holders.size(), "as many hold the node");
    for (size_t i = 0; i < held.size(); ++i) {
        Require(held[i].owner.View() == node.holders[i].owner && held[i].mode == node.holders[i].mode,
                "the same hold the node, in the same way");
    }
    auto entry = real.Begin();
    for (const auto& expected : node.entries) {
        Require(entry != real.End(), "no entry too few");
        Require(entry.Key() == expected->key && entry->Kind() == expected->kind, "the same entries in order");
        if (expected->child) {
            Require(entry->Child()->GetParent() == &real, "a child knows its parent");
            SameNode(*expected->child, *entry->Child());
        } else {
            const auto text = entry->IsText() ? entry->Text() : entry->LinkPath();
            Require(text && *text == expected->text, "each has its value");
        }
        ++entry;
    }
    Require(entry == real.End(), "no entry too many");
}

void SameCalls(Session& session) {
    Require(session.calls == session.model.calls, "the same observers are called with the same, in order");
    session.calls.clear();
    session.model.calls.clear();
}

void End(Session& session) {
    session.isEnding = true;
    std::vector<const model::Registration*> left;
    for (const auto& registration : session.model.registrations) {
        left.push_back(registration.get());
    }
    std::sort(left.begin(), left.end(), [&](const model::Registration* a, const model::Registration* b) {
        const auto key = [&](const model::Registration* registration) {
            return std::make_tuple(reinterpret_cast<uintptr_t>(registration->node->real),
                                   reinterpret_cast<uintptr_t>(&session.observers[registration->observer]),
                                   registration->id);
        };
        return key(a) < key(b);
    });
    for (const model::Registration* registration : left) {
        session.model.calls.push_back({registration->observer, zkhw::NodeDeleted, 0, registration->node->real});
    }
    session.owner.reset();
    if (!session.isWild) {
        SameCalls(session);
    }
    session.kept.clear();
    for (const Observer& observer : session.observers) {
        Require(observer.references == 0, "every reference to an observer is given back");
    }
}

}  // namespace fuzz
