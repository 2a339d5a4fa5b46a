// Works with a board's nodes through the interfaces: finds them, reads them, watches one, reserves several at once,
// and compares a copy. The program has no run-time of a host: the targets are those of the folder Targets beside it,
// and the texts are English. So put it into an installation, and run it there.
//
// In one line, with zkfpga installed:
//   c++ -std=c++20 reserve.cpp $(pkg-config --cflags --libs zkfpga) -o reserve
// For Windows also -DWCHAR=char16_t -D__WCHAR_DEFINED -D__STRALIGN_H_: text is char16_t then, as elsewhere.

#include <array>
#include <cstdio>
#include <exception>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

#include "zkfpga/zkfpga.h"

namespace {

// --- Owners of what the library hands out. Each gives its own kind back, whichever way a scope is left. ---

// One reference to an object.
template <typename Interface>
class Reference {
  public:
    Reference() = default;
    Reference(Reference&& other) noexcept : object(std::exchange(other.object, nullptr)) {}
    Reference& operator=(Reference&& other) noexcept {
        std::swap(object, other.object);
        return *this;
    }
    Reference(const Reference&) = delete;
    Reference& operator=(const Reference&) = delete;
    ~Reference() { Reset(); }

    void Reset() {
        if (Interface* const released = std::exchange(object, nullptr)) {
            released->Release();
        }
    }
    // For an out parameter.
    Interface** Receive() {
        Reset();
        return &object;
    }
    Interface* Get() const { return object; }
    Interface* operator->() const { return object; }
    explicit operator bool() const { return object != nullptr; }

  private:
    Interface* object = nullptr;
};

using Node = Reference<IzkhwResourceTreeNode>;
using Node4 = Reference<IzkhwResourceTreeNode4>;
using Tree = Reference<IzkEIOGResourceTree2>;

// The interface `id` of an object; empty if it hasn't got it.
template <typename To, typename From>
Reference<To> As(const Reference<From>& object, const IID& id) {
    void* result = nullptr;
    Reference<To> reference;
    if (object && SUCCEEDED(object->QueryInterface(id, &result))) {
        *reference.Receive() = static_cast<To*>(result);
    }
    return reference;
}

// A string.
class Text {
  public:
    Text() = default;
    Text(const Text&) = delete;
    Text& operator=(const Text&) = delete;
    ~Text() { SysFreeString(string); }

    BSTR* Receive() {
        SysFreeString(std::exchange(string, nullptr));
        return &string;
    }
    std::u16string_view View() const { return {string != nullptr ? string : u"", SysStringLen(string)}; }

  private:
    BSTR string = nullptr;
};

// An array of strings.
class Texts {
  public:
    Texts() = default;
    Texts(const Texts&) = delete;
    Texts& operator=(const Texts&) = delete;
    ~Texts() {
        for (ULONG i = 0; i < count; ++i) {
            SysFreeString(array[i]);
        }
        CoTaskMemFree(array);
    }

    std::u16string_view operator[](ULONG index) const { return {array[index], SysStringLen(array[index])}; }

    ULONG count = 0;
    BSTR* array = nullptr;
};

// An array of nodes.
class Nodes {
  public:
    Nodes() = default;
    Nodes(const Nodes&) = delete;
    Nodes& operator=(const Nodes&) = delete;
    ~Nodes() {
        for (ULONG i = 0; i < count; ++i) {
            array[i]->Release();
        }
        CoTaskMemFree(array);
    }

    IzkhwResourceTreeNode* operator[](ULONG index) const { return array[index]; }

