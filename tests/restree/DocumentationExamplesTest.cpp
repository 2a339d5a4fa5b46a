// The examples of docs/resource-language.md, each a test of its own: the descriptions are read as a scan of an
// installation would read them, and what comes out is compared with what the page says, letter by letter. The page
// itself tells how its blocks are marked ("How the examples are checked").

#include <cstddef>
#include <fstream>
#include <ostream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/StringBase.h"
#include "restree/ResTreeNode.h"
#include "restree/TreeWriter.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::osdep::FaultyFileSystem;
using qn::dsc::osdep::FileSystemScope;
using qn::dsc::osdep::TemporaryFolder;

constexpr const char* page = ZKFPGA_SOURCE_DIR "/docs/resource-language.md";
constexpr const char* exampleFile = "example_resource.xml";
// What the page calls the root of the installation.
constexpr const char* documentedRoot = "C:\\Zarvik";

struct InputFile {
    std::string name;  // Below the root of the installation; empty for the description itself.
    std::string content;
};

struct Example {
    std::string name;  // The heading that it stands under and its number there.
    size_t line = 0;   // Of its first fence in the page.
    std::vector<InputFile> inputs;
    bool hasTree = false;
    std::string tree;     // Without a line end at the end.
    std::string reports;  // Empty if the page has no list of reports for it.
    bool hasReports = false;

    bool HasOutput() const { return hasTree || hasReports; }
};

void PrintTo(const Example& example, std::ostream* stream) {
    *stream << example.name << ", line " << example.line;
}

