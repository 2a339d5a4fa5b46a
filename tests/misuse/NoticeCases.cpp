// An observer that takes away what the library stands on, out of the call of every operation that lets it hear
// anything: "Operation, action", and out of the removal of its node: "NodeDeleting of A, action".

#include <memory>

#include "misuse/MisuseHost.h"

namespace misuse {

namespace {

constexpr ULONG everything = 0xFFFFFFFF;
constexpr ULONG registration = 5;

// What happens in a case, and whom it happens to. The views are all that the host holds beside the fixture.
struct Scene {
    IzkhwResourceTreeNode5* base = nullptr;    // The shelf, or a copy of it.
    IzkhwResourceTreeNode5* acting = nullptr;  // A of it, whose operation is called.
    IzkhwResourceTreeNode5* heard = nullptr;   // A or Q of it, which the observer is registered at.
    IzkhwResourceTreeNode5* slot = nullptr;    // A once more, if `heard` is Q.
    IzkhwResourceTreeNode5* parent = nullptr;  // Of `heard`: one of these.
    IzkhwResourceTreeNode5* rack = nullptr;
    Observer* observer = nullptr;
    bool observerIsGone = false;
    bool hasActed = false;
    std::string words;
};

IzkhwResourceTreeNode5* Below(IzkhwResourceTreeNode5* node, const char16_t* path) {
    IzkhwResourceTreeNode* found = nullptr;
    node->FindNode(path, nullptr, nullptr, &found);
    return static_cast<IzkhwResourceTreeNode5*>(found);
}

void GiveBack(IzkhwResourceTreeNode5*& view) {
    if (view != nullptr) {
        view->Release();
        view = nullptr;
    }
}

// --- Actions ---

struct Action {
    const char* name;
    bool onACopy;
    void (*act)(Scene& scene);
};

void EndRegistration(Scene& scene) {
    scene.heard->Unadvise(scene.observer, registration, 0);
}

void GiveViewsBack(Scene& scene) {
    EndRegistration(scene);
    if (scene.acting != scene.heard) {
        GiveBack(scene.acting);
    }
    scene.acting = nullptr;
    GiveBack(scene.heard);
}

void RemoveNode(Scene& scene) {
    for (const char16_t* const name : {u"A", u"U", u"Q"}) {
        scene.parent->RemoveEntry(name);
    }
}

void RemoveAllAbove(Scene& scene) {
    scene.rack->RemoveEntry(u"S");
}

void EndCopy(Scene& scene) {
    scene.words += " copy " + std::to_string(scene.base->Release());
    scene.base = nullptr;
}

constexpr Action actions[] = {
    {"ends its registration", false, EndRegistration},
    {"gives the last references to its views back", false, GiveViewsBack},
    {"removes its node", false, RemoveNode},
    {"removes the parent of all", false, RemoveAllAbove},
    {"ends the copy that it hears of", true, EndCopy},
};

// --- Operations ---

struct Operation {
    const char* name;
    bool isHeardBelow;  // At Q, else at A.
    void (*prepare)(IzkhwResourceTreeNode5* node);
    HRESULT (*call)(IzkhwResourceTreeNode5* node);
};

using Node = IzkhwResourceTreeNode5*;

const Operation operations[] = {
    {"SetProperty", false, nullptr, [](Node node) { return node->SetProperty(u"Width", u"5"); }},
    {"SetPropertyAt", false, nullptr, [](Node node) { return node->SetPropertyAt(0, u"5"); }},
    {"LoadContent", false, nullptr, [](Node node) { return node->LoadContent(u"<Made>1</Made>"); }},
    {"RemoveEntry", false, nullptr, [](Node node) { return node->RemoveEntry(u"Width"); }},
    {"SetName", false, nullptr, [](Node node) { return node->SetName(u"U"); }},
    {"Reserve", false, nullptr, [](Node node) { return node->Reserve(u"me", 1, nullptr); }},
    {"Unreserve", false, [](Node node) { node->Reserve(u"me", 1, nullptr); },
     [](Node node) { return node->Unreserve(u"me"); }},
    {"ReserveDescendants", true, nullptr, [](Node node) { return node->ReserveDescendants(u"me", 1, u"Pin"); }},
    {"UnreserveDescendants", true, [](Node node) { node->ReserveDescendants(u"me", 1, u"Pin"); },
     [](Node node) { return node->UnreserveDescendants(u"me", u"Pin"); }},
    {"ReserveForItem", false, nullptr, [](Node node) { return node->ReserveForItem(&fixture.item, 1, nullptr); }},
    {"UnreserveForItem", false, [](Node node) { node->ReserveForItem(&fixture.item, 1, nullptr); },
     [](Node node) { return node->UnreserveForItem(&fixture.item); }},
    {"ReserveDescendantsForItem", true, nullptr,
     [](Node node) { return node->ReserveDescendantsForItem(&fixture.item, 1, u"Pin"); }},
    {"UnreserveDescendantsForItem", true, [](Node node) { node->ReserveDescendantsForItem(&fixture.item, 1, u"Pin"); },
     [](Node node) { return node->UnreserveDescendantsForItem(&fixture.item, u"Pin"); }},
    {"EndChange", false,
     [](Node node) {
         ULONG pending = 0;
         node->BeginChange(&pending);
         node->SetProperty(u"Width", u"5");
     },
     [](Node node) { return node->EndChange(0, 0); }},
};

// --- A case ---

void SetTheScene(Scene& scene, const Action& action, bool isHeardBelow) {
    if (action.onACopy) {
        IzkhwResourceTreeNode* copy = nullptr;
        fixture.shelf->CloneDetached(nullptr, &copy);
        scene.base = static_cast<IzkhwResourceTreeNode5*>(copy);
    } else {
        scene.base = ViewOf(u"Rack/S");
    }
    scene.rack = ViewOf(u"Rack");
    scene.acting = Below(scene.base, u"A");
    scene.heard = isHeardBelow ? Below(scene.base, u"A/Q") : scene.acting;
    scene.slot = isHeardBelow ? Below(scene.base, u"A") : nullptr;
    scene.parent = isHeardBelow ? scene.slot : scene.base;
}

// On the heap: the last reference is the last of it.
void Register(const std::shared_ptr<Scene>& scene, const Action& action, ULONG when) {
    auto* const observer = new Observer;
    observer->whenUnreferenced = [scene, observer] {
        const std::shared_ptr<Scene> kept = scene;
        delete observer;
        kept->observerIsGone = true;
    };
    observer->reaction = [scene, action, when](IzkhwResourceTreeNode*, ULONG changes, ULONG) {
        if ((changes & when) != 0 && !scene->hasActed) {
            scene->hasActed = true;
            action.act(*scene);
        }
    };
    scene->observer = observer;
    scene->heard->Advise(observer, everything, registration);
}

void SayEnd(HRESULT result, Scene& scene) {
    if (scene.acting != scene.heard) {
        GiveBack(scene.acting);
    }
    for (IzkhwResourceTreeNode5** const view : {&scene.heard, &scene.slot, &scene.rack, &scene.base}) {
        GiveBack(*view);
    }
    Say(Hex(result) + scene.words + (scene.hasActed ? "" : " silence") +
        (scene.observerIsGone ? " observer gone" : ""));
}

void RunOperation(const Operation& operation, const Action& action) {
    const auto scene = std::make_shared<Scene>();
    SetTheScene(*scene, action, operation.isHeardBelow);
    if (operation.prepare != nullptr) {
        operation.prepare(scene->acting);
    }
    Register(scene, action, everything);
    SayEnd(operation.call(scene->acting), *scene);
}

// A is removed, and with it Q.
void RunRemoval(const Action& action, bool isHeardBelow, ULONG when) {
    const auto scene = std::make_shared<Scene>();
    SetTheScene(*scene, action, isHeardBelow);
    Register(scene, action, when);
    SayEnd(scene->base->RemoveEntry(u"A"), *scene);
}

}  // namespace

void AddNotices(Cases& cases) {
    for (const Action& action : actions) {
        for (const Operation& operation : operations) {
            cases[std::string(operation.name) + ", " + action.name] = {
                [&operation, &action] { RunOperation(operation, action); }};
        }
        for (const bool isHeardBelow : {false, true}) {
            const std::string node = isHeardBelow ? "Q, " : "A, ";
            cases["NodeDeleting of " + node + action.name] = {
                [&action, isHeardBelow] { RunRemoval(action, isHeardBelow, ZkhwNodeDeleting); }};
            cases["NodeDeleted of " + node + action.name] = {
                [&action, isHeardBelow] { RunRemoval(action, isHeardBelow, ZkhwNodeDeleted); }};
        }
    }
}

}  // namespace misuse
