// A host that calls one operation on a board, the one that its argument names, and prints what became of the board:
// "stub" if its description still waits, "loaded" if not. What the operation gives is left to the end of the process.

#include <cstdio>
#include <cstdlib>
#include <map>
#include <string>

#include "zkfpga/zkfpga.h"

namespace {

class Observer final : public IzkhwResourceTreeNodeObserver {
  public:
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID, void** result) override {
        *result = nullptr;
        return E_NOINTERFACE;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return 1; }
    ULONG STDMETHODCALLTYPE Release() override { return 1; }
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG, ULONG) override { return S_OK; }
};

Observer observer;
ULONG number;
BSTR text;
BSTR* texts;
BSTR* moreTexts;
IzkhwResourceTreeNode* found;
IzkhwResourceTreeNode** nodes;

constexpr LPCWSTR kept = u"DeviceIDs";
constexpr LPCWSTR missing = u"Nowhere";

using Node = IzkhwResourceTreeNode5;
using Operation = void (*)(Node& board, Node& root);

const std::map<std::string, Operation> operations = {
    {"nothing", [](Node&, Node&) {}},
    {"GetName", [](Node& board, Node&) { board.GetName(&text); }},
    {"GetPath", [](Node& board, Node&) { board.GetPath(&text); }},
    {"GetType", [](Node& board, Node&) { board.GetType(&text); }},
    {"GetParent", [](Node& board, Node&) { board.GetParent(&found); }},
    {"HasParent", [](Node& board, Node&) { board.HasParent(); }},
    {"SetName", [](Node& board, Node&) { board.SetName(u"Another"); }},
    {"GetProperty kept", [](Node& board, Node&) { board.GetProperty(kept, &text); }},
    {"GetProperty missing", [](Node& board, Node&) { board.GetProperty(missing, &text); }},
    {"GetProperty TargetDir", [](Node& board, Node&) { board.GetProperty(u"TargetDir", &text); }},
    {"SetProperty kept", [](Node& board, Node&) { board.SetProperty(kept, u""); }},
    {"SetProperty missing", [](Node& board, Node&) { board.SetProperty(missing, u""); }},
    {"IsLocalizedProperty kept", [](Node& board, Node&) { board.IsLocalizedProperty(kept); }},
    {"IsLocalizedProperty missing", [](Node& board, Node&) { board.IsLocalizedProperty(missing); }},
    {"RemoveEntry kept", [](Node& board, Node&) { board.RemoveEntry(kept); }},
    {"RemoveEntry missing", [](Node& board, Node&) { board.RemoveEntry(missing); }},
    {"IsOfType", [](Node& board, Node&) { board.IsOfType(u"QN.Other"); }},
    {"GetTypes", [](Node& board, Node&) { board.GetTypes(&number, &texts); }},
    {"IsOfType without Protocols",
     [](Node& board, Node&) {
         board.RemoveEntry(u"Protocols");
         board.IsOfType(u"QN.Other");
     }},
    {"IsOfType Target without Protocols",
     [](Node& board, Node&) {
         board.RemoveEntry(u"Protocols");
         board.IsOfType(u"Target");
     }},
    {"FindNode itself", [](Node& board, Node&) { board.FindNode(u"/", nullptr, nullptr, &found); }},
    {"FindNode below", [](Node& board, Node&) { board.FindNode(u"IO", nullptr, nullptr, &found); }},
    {"Advise", [](Node& board, Node&) { board.Advise(&observer, ZkhwPropertyChanged, 7); }},
    {"Advise for reservations", [](Node& board, Node&) { board.Advise(&observer, ZkhwReservationChanged, 7); }},
    {"Unadvise",
     [](Node& board, Node&) {
         board.Advise(&observer, ZkhwPropertyChanged, 7);
         board.Unadvise(&observer, 0xFFFFFFFF, 1);
     }},
    {"Unreserve", [](Node& board, Node&) { board.Unreserve(u"scope"); }},
    {"Reserve", [](Node& board, Node&) { board.Reserve(u"scope", ZkhwReserveRead, nullptr); }},
    {"GetReservation", [](Node& board, Node&) { board.GetReservation(nullptr, nullptr); }},
    {"CloneDetached", [](Node& board, Node&) { board.CloneDetached(nullptr, &found); }},
    {"LoadContent", [](Node& board, Node&) { board.LoadContent(u"<Note>1</Note>"); }},
    {"GetChildren", [](Node& board, Node&) { board.GetChildren(&number, &nodes); }},
    {"HasChildren", [](Node& board, Node&) { board.HasChildren(); }},
    {"GetPropertyNames", [](Node& board, Node&) { board.GetPropertyNames(&number, &texts); }},
    {"GetXml", [](Node& board, Node&) { board.GetXml(&text); }},
    {"GetDisplayPath", [](Node& board, Node&) { board.GetDisplayPath(&text); }},
    {"GetChildren of the root", [](Node&, Node& root) { root.GetChildren(&number, &nodes); }},
    {"GetChildrenOfType of the root", [](Node&, Node& root) { root.GetChildrenOfType(u"Target", &number, &nodes); }},
    {"GetChildNames of the root", [](Node&, Node& root) { root.GetChildNames(nullptr, 1, &number, &texts, nullptr); }},
    {"GetChildNames of the root for display",
     [](Node&, Node& root) { root.GetChildNames(nullptr, 1, &number, &texts, &moreTexts); }},
    {"GetDescendantsOfType of the root",
     [](Node&, Node& root) { root.GetDescendantsOfType(u"Target", &number, &nodes); }},
    {"GetXml of the root", [](Node&, Node& root) { root.GetXml(&text); }},
};

}  // namespace

int main(int argc, char** argv) {
    const auto operation = operations.find(argc == 2 ? argv[1] : "");
    void* object = nullptr;
    if (operation == operations.end() ||
        FAILED(QueryResourceTreeInterface(&IID_IzkhwResourceTreeNode5, nullptr, nullptr, &object))) {
        return 1;
    }
    Node* const root = static_cast<Node*>(object);
    IzkhwResourceTreeNode* board = nullptr;
    if (root->FindNode(u"LX9 MicroBoard", nullptr, nullptr, &board) != S_OK) {
        return 1;
    }
    operation->second(*static_cast<Node*>(board), *root);
    BSTR waiting = nullptr;
    std::printf("%s\n", board->GetProperty(u":DeferredLoadPath", &waiting) == S_OK ? "stub" : "loaded");
    std::fflush(stdout);
    std::_Exit(0);
}
