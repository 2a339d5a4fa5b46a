// Queries on a whole tree by option strings and paths: two lines of input, then a resource text. Each answer is that of
// a slow form, which takes the option string apart unit by unit and asks the views of single nodes.

#include <memory>
#include <new>
#include <string>
#include <vector>

#include "FuzzInput.h"
#include "TreeQuestions.h"
#include "interfaces/BoundaryText.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ResTreeNode.h"
#include "restree/ResTreeOwner.h"
#include "zkfpga/tree_root.h"

namespace {

using fuzz::In;
using fuzz::Require;
using fuzz::View;
using qn::dsc::osdep::Equal;
using zkhw::ResTreeNode;
using zkhw::String;
using Text = std::u16string;
using Texts = std::vector<Text>;

// Copies of copies can make a few bytes fill any memory; this is where an input stops and memory is said to be out.
constexpr uint64_t mostAllocations = 20000;

class Owner : public zkhw::ResTreeOwner {
  public:
    int32_t CreateRootNode(ResTreeNode*& root) override {
        root = new ResTreeNode(u"", u"Root", false);
        return 0;
    }
};

// --- Option strings ---

Text Trimmed(const Text& text) {
    const size_t first = text.find_first_not_of(u" \t\r\n");
    return first == Text::npos ? Text() : text.substr(first, text.find_last_not_of(u" \t\r\n") - first + 1);
}

// One backslash for two, and the separator for one behind a backslash.
Text Unescaped(const Text& text, char16_t separator) {
    Text plain;
    for (size_t i = 0; i < text.size(); ++i) {
        const bool isEscape = text[i] == u'\\' && i + 1 < text.size();
        if (isEscape && (text[i + 1] == u'\\' || text[i + 1] == separator)) {
            ++i;
        }
        plain.push_back(text[i]);
    }
    return plain;
}

Texts Parts(const Text& text, char16_t separator) {
    Texts parts;
    Text part;
    size_t backslashes = 0;
    for (const char16_t unit : text) {
        if (unit == separator && backslashes % 2 == 0) {
            parts.push_back(Unescaped(Trimmed(part), separator));
            part.clear();
        } else {
            part.push_back(unit);
        }
        backslashes = unit == u'\\' ? backslashes + 1 : 0;
    }
    if (!text.empty()) {
        parts.push_back(Unescaped(Trimmed(part), separator));
    }
    return parts;
}

struct Options {
    explicit Options(const Text& text) {
        for (const Text& item : Parts(text, u',')) {
            const Texts parts = Parts(item, u'=');
            if (parts.size() == 2) {
                Take(parts[0], parts[1]);
            }
        }
    }

    void Take(const Text& key, const Text& value) {
        const bool isTrue = Equal(value, u"true");
        if (Equal(key, u"protocol")) {
            protocol = value;
        } else if (Equal(key, u"recurse")) {
            recurse = isTrue;
        } else if (Equal(key, u"stripPathPrefix")) {
            strip = value;
            includePath = saidPath ? includePath : true;
        } else if (Equal(key, u"exclusionProperty")) {
            exclusion = value;
        } else if (Equal(key, u"includePath")) {
            includePath = isTrue;
            saidPath = true;
        } else if (Equal(key, u"includeAliases")) {
            aliases = isTrue;
        } else if (Equal(key, u"includeDisplayNames")) {
            displays = isTrue;
        }
    }

    Text Cut(const Text& name) const {
        const size_t count = strip.size() + (includePath ? 1 : 0);
        return count < name.size() ? name.substr(count) : Text();
    }

