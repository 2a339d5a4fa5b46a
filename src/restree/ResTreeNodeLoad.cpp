// Reading resource files into a node, at once or on the first lookup that needs them.

#include <memory>
#include <utility>
#include <vector>

#include "qn/dsc/WideToUtf8.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/TextStream.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "qn/dsc/osdep/path.h"
#include "restree/LoadChain.h"
#include "restree/NodeAttachments.h"
#include "restree/ParseStack.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr int32_t success = 0;
constexpr int32_t generalFailure = static_cast<int32_t>(0x80004005);

constexpr std::u16string_view parseErrorsKey = u"XMLParseErrors";

// Holds back a node's notices for the length of a load, so that they are delivered in one go.
template <typename Load>
int32_t WithChangesHeldBack(ResTreeNode& node, Load load) {
    // What the load removes may still be in use by what it is nested in.
    const ReleaseScope scope;
    const uint32_t saved = node.BeginChanges();
    int32_t result = generalFailure;
    try {
        result = load();
    } catch (...) {
        node.EndChanges(saved, false);
        throw;
    }
    node.EndChanges(saved, false);
    return result;
}

// The node of a document element, or null if it has left the tree meanwhile. An end tag too many puts what follows
// beside the document element, and there it may take its place; so may an observer that was told of the load. Only
// while a ReleaseScope stands.
ResTreeNode* StandingChild(const ResTreeNode& parent, ResTreeNode* child) {
    // In a node without a type the document element stands for the node itself.
    if (child == nullptr || child == &parent) {
        return child;
    }
    if (!parent.IsOrdered()) {
        const NodeEntry* entry = parent.FindRaw(child->GetName());
        return entry != nullptr && entry->Child() == child ? child : nullptr;
    }
    for (ConstEntryIterator entry = parent.Begin(); !entry.IsEnd(); ++entry) {
        if (entry->Child() == child) {
            return child;
        }
    }
    return nullptr;
}

bool ParseFile(qn::dsc::osdep::TextStream& file, ParseStack& stack) {
    constexpr size_t blockSize = 4096;
    const auto block = std::make_unique<char[]>(blockSize);
    while (true) {
        const size_t count = file.Read(block.get(), blockSize);
        const bool isFinal = count < blockSize;
        if (!stack.Parse(block.get(), count, isFinal)) {
            return false;
        }
        if (isFinal) {
            return true;
        }
    }
}

}  // namespace

int32_t ResTreeNode::LoadResourceFile(const NarrowString& path, bool asChild, ResTreeNode** node) {
    const ReleaseScope scope;
    const int32_t result = LoadFile(path, asChild, node, LoadChain(&path, nullptr));
    if (asChild && node != nullptr) {
        *node = StandingChild(*this, *node);
    }
    return result;
}

int32_t ResTreeNode::LoadIncludedFile(const NarrowString& path, bool asChild, ResTreeNode** node,
                                      const LoadChain& includer) {
    if (includer.IsIncludeRefused(path)) {
        *node = nullptr;
        return generalFailure;
    }
    return LoadFile(path, asChild, node, LoadChain(&path, &includer));
}

int32_t ResTreeNode::LoadFile(const NarrowString& path, bool asChild, ResTreeNode** node, const LoadChain& chain) {
    return WithChangesHeldBack(*this, [&] {
        if (node != nullptr) {
            *node = nullptr;
        }
        qn::dsc::osdep::TextStream file;
        if (!file.OpenForReading(path)) {
            return generalFailure;
        }
        ParseStack stack(*this, asChild ? String(GetType()) : String(), chain);
        if (!stack.HasParser()) {
            return generalFailure;
        }
        const bool isWellFormed = ParseFile(file, stack);
        file.Close();
        if (!isWellFormed) {
            ReportParseError(stack, &path, nullptr);
            return generalFailure;
        }
        if (node != nullptr) {
            *node = asChild ? stack.GetDocumentRoot() : this;
        }
        return success;
    });
}

int32_t ResTreeNode::LoadResourceText(const String& text, bool asChild, ResTreeNode** node) {
    const ReleaseScope scope;
    const int32_t result = WithChangesHeldBack(*this, [&] {
        if (node != nullptr) {
            *node = nullptr;
        }
        const std::unique_ptr<char[]> bytes(qn::dsc::WideToUtf8(text.CStr(), text.End()));
        const LoadChain chain(nullptr, nullptr);
        ParseStack stack(*this, asChild ? String(GetType()) : String(), chain);
        if (!stack.HasParser()) {
            return generalFailure;
        }
        if (!stack.Parse(bytes.get(), std::char_traits<char>::length(bytes.get()), true)) {
            ReportParseError(stack, nullptr, nullptr);
            return generalFailure;
        }
        if (node != nullptr) {
            *node = asChild ? stack.GetDocumentRoot() : this;
        }
        return success;
    });
    if (asChild && node != nullptr) {
        *node = StandingChild(*this, *node);
    }
    return result;
}

