// A small installation: files with their paths, cut apart at lines that hold "----", scanned, summed up in a cache, and
// read back from it as stubs that grow at the first look inside. The grown tree is the scanned one, as far as both can
// be. Exactly:
//
// - a root is there with the children of the scanned one, each with its name and type, and a cache with a target is
//   taken. What stands on the root besides (reports of files that aren't well formed) isn't cached;
// - a stub answers for all that the cache keeps of it without a load, with the same values;
// - a cache written from the stubs, and one from the grown tree, is the cache that was read;
// - once a stub has grown, it holds what the scan had found, deeply and in order, but for what the cache keeps: these
//   entries stand ahead of the others in an ordered node, and those that the files leave out are empty.
//
// All of it holds for files that read alike in either way (PlainDocuments.h), each one the only source of its target,
// and for values that XML text gives back as they are (Survives). An unordered node of a list type comes back ordered,
// and the host set is whole in the cache and has no source: these two are followed no further than the stubs.
// For any other file, the trees have to be sound.

#include <algorithm>
#include <array>
#include <new>
#include <string>
#include <vector>

#include "FuzzInput.h"
#include "MemoryFileSystem.h"
#include "PlainDocuments.h"
#include "TreeLaws.h"
#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace {

using fuzz::Require;
using qn::dsc::String;
using qn::dsc::osdep::Equal;
using zkhw::FPGAResTree;
using zkhw::NodeEntry;
using zkhw::ResTreeNode;

// Copies of copies can make a few bytes fill any memory; this is where an input stops and memory is said to be out.
constexpr uint64_t mostAllocations = 30000;
constexpr size_t mostFiles = 6;
constexpr std::u16string_view folder = u"C:\\Targets\\QN\\FPGA";
constexpr std::u16string_view cachePath = u"C:\\Targets\\QN\\FPGA\\resource_cache.xml";

constexpr std::u16string_view summary[] = {
    u"DeviceCategory",   u"EIOItemIconName",
    u"EIOItemTypeName",  u"FPGAItemSubType",
    u"TargetClass",      u"SupportedFPGAHostList",
    u"TargetXMLPath",    u"LocalizedInformationToDisplayWhenAddingNewTarget",
    u"FindTargetVIPath", u"DeviceIDs",
    u"Protocols",        u"CustomFPGAMethodList",
};
// What is stamped on a node but not kept, or kept of other nodes.
constexpr std::u16string_view stamps[] = {u"TargetDir", u"TargetClassShortClassName", u"FPGA_XMLSource"};

template <size_t Size>
bool IsOneOf(const std::u16string_view (&names)[Size], std::u16string_view name) {
    return std::any_of(std::begin(names), std::end(names), [name](auto each) { return Equal(each, name); });
}

bool IsKept(std::u16string_view key) {
    return IsOneOf(summary, key) || IsOneOf(stamps, key);
}

// A path of lower case letters, digits and backslashes, below the folder; empty if it is none.
std::u16string PathOf(const std::string& line) {
    std::u16string path(folder);
    bool isInName = false;
    for (size_t i = 0; i < std::min<size_t>(line.size(), 60); ++i) {
        const auto unit = static_cast<unsigned char>(line[i]);
        const bool isLetter = (unit >= 'a' && unit <= 'z') || (unit >= '0' && unit <= '9') || unit == '_';
        const bool isDot = unit == '.' && isInName && line.substr(i) == ".xml";
        if (isLetter || isDot) {
            path += isInName ? u"" : u"\\";
            path.push_back(unit);
            isInName = true;
        } else if (unit != '\\' || !isInName) {
            return {};
        } else {
            isInName = false;
        }
        if (isDot) {
            return path + u"xml";
        }
    }
    return {};
}

// --- Which nodes are followed ---

// Whether an XML text gives the value back: it isn't trimmed, put into another form, or expanded.
bool Survives(const NodeEntry& entry) {
    if (!entry.IsText()) {
        return false;
    }
    const std::u16string_view text = *entry.Text();
    const bool isPath = zkhw::EndsWith(entry.Key(), u"Path");
    if (entry.Kind() != zkhw::LocalizedTextEntry && text.find(u'\0') != std::u16string_view::npos) {
        return false;
    }
    const std::u16string_view written = text.substr(text.find(u'\0') + 1);
    return zkhw::TrimWhitespace(written).View() == written && written.find(u'\r') == std::u16string_view::npos &&
           written.find(u"#{") == std::u16string_view::npos &&
           !(isPath && written.find(u'/') != std::u16string_view::npos) &&
           !(isPath && written.find(u"\\\\") != std::u16string_view::npos);
}

bool KeepsSurvivingValues(const ResTreeNode& node) {
    for (auto entry = node.Begin(); entry != node.End(); ++entry) {
        if (IsKept(entry.Key()) && !Survives(*entry)) {
            return false;
        }
    }
    const std::u16string_view name = node.GetName();
    const bool isClean = std::none_of(name.begin(), name.end(), [](char16_t unit) { return unit < 0x20; });
    // A name that is the type but for letter case comes back as the type.
    return isClean && (name == node.GetType() || !Equal(name, node.GetType()));
}