    ULONG count = 0;
    IzkhwResourceTreeNode** array = nullptr;
};

// For the terminal. The tree's own texts hold no character that takes a pair of units.
std::string Utf8(std::u16string_view text) {
    std::string bytes;
    for (const unsigned unit : text) {
        if (unit < 0x80) {
            bytes += static_cast<char>(unit);
            continue;
        }
        if (unit < 0x800) {
            bytes += static_cast<char>(0xC0 | (unit >> 6));
        } else {
            bytes += static_cast<char>(0xE0 | (unit >> 12));
            bytes += static_cast<char>(0x80 | ((unit >> 6) & 0x3F));
        }
        bytes += static_cast<char>(0x80 | (unit & 0x3F));
    }
    return bytes;
}

// The node at `path` below `from`; that it is missing is an error here.
Node Find(const Node& from, LPCWSTR path) {
    Node node;
    if (from->FindNode(path, nullptr, nullptr, node.Receive()) != S_OK) {
        throw std::runtime_error("there is no node " + Utf8(path));
    }
    return node;
}

std::string Property(IzkhwResourceTreeNode* node, LPCWSTR name) {
    Text value;
    return node->GetProperty(name, value.Receive()) == S_OK ? Utf8(value.View()) : "none";
}

std::string Property(const Node& node, LPCWSTR name) {
    return Property(node.Get(), name);
}

const char* YesOrNo(HRESULT result) {
    return result == S_OK ? "yes" : result == S_FALSE ? "no" : "failed";
}

// --- What a host does with them. ---

// A board that comes from the cache is a stub. It answers to what the cache keeps; the first name that it lacks makes
// it read its files, once.
void ReadBoard(const Node& board) {
    std::printf("The board\n");
    const bool isStub = Property(board, u":DeferredLoadPath") != "none";
    std::printf("  comes from the cache: %s\n", isStub ? "yes" : "no");
    std::printf("  DeviceCategory: %s\n", Property(board, u"DeviceCategory").c_str());
    std::printf("  DeviceIDs: %s\n", Property(board, u"DeviceIDs").c_str());

    // Here it reads.
    const Node compilation = Find(board, u"FPGACompilation");
    std::printf("  DefaultClock: %s\n", Property(compilation, u"DefaultClock").c_str());
    std::printf("  files that wait to be read: %s\n", Property(board, u":DeferredLoadPath").c_str());

    Texts types;
    board->GetTypes(&types.count, &types.array);
    std::printf("  types:");
    for (ULONG i = 0; i < types.count; ++i) {
        std::printf(" %s", Utf8(types[i]).c_str());
    }
    std::printf("\n");
}

// By protocol: nodes, and the paths of nodes.
void ListInputs(const Node& board) {
    std::printf("Protocols\n");
    Nodes inputs;
    board->GetDescendantsOfType(u"QN.DigitalInput", &inputs.count, &inputs.array);
    for (ULONG i = 0; i < inputs.count; ++i) {
        Text name;
        inputs[i]->GetName(name.Receive());
        std::printf("  digital input: %s, %s\n", Utf8(name.View()).c_str(),
                    Property(inputs[i], u"DisplayName").c_str());
    }

    const Node4 node = As<IzkhwResourceTreeNode4>(board, IID_IzkhwResourceTreeNode4);
    Texts paths;
    node->GetDescendantNamesEx(nullptr, u"QN.Storage", 1, nullptr, &paths.count, &paths.array, nullptr);
    for (ULONG i = 0; i < paths.count; ++i) {
        std::printf("  storage: %s\n", Utf8(paths[i]).c_str());
    }
}

// Prints what it hears. Counts its references, since the library holds one for as long as it is registered.
class Watcher final : public IzkhwResourceTreeNodeObserver {
  public:
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override {
        *result = id == IID_IUnknown ? this : nullptr;
        if (*result == nullptr) {
            return E_NOINTERFACE;
        }
        AddRef();
        return S_OK;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
    ULONG STDMETHODCALLTYPE Release() override {
        const ULONG left = --references;
        if (left == 0) {
            delete this;
        }
        return left;
    }

    // An exception must not leave this.
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) override {
        static constexpr std::array<std::pair<ULONG, const char*>, 4> words = {{
            {ZkhwPropertyAdded, "property added"},
            {ZkhwPropertyChanged, "property changed"},
            {ZkhwReservationChanged, "reservation changed"},
            {ZkhwNodeDeleted, "node deleted"},
        }};
        Text name;
        node->GetName(name.Receive());
        std::printf("  [%u] %s", static_cast<unsigned>(id), Utf8(name.View()).c_str());
        for (const auto& [change, word] : words) {
            if ((changes & change) != 0) {
                std::printf(", %s", word);
            }
        }
        std::printf("\n");
        return S_OK;
    }

  private:
    ~Watcher() = default;