std::vector<std::string> ReadLines(const char* path) {
    std::ifstream stream(path, std::ios::binary);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

std::string TestName(const std::string& heading, size_t number) {
    std::string name;
    bool startsWord = true;
    for (const char unit : heading) {
        const bool isLetter = (unit >= 'a' && unit <= 'z') || (unit >= 'A' && unit <= 'Z');
        if (isLetter) {
            name += startsWord && unit >= 'a' ? static_cast<char>(unit - 'a' + 'A') : unit;
        }
        startsWord = !isLetter;
    }
    return name + "_" + std::to_string(number);
}

// Cuts the page into examples. A block of a kind that isn't known is left out; PageIsWellFormed names it.
class PageReader {
  public:
    explicit PageReader(const std::vector<std::string>& pageLines) : lines(pageLines) {
        for (size_t index = 0; index < lines.size(); ++index) {
            if (lines[index].rfind("## ", 0) == 0) {
                heading = lines[index].substr(3);
                number = 0;
            } else if (lines[index].rfind("```", 0) == 0) {
                index = ReadBlock(index);
            }
        }
    }

    std::vector<Example> examples;
    std::vector<std::string> faults;

  private:
    // Gives the index of the closing fence.
    size_t ReadBlock(size_t opening) {
        const std::string kind = lines[opening].substr(3);
        std::string content;
        size_t index = opening + 1;
        for (; index < lines.size() && lines[index] != "```"; ++index) {
            content += lines[index] + "\n";
        }
        if (index == lines.size()) {
            Fault(opening, "is never closed");
        } else if (kind == "xml resource") {
            AddInput(opening, "", content);
        } else if (kind.rfind("xml file=", 0) == 0) {
            AddInput(opening, kind.substr(9), content);
        } else if (kind == "xml tree" || kind == "text errors") {
            AddOutput(opening, kind == "xml tree", content);
        } else {
            Fault(opening, "is of the unknown kind \"" + kind + "\"");
        }
        return index;
    }

    void AddInput(size_t opening, const std::string& name, const std::string& content) {
        if (examples.empty() || examples.back().HasOutput()) {
            Example example;
            example.name = TestName(heading.empty() ? "Opening" : heading, ++number);
            example.line = opening + 1;
            examples.push_back(example);
        }
        examples.back().inputs.push_back({name, content});
    }

    void AddOutput(size_t opening, bool isTree, const std::string& content) {
        if (examples.empty() || examples.back().inputs.empty() || !examples.back().inputs.back().name.empty()) {
            Fault(opening, "follows no description");
            return;
        }
        Example& example = examples.back();
        if (isTree ? example.hasTree : example.hasReports) {
            Fault(opening, "is the second of its kind in its example");
        } else if (isTree) {
            example.hasTree = true;
            example.tree = content.substr(0, content.size() - 1);
        } else {
            example.hasReports = true;
            example.reports = content;
        }
    }

    void Fault(size_t opening, const std::string& text) {
        faults.push_back("The block in line " + std::to_string(opening + 1) + " " + text);
    }

    const std::vector<std::string>& lines;
    std::string heading;
    size_t number = 0;
};

const PageReader& Page() {
    static const std::vector<std::string> lines = ReadLines(page);
    static const PageReader reader(lines);
    return reader;
}

std::string Utf8(std::u16string_view text) {
    return std::string(NarrowString(String(text)).View());
}
std::string Utf8(const String& text) {
    return Utf8(text.View());
}

std::string WithDocumentedRoot(std::string text, const std::string& root) {
    for (size_t found = text.find(root); found != std::string::npos; found = text.find(root)) {
        text.replace(found, root.size(), documentedRoot);
    }
    return text;
}

// Takes all reports out of the tree, each node's before those of the nodes below.
std::string TakeReports(ResTreeNode& top) {
    std::string reports;
    std::vector<ResTreeNode*> waiting{&top};
    while (!waiting.empty()) {
        ResTreeNode& node = *waiting.back();
        waiting.pop_back();
        if (const auto report = node.GetProperty(u"XMLParseErrors")) {
            reports += Utf8(*report);
            node.RemoveEntryByName(u"XMLParseErrors");
        }
        const size_t firstChild = waiting.size();
        for (EntryIterator entry = node.Begin(); entry != node.End(); ++entry) {
            if (ResTreeNode* child = entry->Child()) {
                waiting.insert(waiting.begin() + static_cast<std::ptrdiff_t>(firstChild), child);
            }
        }
    }
    return reports;
}

class DocumentationExample : public testing::TestWithParam<Example> {};

TEST_P(DocumentationExample, GivesWhatThePageSays) {
    const Example& example = GetParam();
    const TemporaryFolder installation;
    FaultyFileSystem files;
    files.SetExecutablePath(installation.System(u"host.exe"));
    const FileSystemScope scope(files);

    ResTreeNode root(u"", u"ProviderResourceTreeRoot", false);
    ResTreeNode* loaded = nullptr;
    for (const InputFile& input : example.inputs) {
        const bool isDescription = input.name.empty();
        installation.WriteFile(isDescription ? exampleFile : input.name, input.content);
        if (isDescription) {
            const String path = installation.System(u"example_resource.xml");
            root.LoadResourceFile(NarrowString(path), true, &loaded);
        }
    }

    EXPECT_EQ(WithDocumentedRoot(TakeReports(root), Utf8(installation.System())), example.reports);
    if (example.hasTree) {
        String written;
        WriteNode(loaded != nullptr ? *loaded : root, written, u"");
        EXPECT_EQ(Utf8(written), "\n" + example.tree);
    }
}

INSTANTIATE_TEST_SUITE_P(ResourceLanguage, DocumentationExample, testing::ValuesIn(Page().examples),
                         [](const testing::TestParamInfo<Example>& test) { return test.param.name; });

TEST(DocumentationPage, HasOnlyBlocksThatAreChecked) {
    EXPECT_EQ(Page().faults, std::vector<std::string>());
}

TEST(DocumentationPage, ShowsWhatEveryDescriptionGives) {
    for (const Example& example : Page().examples) {
        EXPECT_TRUE(example.HasOutput()) << "line " << example.line;
    }
}

// The forms of the language, and a section with examples for each.
TEST(DocumentationPage, HasExamplesOfEveryForm) {
    std::vector<std::string> sections;
    for (const Example& example : Page().examples) {
        const std::string section = example.name.substr(0, example.name.rfind('_'));
        if (sections.empty() || sections.back() != section) {
            sections.push_back(section);
        }
    }
    const std::vector<std::string> expected = {"Opening",
                                               "NodesAndValues",
                                               "Text",
                                               "Names",
                                               "TypesAndOrder",
                                               "Merging",
                                               "PathsInTheTree",
                                               "FilePaths",
                                               "ReferenceLists",
                                               "LocalisedTexts",
                                               "Parameters",
                                               "Prototypes",
                                               "ReplicatedElements",
                                               "Links",
                                               "Includes",
                                               "XMLValues",
                                               "Protocols",
                                               "Errors",
                                               "FilesAndEncoding",
                                               "Limits"};
    EXPECT_EQ(sections, expected);
}

}  // namespace
}  // namespace zkhw