    Text protocol;
    Text strip;
    Text exclusion;
    bool recurse = false;
    bool includePath = false;
    bool saidPath = false;
    bool aliases = false;
    bool displays = false;
};

// --- The slow answers ---

Text Element(const Text& name, const Text& value) {
    Text escaped;
    for (const char16_t unit : value) {
        escaped += unit == u'&' ? u"&amp;" : unit == u'<' ? u"&lt;" : unit == u'>' ? u"&gt;" : Text(1, unit);
    }
    return u"<String><Name>" + name + u"</Name><Val>" + escaped + u"</Val></String>";
}

Text Cluster(const Text& count, const Text& elements) {
    return u"<Cluster><Name></Name><NumElts>" + count + u"</NumElts>" + elements + u"</Cluster>";
}

Text EscapedName(const Text& name) {
    Text escaped;
    for (const char16_t unit : name) {
        escaped += unit == u'/' || unit == u'\\' ? u"\\" : u"";
        escaped.push_back(unit);
    }
    return escaped;
}

// Null if the path leads nowhere.
View FindFrom(IzkhwResourceTreeNode5* root, const Text& path) {
    View node;
    ULONG consumed = 0;
    if (path.empty()) {
        node = View::Share(root);
    } else if (root->FindNode(In(path), &consumed, nullptr, fuzz::Receive(node)) != S_OK) {
        node.Reset();
    }
    return node;
}

Texts NamesBelow(IzkhwResourceTreeNode5* root, const Text& path, const Options& options) {
    const View node = FindFrom(root, path);
    ULONG count = 0;
    BSTR* names = nullptr;
    BSTR* displays = nullptr;
    BSTR** const wanted = options.displays ? &displays : nullptr;
    const BOOL includePath = options.includePath ? 1 : 0;
    if (options.recurse) {
        node->GetDescendantNamesEx(In(path), In(options.protocol), includePath, In(options.exclusion), &count, &names,
                                   wanted);
    } else {
        node->GetChildNamesOfType(In(path), In(options.protocol), includePath, &count, &names, wanted);
    }
    Texts answers = fuzz::TakeTexts(count, names);
    const Texts shown = options.displays ? fuzz::TakeTexts(count, displays) : Texts(answers.size());
    for (size_t i = 0; i < answers.size(); ++i) {
        Text replacement = options.strip.empty() ? answers[i] : options.Cut(answers[i]);
        if (options.aliases || options.displays) {
            replacement = Cluster(
                u"3", Element(u"resource", replacement) + Element(u"alias", u"") + Element(u"display name", shown[i]));
        }
        answers[i] = replacement.empty() ? answers[i] : replacement;
    }
    return answers;
}

void AppendProperties(IzkhwResourceTreeNode5* root, const Text& path, const Text& protocol, const Options& options,
                      bool withValues, Texts& answers) {
    const View node = FindFrom(root, path);
    if (!node || node->IsOfType(In(protocol)) != S_OK) {
        return;
    }
    Text prefix;
    if (options.includePath) {
        size_t backslashes = 0;
        for (size_t at = path.size() - 1; path.size() > 1 && at > 0 && path[at - 1] == u'\\'; --at) {
            ++backslashes;
        }
        const bool isEnded = !path.empty() && path.back() == u'/' && backslashes % 2 == 0;
        prefix = path + (isEnded ? u"" : u"/");
    }
    prefix = options.strip.empty() ? prefix : options.Cut(prefix);
    ULONG count = 0;
    BSTR* names = nullptr;
    node->GetPropertyNames(&count, &names);
    const Texts keys = fuzz::TakeTexts(count, names);
    for (ULONG i = 0; i < keys.size(); ++i) {
        const Text name = prefix + EscapedName(keys[i]);
        zkhw::OwnedBstr value;
        node->GetPropertyAt(i, value.Receive());
        answers.push_back(withValues ? Cluster(u"2", Element(u"name", name) + Element(u"value", Text(value.View())))
                                     : name);
    }
}

Texts PropertiesBelow(IzkhwResourceTreeNode5* root, const Text& path, const Options& options, bool withValues) {
    Texts answers;
    AppendProperties(root, path, options.protocol, options, withValues, answers);
    if (options.recurse) {
        const View node = FindFrom(root, path);
        ULONG count = 0;
        BSTR* names = nullptr;
        node->GetDescendantNamesEx(In(path), In(options.protocol), 1, In(options.exclusion), &count, &names, nullptr);
        for (const Text& below : fuzz::TakeTexts(count, names)) {
            AppendProperties(root, below, u"", options, withValues, answers);
        }
    }
    return answers;
}

// --- Comparison ---

void SameProperty(IzkEIOGResourceTree2& tree, IzkhwResourceTreeNode5* root, const Text& path) {
    View node;
    ULONG consumed = 0;
    root->FindNode(In(path), &consumed, nullptr, fuzz::Receive(node));
    zkhw::OwnedBstr expected;
    const HRESULT result = (node ? node.Get() : root)->GetProperty(In(path.substr(consumed)), expected.Receive());
    zkhw::OwnedBstr given;
    Require(tree.GetProperty(In(path), nullptr, given.Receive()) == result, "GetProperty gives the same result");
    Require(given.View() == expected.View(), "GetProperty gives the same value");
}

void SameAnswers(IzkEIOGResourceTree2& tree, IzkhwResourceTreeNode5* root, const Text& text, const Text& path) {
    const Options options(text);
    const HRESULT expected = FindFrom(root, path) ? S_OK : S_FALSE;
    ULONG count = 77;
    BSTR* array = nullptr;
    Require(tree.GetDescendantNames(In(path), In(text), &count, &array) == expected, "GetDescendantNames finds");
    Texts given = fuzz::TakeTexts(count, array);
    Require(given == (expected == S_OK ? NamesBelow(root, path, options) : Texts()), "GetDescendantNames");
    for (const bool withValues : {false, true}) {
        count = 77;
        array = nullptr;
        const HRESULT result = withValues ? tree.GetMultipleProperties(In(path), In(text), &count, &array)
                                          : tree.GetMultiplePropertyNames(In(path), In(text), &count, &array);
        Require(result == expected, "the properties of a node are found with it");
        given = fuzz::TakeTexts(count, array);
        Require(given == (expected == S_OK ? PropertiesBelow(root, path, options, withValues) : Texts()),
                "the properties are those of the nodes");
    }
    SameProperty(tree, root, path);
    LPCWSTR names[] = {In(options.protocol), In(options.strip)};
    zkhw::OwnedBstr xml;
    zkhw::OwnedBstr ofNode;
    Require(tree.GetFilteredXml(In(path), 2, names, 1, names, xml.Receive()) == expected, "GetFilteredXml finds");
    if (expected == S_OK) {
        FindFrom(root, path)->GetFilteredXml(2, names, 1, names, ofNode.Receive());
    }
    Require(xml.View() == ofNode.View(), "GetFilteredXml is that of the node");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    // A text ends at its first NUL on its way in.
    const Text options(input.TakeText().c_str());
    const Text path(input.TakeText().c_str());
    Owner owner;
    ResTreeNode* root = nullptr;
    owner.GetRootNode(root);
    try {
        qn::dsc::osdep::FailAllocation(mostAllocations, true);
        String wide;
        const std::string text = input.TakeRest();
        if (String::TryFromUtf8(text.data(), static_cast<uint32_t>(text.size()), wide)) {
            root->LoadResourceText(wide, true, nullptr);
        }
        // Enough for the questions about what there is, or the input is over.
        qn::dsc::osdep::FailAllocation(20 * mostAllocations, true);
        View view;
        zkhw::InterfacePointer<IzkEIOGResourceTree2> tree;
        owner.QueryTreeInterface(IID_IzkhwResourceTreeNode5, nullptr, nullptr, view.ReceiveAny());
        owner.QueryTreeInterface(IID_IzkEIOGResourceTree2, nullptr, nullptr, tree.ReceiveAny());
        SameAnswers(*tree.Get(), view.Get(), options, path);
    } catch (const std::bad_alloc&) {
        // What had been built stands.
    }
    qn::dsc::osdep::ClearAllocationFault();
    return 0;
}
