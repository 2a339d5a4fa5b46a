// Prints how many entries the tree of an installation has: reads the resource files below the folder that is named on
// the command line, as the tool does, and counts texts, links and nodes.

#include <cstdint>
#include <cstdio>
#include <vector>

#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/osdep/CommandLine.h"
#include "restree/ResTreeNode.h"

namespace {

uint64_t CountEntries(zkhw::ResTreeNode& root) {
    uint64_t count = 0;
    std::vector<zkhw::ResTreeNode*> open{&root};
    while (!open.empty()) {
        zkhw::ResTreeNode& node = *open.back();
        open.pop_back();
        for (auto entry = node.Begin(); entry != node.End(); ++entry) {
            ++count;
            if (entry->Child() != nullptr) {
                open.push_back(entry->Child());
            }
        }
    }
    return count;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fputs("usage: CountEntries folder\n", stderr);
        return 2;
    }
    zkhw::FPGAResTree owner;
    zkhw::ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
    owner.ScanTargets(qn::dsc::osdep::PathFromArgument(argv[1]), root);
    std::printf("%llu\n", static_cast<unsigned long long>(CountEntries(root)));
    return 0;
}
