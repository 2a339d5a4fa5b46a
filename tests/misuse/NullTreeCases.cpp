// Null for every pointer of the operations of the tree.

#include "misuse/NullCases.h"

namespace misuse {

namespace {

IzkEIOGResourceTree2* Tree() {
    return fixture.tree;
}

LPCWSTR nodeNames[] = {u"A"};
LPCWSTR propertyNames[] = {u"Height"};

// One without options, where another path tells more.
template <typename Method>
void AddList(Cases& cases, const std::string& operation, Method method, const char* const (&names)[4], LPCWSTR path) {
    Outputs& o = outputs;
    AddNulls(cases, operation, Tree, method, names, path, u"protocol=Rack", &o.count, &o.texts);
}

}  // namespace

void AddTreeNulls(Cases& cases) {
    const std::string scope = "IzkEIOGResourceTree::";
    Outputs& o = outputs;
    AddList(cases, scope + "GetDescendantNames", &IzkEIOGResourceTree::GetDescendantNames,
            {"path", "options", "count", "names"}, u"Rack");
    AddList(cases, scope + "GetMultiplePropertyNames", &IzkEIOGResourceTree::GetMultiplePropertyNames,
            {"path", "options", "count", "names"}, u"Rack/S");
    AddList(cases, scope + "GetMultipleProperties", &IzkEIOGResourceTree::GetMultipleProperties,
            {"path", "options", "count", "values"}, u"Rack/S/B");
    AddNulls(cases, scope + "GetProperty", Tree, &IzkEIOGResourceTree::GetProperty, {"path", "options", "value"},
             u"Rack/S/Height", u"recurse=true", &o.text);
    AddNulls(cases, "IzkEIOGResourceTree2::GetFilteredXml", Tree, &IzkEIOGResourceTree2::GetFilteredXml,
             {"path", "nodeNameCount", "nodeNames", "propertyNameCount", "propertyNames", "xml"}, u"Rack/S", 0,
             nodeNames, 0, propertyNames, &o.text);
}

}  // namespace misuse