    ULONG references = 1;  // Its maker's.
};

// While a bracket is open the node's notices wait. They go out as one.
void EditUnderWatch(const Node& node) {
    std::printf("Changes\n");
    node->SetProperty(u"Cable", u"grey");

    std::printf("  in a bracket:\n");
    ULONG pending = 0;
    node->BeginChange(&pending);
    node->SetProperty(u"Cable", u"blue");
    node->SetProperty(u"Length", u"30 cm");
    std::printf("  changes wait: %s\n", YesOrNo(node->HasPendingChanges()));
    node->EndChange(pending, 0);
}

// The second connector can't be had, so the first, which was free, isn't taken either.
void ReserveConnectors(const Node& board, LPCWSTR owner) {
    std::printf("Reservations\n");
    const Node pairs = Find(board, u"IO/pmod_diff");
    const Node first = Find(board, u"IO/pmod0");
    const Node second = Find(board, u"IO/pmod1");
    std::printf("  pmod_diff takes along: %s\n", Property(pairs, u"Reserves").c_str());

    ULONG granted = 0;
    std::printf("  scope takes pmod1: %s\n", YesOrNo(second->Reserve(u"scope", ZkhwReserveWrite, &granted)));
    std::printf("  %s takes pmod_diff: %s\n", Utf8(owner).c_str(),
                YesOrNo(pairs->Reserve(owner, ZkhwReserveWrite, &granted)));
    std::printf("  pmod0: %s, pmod1: %s\n", Property(first, u"ZKHWReservation").c_str(),
                Property(second, u"ZKHWReservation").c_str());

    std::printf("  scope lets go of pmod1: %s\n", YesOrNo(second->Unreserve(u"scope")));
    std::printf("  %s takes pmod_diff: %s\n", Utf8(owner).c_str(),
                YesOrNo(pairs->Reserve(owner, ZkhwReserveWrite, &granted)));
    std::printf("  pmod0: %s, pmod1: %s\n", Property(first, u"ZKHWReservation").c_str(),
                Property(second, u"ZKHWReservation").c_str());
    std::printf("  %s lets go of pmod_diff: %s\n", Utf8(owner).c_str(), YesOrNo(pairs->Unreserve(owner)));
}

// The same for all nodes below a node: one light that is held keeps the others free.
void ReserveLights(const Node& board, LPCWSTR owner) {
    const Node lights = Find(board, u"IO/user_led");
    const Node light = Find(lights, u"user_led2");
    const Node other = Find(lights, u"user_led0");
    light->Reserve(u"scope", ZkhwReserveWrite, nullptr);
    std::printf("  %s takes all lights: %s\n", Utf8(owner).c_str(),
                YesOrNo(lights->ReserveDescendants(owner, ZkhwReserveWrite, u"IOResource")));
    std::printf("  user_led0: %s, user_led2: %s\n", Property(other, u"ZKHWReservation").c_str(),
                Property(light, u"ZKHWReservation").c_str());

    // Readers go with a writer.
    std::printf("  %s reads all lights: %s\n", Utf8(owner).c_str(),
                YesOrNo(lights->ReserveDescendants(owner, ZkhwReserveRead, u"IOResource")));
    std::printf("  user_led0: %s, user_led2: %s\n", Property(other, u"ZKHWReservation").c_str(),
                Property(light, u"ZKHWReservation").c_str());
    lights->UnreserveDescendants(owner, nullptr);
    lights->UnreserveDescendants(u"scope", nullptr);
}

// A copy is a tree of its own, which lives as long as the object that CloneDetached gave.
void CompareWithCopy(const Node& board) {
    std::printf("A copy\n");
    const Node4 lights = As<IzkhwResourceTreeNode4>(Find(board, u"IO/user_led"), IID_IzkhwResourceTreeNode4);
    Node copy;
    if (lights->CloneDetached(u"panel", copy.Receive()) != S_OK) {
        return;
    }
    BOOL compatible = 0;
    lights->IsCompatibleWith(copy.Get(), &compatible);
    std::printf("  offers what the lights ask for: %s\n", compatible != 0 ? "yes" : "no");

    std::printf("  one more light is read: %s\n",
                YesOrNo(copy->LoadContent(uR"(<IOResource name="user_led4"><Pin>V9</Pin></IOResource>)")));
    std::printf("  a fragment that isn't XML is read: %s\n", YesOrNo(copy->LoadContent(u"<Note>")));
    copy->RemoveEntry(u"XMLParseErrors");
    lights->IsCompatibleWith(copy.Get(), &compatible);
    std::printf("  with one more, it still does: %s\n", compatible != 0 ? "yes" : "no");
    Find(copy, u"user_led0")->SetProperty(u"Pin", u"V1");
    lights->IsCompatibleWith(copy.Get(), &compatible);
    std::printf("  with another pin, it still does: %s\n", compatible != 0 ? "yes" : "no");

    const Node4 filtered = As<IzkhwResourceTreeNode4>(copy, IID_IzkhwResourceTreeNode4);
    std::array<LPCWSTR, 1> nodes = {u"IOResource"};
    std::array<LPCWSTR, 2> properties = {u"Pin", u"DisplayName"};
    Text xml;
    filtered->GetFilteredXml(static_cast<ULONG>(nodes.size()), nodes.data(), static_cast<ULONG>(properties.size()),
                             properties.data(), xml.Receive());
    std::printf("  its pins:%s\n", Utf8(xml.View()).c_str());
}

// Queries by path, without a node in between.
void QueryTree(const Tree& tree) {
    std::printf("Queries\n");
    Text pin;
    tree->GetProperty(u"/LX9 MicroBoard/IO/user_btn/user_btn/Pin", nullptr, pin.Receive());
    std::printf("  the button's pin: %s\n", Utf8(pin.View()).c_str());

    Texts hosts;
    tree->GetDescendantNames(u"/FPGAHostSet", u"protocol=QN.RealTime", &hosts.count, &hosts.array);
    for (ULONG i = 0; i < hosts.count; ++i) {
        std::printf("  real-time host: %s\n", Utf8(hosts[i]).c_str());
    }
    // Without the hosts that can compile, and the link to one of them.
    Texts names;
    tree->GetMultiplePropertyNames(u"/FPGAHostSet",
                                   u"recurse=true, protocol=QN.Host, exclusionProperty=CanCompile,"
                                   u"stripPathPrefix=/FPGAHostSet",
                                   &names.count, &names.array);
    for (ULONG i = 0; i < names.count; ++i) {
        std::printf("  property: %s\n", Utf8(names[i]).c_str());
    }
    Texts none;
    std::printf("  a path that leads nowhere: %s\n",
                YesOrNo(tree->GetDescendantNames(u"/Nowhere", u"", &none.count, &none.array)));
}

// The process's tree; the first call builds it. The two pointers after the id are for hosts with projects.
template <typename Interface>
bool Query(const IID& id, Reference<Interface>& reference) {
    void* result = nullptr;
    const HRESULT queried = QueryResourceTreeInterface(&id, nullptr, nullptr, &result);
    if (FAILED(queried)) {
        std::fprintf(stderr, "reserve: no tree: 0x%08X\n", static_cast<unsigned>(queried));
        return false;
    }
    *reference.Receive() = static_cast<Interface*>(result);
    return true;
}

bool Run() {
    Node root;
    Tree tree;
    if (!Query(IID_IzkhwResourceTreeNode, root) || !Query(IID_IzkEIOGResourceTree2, tree)) {
        return false;
    }
    const Node board = Find(root, u"/LX9 MicroBoard");
    ReadBoard(board);
    ListInputs(board);

    constexpr ULONG registration = 7;
    const Node connector = Find(board, u"IO/pmod0");
    Reference<Watcher> watcher;
    *watcher.Receive() = new Watcher;
    connector->Advise(watcher.Get(), ZkhwPropertyAdded | ZkhwPropertyChanged | ZkhwReservationChanged, registration);
    EditUnderWatch(connector);
    ReserveConnectors(board, u"probe");
    connector->Unadvise(watcher.Get(), registration, 0);

    ReserveLights(board, u"probe");
    CompareWithCopy(board);
    QueryTree(tree);
    return true;
}

}  // namespace

int main() {
    try {
        return Run() ? 0 : 1;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "reserve: %s\n", exception.what());
        return 1;
    }
}
