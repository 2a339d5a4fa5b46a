// That no pointer, number or id of the public headers was forgotten: the headers are read as text.

#include <fstream>
#include <iterator>
#include <regex>
#include <set>
#include <sstream>

#include "misuse/MisuseTest.h"

namespace {

using Names = std::set<std::string>;

std::string HeaderText(const std::string& name) {
    std::ifstream file(PUBLIC_HEADERS + name, std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(file), {}};
    const std::string withoutBlocks = std::regex_replace(text, std::regex(R"(/\*[^*]*\*+(?:[^/*][^*]*\*+)*/)"), " ");
    return std::regex_replace(std::regex_replace(withoutBlocks, std::regex("//[^\n]*"), " "), std::regex("\\s+"), " ");
}

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

// Of the interfaces that this library implements.
Arguments OfInterfaces() {
    static const std::regex declaration(R"(struct (\w+) : public \w+ \{)");
    static const std::regex operation(R"(virtual HRESULT STDMETHODCALLTYPE (\w+)\(([^)]*)\))");
    static const Names ofTheHost = {"IzkhwResourceTreeNodeObserver",
                                    "IzkProjectItem",
                                    "IzkProjectItemLocator",
                                    "IzkItemResourceLink",
                                    "IzkItemMarker",
                                    "IzkProject",
                                    "IzkHostContext"};
    Arguments all;
    for (const char* const header : {"tree_node.h", "tree_owner.h", "tree_root.h", "host_interfaces.h"}) {
        const std::string text = HeaderText(header);
        for (std::sregex_iterator each(text.begin(), text.end(), declaration), end; each != end; ++each) {
            const std::string name = (*each)[1];
            const size_t start = static_cast<size_t>(each->position());
            const std::string body = text.substr(start, text.find("};", start) - start);
            for (std::sregex_iterator found(body.begin(), body.end(), operation); found != end; ++found) {
                if (ofTheHost.count(name) == 0) {
                    AppendArguments(name + "::" + (*found)[1].str(), (*found)[2], all);
                }
            }
        }
    }
    all.push_back({"IUnknown::QueryInterface", "void** ", "result"});
    return all;
}

Arguments OfFunctions() {
    static const std::regex prototype(R"(ZKFPGA_API [^;(]*?(\w+)\(([^)]*)\);)");
    Arguments all;
    for (const char* const header : {"exports.h", "memory.h"}) {
        const std::string text = HeaderText(header);
        for (std::sregex_iterator each(text.begin(), text.end(), prototype), end; each != end; ++each) {
            AppendArguments((*each)[1], (*each)[2], all);
        }
    }
    return all;
}

Arguments OfAll() {
    Arguments all = OfInterfaces();
    const Arguments functions = OfFunctions();
    all.insert(all.end(), functions.begin(), functions.end());
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
    const std::string text = HeaderText("ids.h");
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
