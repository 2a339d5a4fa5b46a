#include "hostbridge/ClusterText.h"

#include "hostbridge/XmlEscape.h"

namespace zkhw {

using qn::dsc::String;

namespace {

void AppendStringElement(String& out, std::u16string_view value, std::u16string_view name) {
    out.Append(u"<String><Name>");
    AppendXmlEscaped(out, name, false);
    out.Append(u"</Name><Val>");
    AppendXmlEscaped(out, value, false);
    out.Append(u"</Val></String>");
}

}  // namespace

String MakeStringElement(const String& value, const String& name) {
    String element;
    AppendStringElement(element, value.View(), name.View());
    return element;
}

void MakeNameValueCluster(const String& name, const String& value, String& result) {
    String cluster(u"<Cluster><Name></Name><NumElts>2</NumElts>");
    AppendStringElement(cluster, name.View(), u"name");
    AppendStringElement(cluster, value.View(), u"value");
    cluster.Append(u"</Cluster>");
    result.Swap(cluster);
}

String MakeResourceCluster(const String& resource, const String& alias, const String& displayName) {
    String cluster(u"<Cluster><Name></Name><NumElts>3</NumElts>");
    AppendStringElement(cluster, resource.View(), u"resource");
    AppendStringElement(cluster, alias.View(), u"alias");
    AppendStringElement(cluster, displayName.View(), u"display name");
    cluster.Append(u"</Cluster>");
    return cluster;
}

}  // namespace zkhw
