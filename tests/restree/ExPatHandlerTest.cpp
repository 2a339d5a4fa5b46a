// What an object that owns a parser hears, and what ends the parsing.

#include "restree/ExPatHandler.h"

#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

#include <gtest/gtest.h>

namespace zkhw {
namespace {

// Writes down what it hears; throws at what `fault` names.
class Listener final : public ExPatHandler {
  public:
    explicit Listener(std::string fault = "") : fault(std::move(fault)) {}

    void StartElement(std::string_view name, const char* const*) override { Hear("<" + std::string(name)); }
    void EndElement(const char* name) override { Hear(">" + std::string(name)); }
    void CharacterData(std::string_view text) override { Hear("text " + std::string(text)); }
    void ProcessingInstruction(std::string_view target, std::string_view) override { Hear("?" + std::string(target)); }
    void Comment(std::string_view text) override { Hear("comment " + std::string(text)); }
    void StartCdataSection() override { Hear("["); }
    void EndCdataSection() override { Hear("]"); }

    void Want(bool isWanted) { WantText(isWanted); }
    bool ParseAll(std::string_view document) { return Parse(document.data(), document.size(), true); }

    std::string heard;

  private:
    void Hear(const std::string& what) {
        heard += what + "\n";
        if (what == fault) {
            throw std::runtime_error(what);
        }
    }

    std::string fault;
};

TEST(ExPatHandler, HearsOfEverythingInTheOrderOfTheDocument) {
    Listener listener;
    EXPECT_TRUE(listener.ParseAll("<a><?p d?><!--c-->t<b/><![CDATA[d]]></a>"));
    EXPECT_EQ(listener.heard, "<a\n?p\ncomment c\ntext t\n<b\n>b\n[\ntext d\n]\n>a\n");
}

// An element without content is one step for the parser, which goes on with the end in spite of all.
TEST(ExPatHandler, HearsNothingBehindAnException) {
    for (const char* fault : {"<b", "?p", "comment c", "text t", "[", "text d", "]", ">b"}) {
        Listener listener(fault);
        EXPECT_THROW(listener.ParseAll("<a><b/><?p d?><!--c-->t<![CDATA[d]]></a>"), std::runtime_error) << fault;
        EXPECT_TRUE(listener.heard.ends_with(std::string(fault) + "\n")) << fault << ": " << listener.heard;
    }
}

TEST(ExPatHandler, HearsNoTextWhileItWantsNone) {
    Listener listener;
    listener.Want(false);
    EXPECT_TRUE(listener.Parse("<a>t", 4, false));
    listener.Want(true);
    listener.Want(true);
    EXPECT_TRUE(listener.Parse("<b/>u", 5, false));
    listener.Want(false);
    EXPECT_TRUE(listener.ParseAll("<c/>v</a>"));
    EXPECT_EQ(listener.heard, "<a\n<b\n>b\ntext u\n<c\n>c\n>a\n");
}

}  // namespace
}  // namespace zkhw
