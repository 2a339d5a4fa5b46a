#pragma once

// What the tests of the reader share: trees read from text or from files, as dumps (support/TreeDump.h).

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "qn/dsc/StringBase.h"
#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"
#include "support/TreeDump.h"

namespace zkhw {

inline constexpr int32_t loadFailed = static_cast<int32_t>(0x80004005);

// UTF-8 widened; without four-byte sequences.
String Wide(const std::string& utf8);

// A root without name and type, which takes those of the document element; and one that has both, so that the document
// element becomes a child if it is loaded as one.
std::unique_ptr<ResTreeNode> MakeUnnamedRoot();
std::unique_ptr<ResTreeNode> MakeRoot();

// Loads text into `root`, with the document element standing for it (Load) or as its child (LoadChild), and expects
// that it works. Gives the dump of the whole tree, behind a line feed.
std::string Load(ResTreeNode& root, const std::string& xml);
std::string LoadChild(ResTreeNode& root, const std::string& xml);

// The same into a fresh root: a document that stands for an unnamed root, or for a child of "Root:Root".
std::string TreeOf(const std::string& xml);
std::string ChildTreeOf(const std::string& xml);

// The reports that the node holds; "(none)" if there is no such entry.
std::string Errors(ResTreeNode& node);

// The node at a path, which must be there.
ResTreeNode& At(ResTreeNode& root, const char16_t* path);
// The text entry `key`, which must be there.
std::string TextAt(ResTreeNode& node, const char16_t* key);

#define ASSERT_TREE(xml, expected) ASSERT_EQ(::zkhw::TreeOf(xml), expected)
#define ASSERT_CHILD_TREE(xml, expected) ASSERT_EQ(::zkhw::ChildTreeOf(xml), expected)

// A folder with resource files, which is also where the executable stands, so that includes and deferred loads start
// from it.
class ResourceFiles : public ::testing::Test {
  protected:
    ResourceFiles();

    void Write(const std::string& name, const std::string& bytes) { folder.WriteFile(name, bytes); }

    // The path of a file in the folder: as the loads take it, and as reports show it.
    NarrowString PathOf(const char16_t* name) const { return NarrowString(folder.System(name)); }
    std::string Shown(const char16_t* name) const { return qn::dsc::ExactText(folder.System(name)); }

    // Loads a file of the folder into `root`; expects that it works. The dump behind a line feed.
    std::string LoadFile(ResTreeNode& root, const char16_t* name, bool asChild = false);

    qn::dsc::osdep::TemporaryFolder folder;
    qn::dsc::osdep::FaultyFileSystem files;
    qn::dsc::osdep::FileSystemScope scope;
};

}  // namespace zkhw
