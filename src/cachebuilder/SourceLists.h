#pragma once

#include <string>
#include <unordered_map>
#include <unordered_set>

#include "qn/dsc/StringBase.h"

namespace zkhw {

class NodeEntry;
class ResTreeNode;

// Keeps the entry "FPGA_XMLSource" of nodes that are put together from several files: a comma list of the files. Holds
// on to what the lists contain, and marks the texts that it has written, so that each further file for a node costs as
// much as its own name.
class SourceLists {
  public:
    // Appends `file` to the node's list, unless one of its pieces is the same file name but for the case of ASCII
    // letters. Nothing is escaped, so a comma in the name makes two pieces. An entry that is no text stays as it is.
    void Add(ResTreeNode& node, const qn::dsc::String& file);

  private:
    struct List {
        const NodeEntry* entry = nullptr;           // Only compared.
        std::unordered_set<std::u16string> pieces;  // Of the entry's text, in upper case, as long as that is marked.
    };

    std::unordered_map<const ResTreeNode*, List> lists;
};

}  // namespace zkhw