void ResTreeNode::ReportParseError(const ParseStack& stack, const NarrowString* fileName, const String* message) {
    String errorMessage;
    String context;
    uint32_t line = 0;
    uint32_t column = 0;
    stack.GetErrorInfo(errorMessage, line, column, context);

    String report(u"Error on line ");
    try {
        report.Append(qn::dsc::osdep::IntegerToString(line, 10));
        report.Append(u" at column ");
        report.Append(qn::dsc::osdep::IntegerToString(column, 10));
    } catch (const qn::dsc::exception::UnableToConvert&) {
        report.Append(u"unable to parse line and/or column info");
    }
    if (fileName != nullptr) {
        // No blank between "of file" and the name: that is the report's format.
        report.Append(u" of file");
        report.Append(String(*fileName));
    }
    report.Append(u"\n   ");
    report.Append(message == nullptr ? errorMessage : *message);
    report.Append(u"\n   ");
    report.Append(context);
    report.Append(u"\n");

    NodeEntry* entry = Find(parseErrorsKey);
    if (entry == nullptr) {
        AddTextEntry(parseErrorsKey, report.View(), TextEntry);
    } else if (entry->IsText()) {
        // In place: with many reports a copy of them all for each would take quadratic time.
        EditEntryText(*entry).Append(report);
        Raise(PropertyChanged);
    }
}

// Gives a node that has got its type from a document the order that goes with it. A node without a type may have
// entries all the same: the reports of failed loads, and the values of documents that held nothing else. They stay. Of
// equal keys in an ordered node that is ordered no more the first stays; the others are out of reach from then on.
void ResTreeNode::TakeOrder(bool ordered) {
    if (ordered == IsOrdered()) {
        return;
    }
    std::vector<NodeEntry*> kept;
    for (EntryIterator entry = Begin(); !entry.IsEnd(); ++entry) {
        kept.push_back(&*entry);
    }
    std::vector<NodeEntry*>& lost = GetAttachments().lostEntries;
    lost.insert(lost.end(), kept.rbegin(), kept.rend());
    SetOrdered(ordered);
    // Each is taken back from the lost ones when it has its new place.
    size_t at = lost.size();
    for (NodeEntry* entry : kept) {
        --at;
        const EntryList::Place place = ordered ? EntryList::Place{} : entries.FindPlace(entry->Key());
        if (place.entry == nullptr) {
            entries.Insert(place.position, entry);
            lost.erase(lost.begin() + static_cast<ptrdiff_t>(at));
        }
    }
}

void ResTreeNode::NoteUnusualKey(const NodeEntry& entry) {
    if (qn::dsc::osdep::Compare(entry.Key(), deferredPathKey.text) == 0) {
        NoteDeferredContents();
    }
}

void ResTreeNode::NoteDeferredContents() {
    for (ResTreeNode* node = this; node != nullptr && !node->mayBeDeferred; node = node->parent) {
        node->mayBeDeferred = true;
    }
}

bool ResTreeNode::HasDeferredContents() const {
    return mayBeDeferred && FindRaw(deferredPathKey) != nullptr;
}

// Takes the entry of the deferred paths away and gives what it named; false if there is none.
bool ResTreeNode::TakeDeferredPaths(std::vector<String>& paths) {
    NodeEntry* entry = mayBeDeferred ? FindRaw(deferredPathKey) : nullptr;
    if (entry == nullptr || !entry->IsText()) {
        return false;
    }
    SplitList(*entry->Text(), u',', paths, true);
    // Before any file is read: the load's own lookups must not come back here.
    RemoveEntry(entry);
    return true;
}

bool ResTreeNode::EnsureDeferredLoaded() {
    struct Level {
        ResTreeNode* node;
        std::vector<String> paths;
        size_t next = 0;
    };
    std::vector<String> paths;
    if (!mayBeDeferred || !TakeDeferredPaths(paths)) {
        return true;
    }
    const ReleaseScope scope;
    bool nothingLoaded = true;
    // A node whose path is ".." passes the request up, and so may the node above.
    std::vector<Level> levels;
    levels.push_back({this, std::move(paths)});
    while (!levels.empty()) {
        Level& level = levels.back();
        if (level.next == level.paths.size()) {
            levels.pop_back();
            continue;
        }
        ResTreeNode* node = level.node;
        const String path = std::move(level.paths[level.next++]);
        if (path == u"..") {
            std::vector<String> parentPaths;
            if (node->parent != nullptr && node->parent->TakeDeferredPaths(parentPaths)) {
                levels.push_back({node->parent, std::move(parentPaths)});
            }
            continue;
        }
        int32_t result = generalFailure;
        try {
            const NarrowString file(qn::dsc::osdep::JoinPath(qn::dsc::osdep::GetExecutableDir(), path));
            if (!LoadChain::IsBeingRead(file)) {
                result = node->LoadResourceFile(file, false, nullptr);
            }
        } catch (const qn::dsc::osdep::OSException&) {
            // As a file that can't be read.
        }
        if (result < 0) {
            levels.pop_back();
        } else if (result == success && levels.size() == 1) {
            nothingLoaded = false;
        }
    }
    return nothingLoaded;
}

}  // namespace zkhw