// How many files have fed the children of the root, the host set counted once.
size_t CountSources(ResTreeNode& root) {
    size_t sources = 0;
    for (auto entry = root.Begin(); entry != root.End(); ++entry) {
        if (ResTreeNode* child = entry->Child()) {
            const NodeEntry* source = child->IsA(u"Target") ? nullptr : child->FindRaw(u"FPGA_XMLSource");
            std::vector<String> files;
            if (source != nullptr && source->IsText()) {
                zkhw::SplitList(*source->Text(), u',', files, true);
            }
            sources += files.empty() ? 1 : files.size();
        }
    }
    return sources;
}

bool IsHostSet(const ResTreeNode& node) {
    return !node.IsA(u"Target") && Equal(node.GetName(), u"FPGAHostSet");
}

// --- Comparison ---

void SameEntries(ResTreeNode& scanned, ResTreeNode& grown, bool isTop);

void SameEntry(const NodeEntry& scanned, const NodeEntry& grown) {
    Require(scanned.Key() == grown.Key(), "the same keys in order");
    Require(scanned.Kind() == grown.Kind(), "each of the same kind");
    if (ResTreeNode* child = scanned.Child()) {
        Require(child->GetName() == grown.Child()->GetName(), "a child has its name");
        Require(child->GetType() == grown.Child()->GetType(), "a child has its type");
        Require(child->IsOrdered() == grown.Child()->IsOrdered(), "a child has its form");
        SameEntries(*child, *grown.Child(), false);
    } else if (scanned.IsText()) {
        Require(scanned.Text() == grown.Text(), "a text has its value");
    } else {
        Require(scanned.LinkPath() == grown.LinkPath(), "a link has its path");
    }
}

// At the top what the cache keeps, and everywhere reports, which tell from where they were read, are left out.
void SameEntries(ResTreeNode& scanned, ResTreeNode& grown, bool isTop) {
    const auto next = [isTop](ResTreeNode& node, zkhw::EntryIterator& entry) {
        while (entry != node.End() && ((isTop && IsKept(entry.Key())) || Equal(entry.Key(), u"XMLParseErrors"))) {
            ++entry;
        }
        return entry != node.End();
    };
    zkhw::EntryIterator left = scanned.Begin();
    zkhw::EntryIterator right = grown.Begin();
    while (next(scanned, left) && next(grown, right)) {
        SameEntry(*left, *right);
        ++left;
        ++right;
    }
    Require(!next(scanned, left), "nothing that was scanned is missing");
    Require(!next(grown, right), "nothing has grown that was not scanned");
}

void SameKept(const ResTreeNode& scanned, ResTreeNode& stub, bool mayLoad) {
    for (auto entry = scanned.Begin(); entry != scanned.End(); ++entry) {
        const bool isKept = scanned.IsA(u"Target")
                                ? IsKept(entry.Key())
                                : Equal(entry.Key(), u"Protocols") || Equal(entry.Key(), u"FPGA_XMLSource");
        if (isKept) {
            const NodeEntry* kept = scanned.FindRaw(entry.Key());
            const NodeEntry* found = mayLoad ? stub.Find(entry.Key()) : stub.FindRaw(entry.Key());
            Require(found != nullptr && found->IsText() && found->Text() == kept->Text(),
                    "a stub has what the cache keeps");
        }
    }
}

// Looks inside along every way that the scan has found, down to some depth; names only, since of several children of
// one name a path leads to the first.
void LookDeep(ResTreeNode& scanned, ResTreeNode& root) {
    std::vector<ResTreeNode*> open{&scanned};
    for (size_t tried = 0; tried < open.size() && tried < 20; ++tried) {
        const ResTreeNode* found = root.Lookup(open[tried]->GetPath().View(), nullptr);
        const ResTreeNode* expected = open[tried]->GetParent() == nullptr ? nullptr : open[tried];
        const ResTreeNode* first = scanned.Lookup(open[tried]->GetPath().View(), nullptr);
        Require(expected == nullptr || first == nullptr || found != nullptr, "a lookup makes a stub grow");
        Require(first == nullptr || found->GetType() == first->GetType(), "and finds a node of the type");
        for (auto entry = open[tried]->Begin(); entry != open[tried]->End(); ++entry) {
            if (entry->Child() != nullptr) {
                open.push_back(entry->Child());
            }
        }
    }
}

struct Installation {
    fuzz::MemoryFileSystem disk{u"C:\\host"};
    size_t resourceFiles = 0;
    bool isPlain = true;
};

