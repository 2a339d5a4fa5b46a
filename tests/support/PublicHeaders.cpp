#include "support/PublicHeaders.h"

#include <fstream>
#include <iterator>
#include <regex>
#include <set>

namespace support {

std::string HeaderText(const std::string& name) {
    std::ifstream file(PUBLIC_HEADERS + name, std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(file), {}};
    const std::string withoutBlocks = std::regex_replace(text, std::regex(R"(/\*[^*]*\*+(?:[^/*][^*]*\*+)*/)"), " ");
    return std::regex_replace(std::regex_replace(withoutBlocks, std::regex("//[^\n]*"), " "), std::regex("\\s+"), " ");
}

std::vector<Declared> DeclaredOperations() {
    static const std::regex declaration(R"(struct (\w+) : public \w+ \{)");
    static const std::regex operation(R"(virtual HRESULT STDMETHODCALLTYPE (\w+)\(([^)]*)\))");
    static const std::set<std::string> ofTheHost = {"IzkhwResourceTreeNodeObserver",
                                                    "IzkProjectItem",
                                                    "IzkProjectItemLocator",
                                                    "IzkItemResourceLink",
                                                    "IzkItemMarker",
                                                    "IzkProject",
                                                    "IzkHostContext"};
    std::vector<Declared> all;
    for (const char* const header : {"tree_node.h", "tree_owner.h", "tree_root.h", "host_interfaces.h"}) {
        const std::string text = HeaderText(header);
        for (std::sregex_iterator each(text.begin(), text.end(), declaration), end; each != end; ++each) {
            const std::string name = (*each)[1];
            if (ofTheHost.count(name) != 0) {
                continue;
            }
            const size_t start = static_cast<size_t>(each->position());
            const std::string body = text.substr(start, text.find("};", start) - start);
            for (std::sregex_iterator found(body.begin(), body.end(), operation); found != end; ++found) {
                all.push_back({name + "::" + (*found)[1].str(), (*found)[2]});
            }
        }
    }
    return all;
}

std::vector<Declared> DeclaredFunctions() {
    static const std::regex prototype(R"(ZKFPGA_API [^;(]*?(\w+)\(([^)]*)\);)");
    std::vector<Declared> all;
    for (const char* const header : {"exports.h", "memory.h"}) {
        const std::string text = HeaderText(header);
        for (std::sregex_iterator each(text.begin(), text.end(), prototype), end; each != end; ++each) {
            all.push_back({(*each)[1], (*each)[2]});
        }
    }
    return all;
}

}  // namespace support
