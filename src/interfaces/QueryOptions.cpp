#include "interfaces/QueryOptions.h"

#include <utility>
#include <vector>

#include "restree/TextList.h"

namespace zkhw {

namespace {

// One item, as it stands in the text: with its own escapes, those of the list already taken out.
class OptionReader {
  public:
    OptionReader(QueryOptions& options, QueryKeys keys) : options(options), keys(keys) {}

    void Read(const String& key, String&& value) {
        if (key == u"protocol") {
            options.protocol = std::move(value);
        } else if (key == u"recurse") {
            options.recurse = IsTrue(value);
        } else if (key == u"stripPathPrefix") {
            options.stripPathPrefix = std::move(value);
            if (!hasIncludePath) {
                options.includePath = true;
            }
        } else if (key == u"exclusionProperty") {
            options.exclusionProperty = std::move(value);
        } else if (key == u"includePath") {
            options.includePath = IsTrue(value);
            hasIncludePath = true;
        } else if (keys == QueryKeys::All && key == u"includeAliases") {
            options.includeAliases = IsTrue(value);
        } else if (keys == QueryKeys::All && key == u"includeDisplayNames") {
            options.includeDisplayNames = IsTrue(value);
        }
    }

  private:
    // Only this word, unlike the truth values of resource files.
    static bool IsTrue(const String& value) { return value == u"true"; }

    QueryOptions& options;
    QueryKeys keys;
    bool hasIncludePath = false;
};

}  // namespace

QueryOptions ParseQueryOptions(std::u16string_view text, QueryKeys keys) {
    QueryOptions options;
    OptionReader reader(options, keys);
    std::vector<String> items;
    SplitList(text, u",", items, true);
    for (const String& item : items) {
        std::vector<String> parts;
        SplitList(item, u"=", parts, true);
        if (parts.size() == 2) {
            reader.Read(parts[0], std::move(parts[1]));
        }
    }
    return options;
}

std::u16string_view StripPathPrefix(std::u16string_view name, const String& prefix, bool includePath) {
    const size_t length = size_t{prefix.Length()} + (includePath ? 1 : 0);
    return length < name.size() ? name.substr(length) : std::u16string_view();
}

}  // namespace zkhw