void ReadInstallation(fuzz::Input& input, Installation& installation) {
    for (size_t count = 0; count < mostFiles && !input.IsEmpty(); ++count) {
        const std::u16string path = PathOf(input.TakeLine());
        std::string bytes;
        for (std::string line; !input.IsEmpty() && (line = input.TakeLine()) != "----";) {
            bytes += line + '\n';
        }
        if (path.empty() || path == cachePath || installation.disk.files.count(path) != 0) {
            continue;
        }
        installation.resourceFiles += path.ends_with(u"resource.xml") ? 1 : 0;
        installation.isPlain = installation.isPlain && fuzz::IsPlain(bytes);
        installation.disk.files[path] = {std::move(bytes), 5};
    }
}

// The children of both roots, side by side. `compare` gets each pair.
template <typename Compare>
void WithEach(ResTreeNode& scanned, ResTreeNode& stubs, Compare compare) {
    zkhw::EntryIterator right = stubs.Begin();
    for (zkhw::EntryIterator left = scanned.Begin(); left != scanned.End(); ++left) {
        if (left->Child() != nullptr) {
            Require(right != stubs.End() && right->Child() != nullptr, "every node has a stub");
            compare(*left->Child(), *right->Child());
            ++right;
        }
    }
    Require(right == stubs.End(), "every stub has a node");
}

void CheckGrowth(Installation& installation, FPGAResTree& owner, ResTreeNode& scanned, ResTreeNode& stubs) {
    const std::string cache = installation.disk.files[std::u16string(cachePath)].bytes;
    const auto cacheOf = [&](ResTreeNode& root) {
        Require(owner.WriteResourceCache(root, String(cachePath)) == 0, "a cache can be written");
        return installation.disk.files[std::u16string(cachePath)].bytes;
    };
    bool hasChangedForm = false;
    WithEach(scanned, stubs, [&](ResTreeNode& node, ResTreeNode& stub) {
        Require(stub.GetName() == node.GetName(), "a stub has its name");
        Require(stub.GetType() == node.GetType(), "a stub has its type");
        Require(stub.IsOrdered() || !node.IsOrdered(), "an ordered node comes back ordered");
        hasChangedForm = hasChangedForm || stub.IsOrdered() != node.IsOrdered();
        if (!IsHostSet(node)) {
            SameKept(node, stub, false);
            Require(stub.FindRaw(u":DeferredLoadPath") != nullptr, "a stub is still to grow");
        }
    });
    if (hasChangedForm) {
        return;
    }
    Require(cacheOf(stubs) == cache, "the stubs give the same cache");
    LookDeep(scanned, stubs);
    WithEach(scanned, stubs, [](ResTreeNode& node, ResTreeNode& stub) {
        stub.Find(u"no such entry");
        if (!IsHostSet(node)) {
            SameKept(node, stub, true);
            SameEntries(node, stub, true);
        }
    });
    Require(cacheOf(stubs) == cache, "the grown tree gives the same cache");
}

void ScanAndGrow(Installation& installation) {
    FPGAResTree owner;
    ResTreeNode scanned(u"", u"ProviderResourceTreeRoot", false);
    Require(owner.ScanTargets(String(folder), scanned) == 0, "a scan gives 0");
    fuzz::CheckTree(scanned);
    const bool isFollowed = installation.isPlain && scanned.FindRaw(u"XMLParseErrors") == nullptr &&
                            CountSources(scanned) == installation.resourceFiles;
    const int32_t written = owner.WriteResourceCache(scanned, String(cachePath));
    Require(written == 0 || written == static_cast<int32_t>(0x80004005), "a write gives one of two results");
    installation.disk.files[std::u16string(cachePath)].lastWriteTime = 5;
    bool hasTarget = false;
    bool isKeptWhole = true;
    bool hasHostSet = false;
    for (auto entry = scanned.Begin(); entry != scanned.End(); ++entry) {
        if (ResTreeNode* child = entry->Child()) {
            hasTarget = hasTarget || child->IsA(u"Target");
            isKeptWhole = isKeptWhole && KeepsSurvivingValues(*child);
            hasHostSet = hasHostSet || IsHostSet(*child);
        }
    }
    ResTreeNode stubs(u"", u"ProviderResourceTreeRoot", false);
    const int32_t read = owner.ReadResourceCache(String(folder), String(cachePath), stubs);
    fuzz::CheckTree(stubs);
    if (!isFollowed || !isKeptWhole || hasHostSet) {
        for (auto entry = stubs.Begin(); entry != stubs.End(); ++entry) {
            if (entry->Child() != nullptr) {
                entry->Child()->Find(u"no such entry");
            }
        }
        fuzz::CheckTree(stubs);
        return;
    }
    Require(read == (hasTarget ? 0 : 1), "a cache with a target is taken, and no other");
    if (hasTarget) {
        CheckGrowth(installation, owner, scanned, stubs);
    }
    fuzz::CheckTree(stubs);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    Installation installation;
    ReadInstallation(input, installation);
    try {
        qn::dsc::osdep::FailAllocation(mostAllocations, true);
        ScanAndGrow(installation);
    } catch (const std::bad_alloc&) {
        // As the tool, which ends here.
    }
    qn::dsc::osdep::ClearAllocationFault();
    return 0;
}
