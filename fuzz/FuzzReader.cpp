// The reader on any bytes: up to four files that may include each other, cut apart at lines that hold "----". Whatever
// they hold, the tree that comes out is sound, can be written, and what is written can be read.

#include <string>

#include "FuzzInput.h"
#include "MemoryFileSystem.h"
#include "TreeLaws.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "restree/ResTreeNode.h"
#include "restree/TreeWriter.h"

namespace {

using qn::dsc::NarrowString;
using qn::dsc::String;
using zkhw::ResTreeNode;

// Copies of copies can make a few bytes fill any memory; this is where an input stops and memory is said to be out.
// Far more than what an input of some hundred bytes spells out takes.
constexpr uint64_t mostAllocations = 800;

// From the file, or the same as a text.
void Load(ResTreeNode& root, bool asChild, bool fromText, const std::string& text) {
    ResTreeNode* node = nullptr;
    if (fromText) {
        String wide;
        if (String::TryFromUtf8(text.data(), static_cast<uint32_t>(text.size()), wide)) {
            root.LoadResourceText(wide, asChild, nullptr);
        }
        return;
    }
    const int32_t result = root.LoadResourceFile(NarrowString("C:\\0"), asChild, &node);
    fuzz::Require(result == 0 || result == static_cast<int32_t>(0x80004005), "a load gives one of two results");
    fuzz::Require(result != 0 || asChild || node == &root, "a load into a node gives that node");
    fuzz::Require(result == 0 || root.FindRaw(u"XMLParseErrors") != nullptr, "a fault leaves a report");
}

void WriteAndReadBack(ResTreeNode& root) {
    String written;
    zkhw::WriteNode(root, written, u"");
    ResTreeNode copy(u"", u"", false);
    copy.LoadResourceText(written, false, nullptr);
    fuzz::CheckTree(copy);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const uint8_t options = input.TakeByte();
    const bool asChild = (options & 1) != 0;
    const bool fromText = (options & 2) != 0;
    fuzz::MemoryFileSystem disk(u"C:\\host");
    std::string first;
    for (char16_t name = u'0'; name == u'0' || (name < u'4' && !input.IsEmpty()); ++name) {
        std::string bytes;
        for (std::string line; !input.IsEmpty() && (line = input.TakeLine()) != "----";) {
            bytes.append(line).push_back('\n');
        }
        if (name == u'0') {
            first = bytes;
        }
        disk.files[std::u16string(u"C:\\") + name].bytes = std::move(bytes);
    }

    ResTreeNode root(u"", u"Root", false);
    try {
        qn::dsc::osdep::FailAllocation(mostAllocations, true);
        Load(root, asChild, fromText, first);
        // One or the other: each takes about as long as the load, and the first twice as long.
        if ((options & 12) == 0) {
            WriteAndReadBack(root);
        } else {
            fuzz::CheckPaths(root, 50);
        }
    } catch (const std::bad_alloc&) {
        // What had been built stands.
    }
    qn::dsc::osdep::ClearAllocationFault();
    fuzz::CheckTree(root);
    return 0;
}
