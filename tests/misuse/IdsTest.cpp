// Every id, asked of every object: it answers for its own interfaces and for IUnknown with itself, for all others with
// E_NOINTERFACE and null.

#include <set>

#include "misuse/MisuseTest.h"

namespace {

const std::vector<std::string> ids = {"IzkhwResourceTreeNode",
                                      "IzkhwResourceTreeNode2",
                                      "IzkhwResourceTreeNode3",
                                      "IzkhwResourceTreeNode4",
                                      "IzkhwResourceTreeNode5",
                                      "IzkhwResourceTreeOwner",
                                      "IzkEIOGResourceTree",
                                      "IzkEIOGResourceTree2",
                                      "IzkProjectItemSelector",
                                      "IzkItemMarker",
                                      "IzkItemResourceLink",
                                      "IUnknown",
                                      "nothing",
                                      "almost"};

const std::set<std::string> nodeIds = {"IzkhwResourceTreeNode", "IzkhwResourceTreeNode2", "IzkhwResourceTreeNode3",
                                       "IzkhwResourceTreeNode4", "IzkhwResourceTreeNode5"};
const std::set<std::string> treeIds = {"IzkEIOGResourceTree", "IzkEIOGResourceTree2"};

std::string AnswerOf(std::set<std::string> known, const std::string& id) {
    known.insert("IUnknown");
    return known.count(id) != 0 ? "00000000 itself" : "80004002 null";
}

// The library gives the two objects that it keeps, an owner, and nothing for IUnknown.
std::string AnswerOfLibrary(const std::string& id) {
    if (nodeIds.count(id) != 0 || treeIds.count(id) != 0) {
        return "00000000 it";
    }
    return id == "IzkhwResourceTreeOwner" ? "00000000 new" : "80004002 null";
}

}  // namespace

Expectations IdExpectations() {
    Expectations all;
    for (const std::string& id : ids) {
        all.push_back(Answers(id + " of a view", AnswerOf(nodeIds, id)));
        all.push_back(Answers(id + " of a tree", AnswerOf(treeIds, id)));
        all.push_back(Answers(id + " of an owner", AnswerOf({"IzkhwResourceTreeOwner"}, id)));
        all.push_back(Answers(id + " of a selector", AnswerOf({"IzkProjectItemSelector"}, id)));
        all.push_back(Answers(id + " of the library", AnswerOfLibrary(id)));
    }
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfIds, Misuse, testing::ValuesIn(IdExpectations()), TestName);
