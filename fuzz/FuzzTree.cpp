// A tree that a host reads, edits, watches and reserves through its views, beside a slow model of it (TreeModel.h). The
// input is a sequence of operations. After each one tree and model hold the same, the same observers have been called
// in the same order, and each answer was the same; at the end nothing is left of the objects.
//
// Not followed: a renaming onto a sibling of an unordered node, which loses the node's entry for good, and children
// named as the property that shows reservations, which a reservation would destroy under way. What observers do that
// remove nodes under way has no model: with such an observer the rest of the run has only to be sound.

#include <string>
#include <utility>
#include <vector>

#include "FuzzInput.h"
#include "TreeLaws.h"
#include "TreeModel.h"
#include "TreeQuestions.h"
#include "TreeSession.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace {

using fuzz::Require;
using fuzz::Session;
using fuzz::View;
using fuzz::model::Registration;
using zkhw::ResTreeNode;

constexpr size_t mostNodes = 16;
constexpr size_t mostLinks = 5;
constexpr std::u16string_view reservationKey = u"ZKHWReservation";

constexpr std::u16string_view names[] = {u"a",         u"A",           u"b",
                                         u"B2",        u"c/d",         u"e\\f",
                                         u"..",        u".",           u"",
                                         u"-a",        u"Seen",        u"Reserves",
                                         u"Protocols", u"DisplayName", u"ZKHWReservation",
                                         u"\u00E4"};
constexpr std::u16string_view texts[] = {u"",       u"x",           u"/a",         u"a,b",    u"../a", u"../b , ../B2",
                                         u"/",      u"a/b",         u"../c\\/d",   u".",      u"..",   u"b/a,../..",
                                         u"b,A,-a", u"Module,List", u"/a/b,/b2/a", u"/b/../a"};
constexpr std::u16string_view types[] = {u"Thing", u"Module", u"Target", u"a", u"AList", u"Resource", u"b", u""};
constexpr std::u16string_view owners[] = {u"a", u"A", u"b", u"it em", u"", u"\u00C4"};

template <size_t Size>
std::u16string Pick(const std::u16string_view (&table)[Size], uint8_t number) {
    return std::u16string(table[number % Size]);
}

// --- Operations ---

using fuzz::In;

void AddEntry(Session& session, fuzz::model::Node& node, fuzz::Input& input, zkhw::EntryKind kind) {
    std::u16string key = Pick(names, input.TakeByte());
    const uint8_t options = input.TakeByte();
    const std::u16string before = Pick(names, input.TakeByte());
    const std::u16string* position = (options & 1) != 0 ? &before : nullptr;
    const bool ordered = (options & 2) != 0;
    const std::u16string text = kind == zkhw::ChildEntry ? Pick(types, options / 4) : Pick(texts, options / 4);
    const zkhw::String beforeText(before);
    const zkhw::String* realPosition = position == nullptr ? nullptr : &beforeText;
    ResTreeNode& real = *node.real;
    bool isNew = false;
    if (kind == zkhw::ChildEntry) {
        if (session.model.Nodes().size() >= mostNodes || key == reservationKey) {
            return;
        }
        ResTreeNode* child = nullptr;
        isNew = real.AddChildEntry(key, text, ordered, child, realPosition).isNew;
    } else if (kind == zkhw::LinkEntry) {
        if (++session.links > mostLinks) {
            return;
        }
        isNew = real.AddLinkEntry(key, text, realPosition).isNew;
    } else {
        isNew = real.AddTextEntry(key, text, kind, realPosition).isNew;
    }
    const bool isNewInModel = session.model.Add(node, key, kind, text, ordered, position) != nullptr;
    Require(session.isWild || isNew == isNewInModel, "an entry is new to both");
}

void Rename(Session& session, fuzz::model::Node& node, const std::u16string& name) {
    if (name == reservationKey || fuzz::model::Tree::WouldLose(node, name)) {
        return;
    }
    const HRESULT result = session.ViewOf(node)->SetName(In(name));
    const bool isDone = session.model.Rename(node, name);
    Require(session.isWild || result == (isDone ? S_OK : S_FALSE), "both are renamed or neither");
}

void Reserve(Session& session, fuzz::model::Node& node, fuzz::Input& input) {
    const uint8_t operation = input.TakeByte();
    const std::u16string owner = Pick(owners, operation / 16);
    const uint8_t options = input.TakeByte();
    const uint32_t mode = options % 16 < 9 ? options % 3 + 1U : options % 16;
    const std::u16string type = Pick(types, options / 16);
    View view = session.ViewOf(node);
    const auto same = [&](HRESULT result, bool expected) {
        Require(session.isWild || result == (expected ? S_OK : S_FALSE), "a reservation gives the same");
    };
    ULONG granted = 77;
    switch (operation % 6) {
        case 0:
        case 1: {
            const HRESULT result = view->Reserve(In(owner), mode, &granted);
            const uint32_t expected = session.model.Reserve(node, owner, mode);
            same(result, expected != 0);
            Require(session.isWild || granted == expected, "a node is held in the same way");
            break;
        }
        case 2:
        case 3:
            same(view->Unreserve(In(owner)), session.model.Release(node, owner));
            break;
        case 4:
            same(view->ReserveDescendants(In(owner), mode, In(type)),
                 session.model.ReserveAll(node, owner, mode, type));
            break;
        default:
            same(view->UnreserveDescendants(In(owner), In(type)), session.model.ReleaseAll(node, owner, type));
    }
}

