// That no pointer, number or id of the public headers was forgotten: the headers are read as text.

#include <regex>
#include <set>
#include <sstream>

#include "misuse/MisuseTest.h"
#include "support/PublicHeaders.h"

namespace {

using Names = std::set<std::string>;

struct Argument {
    std::string operation;
    std::string type;
    std::string name;
};

using Arguments = std::vector<Argument>;

void AppendArguments(const std::string& operation, const std::string& list, Arguments& all) {
    static const std::regex form(R"(\s*(.*[\s*&])(\w+)\s*)");
    std::istringstream stream(list);
    for (std::string each; std::getline(stream, each, ',');) {
        std::smatch parts;
        if (std::regex_match(each, parts, form)) {
            all.push_back({operation, parts[1], parts[2]});
        }
    }
}

Arguments OfAll() {
    Arguments all;
    for (const support::Declared& each : support::DeclaredOperations()) {
        AppendArguments(each.name, each.arguments, all);
    }
    all.push_back({"IUnknown::QueryInterface", "void** ", "result"});
    for (const support::Declared& each : support::DeclaredFunctions()) {
        AppendArguments(each.name, each.arguments, all);
    }
    return all;
}

bool IsPointer(const Argument& argument) {
    static const Names pointers = {"LPCWSTR ", "BSTR ", "ZkStringHandle "};
    return argument.type.find('*') != std::string::npos || pointers.count(argument.type) != 0;
}

bool IsNumber(const Argument& argument) {
    static const Names numbers = {"ULONG ", "uint32_t ", "size_t ", "unsigned int "};
    return numbers.count(argument.type) != 0;
}

// Where something has to be stored and the headers have no result for null: breaking that has no answer.
const Names withoutAnAnswer = {
    "IzkhwResourceTreeNode::GetProperty value",     "IzkhwResourceTreeNode::GetPropertyAt value",
    "IzkhwResourceTreeNode::BeginChange pending",   "IzkhwResourceTreeNode::GetXml xml",
    "IzkhwResourceTreeNode3::GetFilteredXml xml",   "IzkhwResourceTreeNode4::CloneDetached clone",
    "IzkhwResourceTreeNode4::GetFilteredXmlEx xml", "IzkEIOGResourceTree::GetProperty value",
    "IzkEIOGResourceTree2::GetFilteredXml xml",     "IzkProjectItemSelector::SelectItem item",
    "IzkProjectItemSelector::SelectItem result",
};

Names NamesOf(std::initializer_list<Expectations> kinds) {
    Names names;
    for (const Expectations& kind : kinds) {
        for (const Expectation& each : kind) {
            EXPECT_TRUE(names.insert(each.name).second) << each.name << " has two answers";
        }
    }
    return names;
}

bool HasOneThatBeginsWith(const Names& names, const std::string& beginning) {
    const auto found = names.lower_bound(beginning);
    return found != names.end() && found->compare(0, beginning.size(), beginning) == 0;
}

TEST(MisuseCases, EveryPointerOfTheHeadersIsNullInOne) {
    const Names names = NamesOf({NullExpectations(), ExportNullExpectations()});
    size_t count = 0;
    for (const Argument& argument : OfAll()) {
        const std::string name = argument.operation + " " + argument.name;
        if (IsPointer(argument)) {
            ++count;
            EXPECT_NE(HasOneThatBeginsWith(names, name), withoutAnAnswer.count(name) != 0) << name;
        }
    }
    // That the headers were read, and as they are.
    EXPECT_EQ(count, 156U);
}

TEST(MisuseCases, EveryNumberOfTheHeadersIsZeroAndGreatInOne) {
    const Names names = NamesOf({NumberExpectations()});
    size_t count = 0;
    for (const Argument& argument : OfAll()) {
        if (IsNumber(argument)) {
            ++count;
            EXPECT_TRUE(HasOneThatBeginsWith(names, argument.operation + " " + argument.name + "="))
                << argument.operation << " " << argument.name;
        }
    }
    EXPECT_EQ(count, 22U);
}

TEST(MisuseCases, EveryIdOfTheHeadersIsAskedOfEveryObject) {
    static const std::regex definition(R"(ZKFPGA_IID IID_(\w+) =)");
    const Names names = NamesOf({IdExpectations()});
    const std::string text = support::HeaderText("ids.h");
    size_t count = 0;
    for (std::sregex_iterator each(text.begin(), text.end(), definition), end; each != end; ++each) {
        ++count;
        for (const char* const object :
             {" of a view", " of a tree", " of an owner", " of a selector", " of the library"}) {
            EXPECT_EQ(names.count((*each)[1].str() + object), 1U) << (*each)[1] << object;
        }
    }
    EXPECT_EQ(count, 12U);
}

TEST(MisuseCases, EveryOneHasItsAnswer) {
    Names expected = NamesOf({NullExpectations(), ExportNullExpectations(), NumberExpectations(), IdExpectations(),
                              NoticeExpectations(), SequenceExpectations()});
    // What the memory of Linux alone has an answer for.
    expected.insert({"SysFreeString of task memory", "SysFreeString twice", "SysStringLen of a freed string"});
    for (const std::string& name : NamesOfCases()) {
        EXPECT_NE(expected.erase(name) != 0, withoutAnAnswer.count(name) != 0) << name;
    }
    EXPECT_EQ(expected, Names{});
}

}  // namespace
