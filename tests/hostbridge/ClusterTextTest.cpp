#include "hostbridge/ClusterText.h"

#include <gtest/gtest.h>

#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::String;

TEST(ClusterText, StringElementHasItsNameFirst) {
    EXPECT_EQ(ExactText(MakeStringElement(u"the value", u"the name")),
              "<String><Name>the name</Name><Val>the value</Val></String>");
}

TEST(ClusterText, StringElementOfEmptyTextsKeepsItsParts) {
    EXPECT_EQ(ExactText(MakeStringElement(u"", u"")), "<String><Name></Name><Val></Val></String>");
}

TEST(ClusterText, StringElementEscapesMarkupButNoQuotes) {
    EXPECT_EQ(ExactText(MakeStringElement(u"<'v'>", u"\"n\"&")),
              "<String><Name>\"n\"&amp;</Name><Val>&lt;'v'&gt;</Val></String>");
}

TEST(ClusterText, ClusterHoldsTheNameBeforeTheValue) {
    String result(u"something else");
    MakeNameValueCluster(u"a&b", u"\"x\"", result);
    EXPECT_EQ(ExactText(result),
              "<Cluster><Name></Name><NumElts>2</NumElts>"
              "<String><Name>name</Name><Val>a&amp;b</Val></String>"
              "<String><Name>value</Name><Val>\"x\"</Val></String></Cluster>");
}

TEST(ClusterText, ResultMayBeOneOfTheInputs) {
    String text(u"t");
    MakeNameValueCluster(text, text, text);
    EXPECT_EQ(ExactText(text),
              "<Cluster><Name></Name><NumElts>2</NumElts>"
              "<String><Name>name</Name><Val>t</Val></String>"
              "<String><Name>value</Name><Val>t</Val></String></Cluster>");
}

}  // namespace
}  // namespace zkhw