void Watch(Session& session, fuzz::model::Node& node, fuzz::Input& input) {
    const uint8_t operation = input.TakeByte();
    const size_t number = operation / 4 % fuzz::observerCount;
    const uint8_t choice = input.TakeByte();
    const uint32_t id = choice % 8 == 7 ? 0xFFFFFFFF : choice % 8;
    View view = session.ViewOf(node);
    if (operation % 4 == 0) {
        const bool subtree = (choice & 8) != 0;
        view->Unadvise(&session.observers[number], id, subtree ? 1 : 0);
        session.model.Unadvise(node, number, id, subtree);
    } else {
        const uint32_t mask = (choice & 8) != 0 ? fuzz::allFlags : input.TakeNumber() & fuzz::allFlags;
        view->Advise(&session.observers[number], mask, id);
        session.model.Advise(node, number, mask, id);
        session.kept.push_back(std::move(view));
    }
}

// "Reserves" becomes a list of up to three nodes, wherever they stand.
void Depend(Session& session, fuzz::model::Node& node, const std::vector<fuzz::model::Node*>& nodes,
            fuzz::Input& input) {
    std::vector<zkhw::String> paths;
    const uint8_t count = input.TakeByte() % 4;
    for (uint8_t i = 0; i < count; ++i) {
        paths.emplace_back(fuzz::model::Tree::PathOf(*nodes[input.TakeByte() % nodes.size()]));
    }
    const std::u16string list(zkhw::JoinAll(paths, u',', true).View());
    session.ViewOf(node)->SetProperty(In(u"Reserves"), In(list));
    session.model.Set(node, u"Reserves", list);
}

void Bracket(Session& session, fuzz::model::Node& node, uint8_t options) {
    View view = session.ViewOf(node);
    if ((options & 1) == 0) {
        ULONG pending = 77;
        view->BeginChange(&pending);
        const uint32_t expected = session.model.BeginChanges(node);
        Require(session.isWild || pending == expected, "the same changes wait");
        ++node.brackets;
    } else if (node.brackets > 0) {
        --node.brackets;
        view->EndChange(options & 0x1C, options & 2);
        session.model.EndChanges(node, options & 0x1C, (options & 2) != 0);
    }
}

void CheckClone(Session& session, fuzz::model::Node& node) {
    View view = session.ViewOf(node);
    View clone;
    Require(view->CloneDetached(nullptr, fuzz::Receive(clone)) == S_OK, "a node can be cloned");
    fuzz::model::Tree copy(node.ordered);
    copy.reaction = [](Registration) {};
    copy.root.name = node.name;
    copy.root.type = node.type;
    copy.CopyInto(copy.root, node);
    ResTreeNode& real = *static_cast<zkhw::ResTreeNodeAdapter*>(clone.Get())->GetNode();
    fuzz::SameNode(copy.root, real);
    // What is done to the copy leaves the original as it is; the comparison that follows shows it.
    clone->SetProperty(In(u"a"), In(u"changed"));
    clone->RemoveEntry(In(u"b"));
    clone->Reserve(In(u"copy"), 1, nullptr);
}

void Step(Session& session, fuzz::Input& input) {
    const uint8_t operation = input.TakeByte();
    const std::vector<fuzz::model::Node*> nodes = session.model.Nodes();
    fuzz::model::Node& node = *nodes[input.TakeByte() % nodes.size()];
    switch (operation % 16) {
        case 0:
        case 1:
        case 2:
            AddEntry(session, node, input, zkhw::ChildEntry);
            break;
        case 3:
            AddEntry(session, node, input, zkhw::LinkEntry);
            break;
        case 4:
            AddEntry(session, node, input, zkhw::TextEntry);
            break;
        case 5: {
            const std::u16string key = Pick(names, input.TakeByte());
            const std::u16string value = Pick(texts, input.TakeByte());
            session.ViewOf(node)->SetProperty(In(key), In(value));
            session.model.Set(node, key, value);
            break;
        }
        case 7: {
            const std::u16string key = Pick(names, input.TakeByte());
            session.ViewOf(node)->RemoveEntry(In(key));
            session.model.RemoveByName(node, key);
            break;
        }
        case 8:
            Rename(session, node, Pick(names, input.TakeByte()));
            break;
        case 9:
        case 10:
            Reserve(session, node, input);
            break;
        case 6:
        case 11:
            Watch(session, node, input);
            break;
        case 12:
            Depend(session, node, nodes, input);
            break;
        case 13:
            Bracket(session, node, input.TakeByte());
            break;
        case 14:
            CheckClone(session, node);
            break;
        default: {
            const std::u16string path = Pick(names, input.TakeByte()) + Pick(texts, input.TakeByte());
            const std::u16string type = Pick(types, input.TakeByte());
            fuzz::SameAnswers(node, session.ViewOf(node), path, type, Pick(owners, operation / 16));
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    Session session((input.TakeByte() & 1) != 0);
    fuzz::SameNode(session.model.root, *session.root);
    for (int steps = 0; !input.IsEmpty() && !session.isWild && steps < 48; ++steps) {
        session.reactions = session.modelReactions = fuzz::reactionsPerOperation;
        Step(session, input);
        if (!session.isWild) {
            fuzz::SameNode(session.model.root, *session.root);
            fuzz::SameCalls(session);
        }
    }
    fuzz::CheckTree(*session.root);
    fuzz::End(session);
    return 0;
}
