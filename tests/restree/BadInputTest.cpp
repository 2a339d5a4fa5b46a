// Documents that are broken, hostile or just very large.

#include <cstdint>
#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/SmallStack.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunOnSmallStack;

constexpr int manyLevels = 100000;

std::string Repeated(const std::string& text, int count) {
    std::string repeated;
    repeated.reserve(text.size() * static_cast<size_t>(count));
    for (int i = 0; i < count; ++i) {
        repeated += text;
    }
    return repeated;
}

// How many nodes named `name` are nested in each other from `node` down.
int DepthOf(ResTreeNode& top, const char16_t* name) {
    int depth = 0;
    ResTreeNode* node = &top;
    while (const NodeEntry* entry = node->FindRaw(name)) {
        if (entry->Child() == nullptr) {
            break;
        }
        node = entry->Child();
        ++depth;
    }
    return depth;
}

ResTreeNode& Innermost(ResTreeNode& top, const char16_t* name) {
    ResTreeNode* node = &top;
    for (int depth = DepthOf(top, name); depth > 0; --depth) {
        node = node->FindRaw(name)->Child();
    }
    return *node;
}

// --- Depth ---

TEST(DeepInput, IsReadAndReleasedOnASmallStack) {
    const String xml = Wide(Repeated("<N>", manyLevels) + "<V>1</V>" + Repeated("</N>", manyLevels));
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(DepthOf(*root, u"N"), manyLevels);
        EXPECT_EQ(TextAt(Innermost(*root, u"N"), u"V"), "1");
    });
}

TEST(DeepInput, ThatIsNotClosedLeavesAllOfIt) {
    const String xml = Wide(Repeated("<N>", manyLevels));
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), loadFailed);
        // The last one is still waiting for what comes next.
        EXPECT_EQ(DepthOf(*root, u"N"), manyLevels - 1);
    });
}

TEST(DeepInput, IsMergedIntoWhatIsThere) {
    const String xml = Wide(Repeated("<N>", manyLevels) + "<V>1</V>" + Repeated("</N>", manyLevels));
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(DepthOf(*root, u"N"), manyLevels);
    });
}

TEST(DeepInput, IsReplaced) {
    const String xml =
        Wide("<N replace='true'>" + Repeated("<N>", manyLevels - 1) + "<V>1</V>" + Repeated("</N>", manyLevels));
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(DepthOf(*root, u"N"), manyLevels);
    });
}

TEST(DeepInput, IsCopiedByNamesAndPrototypes) {
    const std::string deep = Repeated("<N>", manyLevels) + "<V>#{name} #{K}</V>" + Repeated("</N>", manyLevels);
    const String xml = Wide("<R><X names='a,b'>" + deep + "</X><Q prototype='a' K='k'/></R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
        EXPECT_EQ(TextAt(Innermost(At(*root, u"a"), u"N"), u"V"), "a #{K}");
        EXPECT_EQ(TextAt(Innermost(At(*root, u"b"), u"N"), u"V"), "b #{K}");
        EXPECT_EQ(TextAt(Innermost(At(*root, u"Q"), u"N"), u"V"), "a k");
    });
}

TEST(DeepInput, ParametersAreFoundAtEveryLevel) {
    const String xml =
        Wide("<N K='k'>" + Repeated("<N><V>#{K}#{x}</V>", manyLevels - 1) + Repeated("</N>", manyLevels));
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(TextAt(Innermost(*root, u"N"), u"V"), "k#{x}");
    });
}

TEST(DeepInput, OutermostParameterWinsAtEveryLevel) {
    // Each level has K and an attribute that none above it has; the innermost asks for the first and the last of them.
    std::string document = "<R>";
    for (int i = 0; i < manyLevels; ++i) {
        const std::string number = std::to_string(i);
        document += "<N k='" + number + "' a" + number + "='" + number + "'><V>#{K} #{A" + number + "}</V>";
    }
    document += "<W>#{a0} #{a99999} #{a100000} #{document-root} #{name}</W>";
    const String xml = Wide(document + Repeated("</N>", manyLevels) + "<V>#{k}</V></R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        ResTreeNode& top = At(*root, u"R");
        EXPECT_EQ(TextAt(top, u"V"), "#{k}");
        EXPECT_EQ(TextAt(At(top, u"N"), u"V"), "0 0");
        EXPECT_EQ(TextAt(At(top, u"N/N/N"), u"V"), "0 2");
        EXPECT_EQ(TextAt(Innermost(top, u"N"), u"V"), "0 99999");
        EXPECT_EQ(TextAt(Innermost(top, u"N"), u"W"), "0 99999 #{a100000} /R #{name}");
    });
}

TEST(DeepInput, PrototypeAtEveryLevelIsFilledIn) {
    std::string document = "<R K='k'><P><V>#{K} #{J} #{x}</V></P>";
    for (int i = 0; i < manyLevels; ++i) {
        const std::string path = i % 2 == 0 ? "/R/P" : "#{document-root}/P";
        document += "<N prototype='" + path + "' J='" + std::to_string(i) + "' a" + std::to_string(i) + "='1'>";
    }
    const String xml = Wide(document + "<W>w</W>" + Repeated("</N>", manyLevels) + "</R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        // J was not open when the prototype itself was read.
        EXPECT_EQ(TextAt(At(*root, u"R/P"), u"V"), "k #{J} #{x}");
        EXPECT_EQ(TextAt(At(*root, u"R/N/N"), u"V"), "k 0 #{x}");
        EXPECT_EQ(TextAt(Innermost(At(*root, u"R"), u"N"), u"V"), "k 0 #{x}");
        EXPECT_EQ(TextAt(Innermost(At(*root, u"R"), u"N"), u"W"), "w");
    });
}

TEST(DeepInput, LoopVariableHidesTheAttributesAtEveryLevel) {
    const std::string level = "<N i='1' L='l'><V>#{I} #{l}</V>";
    const String xml = Wide("<R i='0'><X names='P[i=7..8]'>" + Repeated(level, manyLevels / 10) +
                            Repeated("</N>", manyLevels / 10) + "</X><V>#{i}</V></R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
        EXPECT_EQ(TextAt(Innermost(At(*root, u"R/P7"), u"N"), u"V"), "7 l");
        EXPECT_EQ(TextAt(Innermost(At(*root, u"R/P8"), u"N"), u"V"), "8 l");
        EXPECT_EQ(TextAt(At(*root, u"R"), u"V"), "0");
    });
}

TEST(DeepInput, XmlValueIsFlat) {
    // Every second start tag is kept; the end tags run out of depth in the middle and then end frames.
    const String xml =
        Wide("<R><V type='xml'>" + Repeated("<N>", manyLevels) + Repeated("</N>", manyLevels) + "</V></R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
        EXPECT_EQ(TextAt(*root, u"V"), Repeated("<N>", manyLevels / 2) + Repeated("</N>", manyLevels / 2));
    });
}

TEST(DeepInput, LinksWithChildrenEndFramesEarly) {
    // Each named link drops the element behind it, and what follows is parked and read in the same frame.
    const String xml = Wide("<R><A>" + Repeated("<:Link name='l'><B>", manyLevels / 2) +
                            Repeated("</B></:Link>", manyLevels / 2) + "</A><W>1</W></R>");
    RunOnSmallStack([&] {
        auto root = MakeRoot();
        EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
        EXPECT_EQ(TextAt(*root, u"W"), "1");
    });
}

TEST(DeepInput, ReportsStandWhereTheyBelong) {
    const String xml = Wide(Repeated("<N>", 1000) + "<Q prototype='x'/>" + Repeated("</N>", 1000));
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(xml, true, nullptr), 0);
    EXPECT_EQ(Errors(Innermost(*root, u"N")).substr(0, 71),
              "Error on line 1 at column 3018\n   Unable to find prototype node: x\n   <");
}

// --- Size ---

TEST(LargeInput, ListOfAMillionElements) {
    const String xml = Wide("<RList>" + Repeated("<V>1</V>", 1000000) + "</RList>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    int count = 0;
    for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
        ++count;
    }
    EXPECT_EQ(count, 1000000);
}

TEST(LargeInput, ManyChildrenOfOneNameInAnOrderedNode) {
    const String xml = Wide("<RList>" + Repeated("<C name='c'/>", 200000) + "</RList>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    int count = 0;
    for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
        ++count;
    }
    EXPECT_EQ(count, 200000);
}

TEST(LargeInput, ManyChildrenOfTheirOwnNames) {
    for (const char* element : {"R", "RList"}) {
        const std::string name = element;
        std::string document = "<" + name + ">";
        for (int i = 0; i < 100000; ++i) {
            document += "<C name='c" + std::to_string((i * 7919) % 100000) + "'/>";
        }
        auto root = MakeUnnamedRoot();
        EXPECT_EQ(root->LoadResourceText(Wide(document + "</" + name + ">"), false, nullptr), 0);
        int count = 0;
        for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
            ++count;
        }
        EXPECT_EQ(count, 100000);
        EXPECT_NE(root->FindRaw(u"c99999"), nullptr);
    }
}

TEST(LargeInput, ManyValuesBeforeTheFirstOfAnOrderedNode) {
    std::string document = "<RList><Z>0</Z>";
    for (int i = 0; i < 100000; ++i) {
        document += "<V next='Z'>" + std::to_string(i) + "</V>";
    }
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide(document + "</RList>"), false, nullptr), 0);
    EntryIterator entry = root->Begin();
    for (int i = 0; i < 100000; ++i, ++entry) {
        ASSERT_EQ(qn::dsc::ExactText(*entry->Text()), std::to_string(i));
    }
    EXPECT_EQ(qn::dsc::ExactText(entry.Key()), "Z");
}

TEST(LargeInput, TensOfMegabytesOfText) {
    const std::string text = Repeated("0123456789abcde\n", 2000000);
    const String xml = Wide("<R><V xml:space='preserve'>" + text + "</V></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"V") == text);
}

TEST(LargeInput, TensOfMegabytesOfAnAttribute) {
    const std::string value(20000000, 'x');
    const String xml = Wide("<R K='" + value + "'><V>#{K}</V></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"V") == value);
}

TEST(LargeInput, LongNames) {
    const std::string name(1000000, 'n');
    const String xml = Wide("<R><" + name + "><C name='" + name + "'/></" + name + "></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(DumpTree(*root) == "R:R\n  " + name + ":" + name + "\n    " + name + ":C\n");
}

TEST(LargeInput, TenThousandAttributes) {
    std::string attributes;
    std::string kept;
    for (int i = 10000; i < 20000; ++i) {
        const std::string number = std::to_string(i);
        attributes += " a" + number + "='" + number + "'";
        kept += " a" + number + "=\"" + number + "\"";
    }
    const String xml =
        Wide("<R><C name='c'" + attributes + " ordered='true'/><V type='xml'><i" + attributes + "/></V></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(At(*root, u"c").IsOrdered());
    EXPECT_TRUE(TextAt(*root, u"V") == "<i" + kept + "></i>");
}

TEST(LargeInput, TextsUnderTenThousandAttributes) {
    std::string attributes;
    for (int i = 10000; i < 20000; ++i) {
        attributes += " a" + std::to_string(i) + "='" + std::to_string(i) + "'";
    }
    const std::string text = Repeated("#{A10000}#{a19999}#{x}", 10);
    const String xml = Wide("<R><A" + attributes + ">" + Repeated("<B><C><V>" + text + "</V></C></B>", 3000) +
                            "</A><V>#{a10000}</V></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_EQ(TextAt(At(*root, u"A/B/C"), u"V"), Repeated("1000019999#{x}", 10));
    EXPECT_EQ(TextAt(*root, u"V"), "#{a10000}");
}

TEST(LargeInput, HundredThousandReports) {
    const String xml = Wide("<R>" + Repeated("<Q prototype='x'/>\n", 100000) + "</R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    const std::string errors = Errors(*root);
    size_t count = 0;
    for (size_t at = errors.find("Error on line "); at != std::string::npos;
         at = errors.find("Error on line ", at + 1)) {
        ++count;
    }
    EXPECT_EQ(count, 100000u);
    EXPECT_NE(errors.find("Error on line 100000 at column 18\n"), std::string::npos);
}

TEST(LargeInput, ManyMarksInOneText) {
    const String xml =
        Wide("<R K='k'><V>" + Repeated("#{K}", 1000000) + "</V><W>" + Repeated("#{ x }", 1000000) + "</W></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"V") == std::string(1000000, 'k'));
    EXPECT_TRUE(TextAt(*root, u"W") == Repeated("#{x}", 1000000));
}

TEST(LargeInput, MarksThatAreNotClosed) {
    const std::string text = Repeated("#{", 5000000);
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide("<R><V>" + text + "</V></R>"), false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"V") == text);
}

TEST(LargeInput, LongListsOfLanguages) {
    const std::string list = Repeated("xx=abc,", 1000000) + "eng=found";
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide("<R><V localize='1'>" + list + "</V></R>"), false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"V") == "found{0000}" + list);
}

TEST(LargeInput, LongPathsAndReferenceLists) {
    const std::string path = Repeated("ab/", 200000);
    const String xml =
        Wide("<R><A><LogPath>" + path + "</LogPath><Reserves>" + Repeated("/B,", 200000) + "</Reserves></A></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(xml, false, nullptr), 0);
    EXPECT_TRUE(TextAt(At(*root, u"A"), u"LogPath") == Repeated("ab\\", 200000));
    EXPECT_TRUE(TextAt(At(*root, u"A"), u"Reserves") == Repeated("../B,", 200000));
}

TEST(LargeInput, AbsolutePiecesOfALongPathWin) {
    const std::string text = Repeated("ab/C:\\x/", 200000) + Repeated("y/", 200000) + "z";
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide("<R><LogPath>" + text + "</LogPath></R>"), false, nullptr), 0);
    EXPECT_TRUE(TextAt(*root, u"LogPath") == "C:\\x" + Repeated("\\y", 200000) + "\\z");
}

// --- Entities ---

TEST(HostileInput, ExponentialEntitiesAreRefused) {
    std::string document = "<!DOCTYPE R [<!ENTITY e0 'lololololololololololololololol'>";
    for (int i = 1; i < 30; ++i) {
        const std::string before = "&e" + std::to_string(i - 1) + ";";
        document += "<!ENTITY e" + std::to_string(i) + " '" + Repeated(before, 10) + "'>";
    }
    document += "]><R><V>&e29;</V></R>";
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide(document), false, nullptr), loadFailed);
    EXPECT_NE(Errors(*root).find("limit on input amplification factor (from DTD and entities) breached"),
              std::string::npos);
}

TEST(HostileInput, ExponentialEntitiesInAnAttributeAreRefused) {
    std::string document = "<!DOCTYPE R [<!ENTITY e0 'lololololololololololololololol'>";
    for (int i = 1; i < 30; ++i) {
        const std::string before = "&e" + std::to_string(i - 1) + ";";
        document += "<!ENTITY e" + std::to_string(i) + " '" + Repeated(before, 10) + "'>";
    }
    document += "]><R K='&e29;'/>";
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide(document), false, nullptr), loadFailed);
    EXPECT_NE(Errors(*root).find("limit on input amplification factor (from DTD and entities) breached"),
              std::string::npos);
}

TEST(HostileInput, ManyReferencesToALargeEntityAreRefused) {
    const std::string document =
        "<!DOCTYPE R [<!ENTITY e '" + std::string(100000, 'x') + "'>]><R><V>" + Repeated("&e;", 100000) + "</V></R>";
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceText(Wide(document), false, nullptr), loadFailed);
    EXPECT_NE(Errors(*root).find("limit on input amplification factor (from DTD and entities) breached"),
              std::string::npos);
}

class HostileFiles : public ResourceFiles {};

TEST_F(HostileFiles, ExternalEntitiesAreNotRead) {
    Write("secret.txt", "secret");
    auto root = MakeUnnamedRoot();
    const std::string document = "<!DOCTYPE R SYSTEM '" + folder.Native("dtd") + "' [<!ENTITY e SYSTEM '" +
                                 folder.Native("secret.txt") + "'><!ENTITY f SYSTEM 'file://" +
                                 folder.Native("secret.txt") + "'>]><R><V>a&e;b&f;c&undeclared;d</V></R>";
    EXPECT_EQ(Load(*root, document), "\nR:R\n  V=abcd\n");
    EXPECT_EQ(files.Count(qn::dsc::osdep::FileCall::OpenText), 0u);
    EXPECT_EQ(files.Count(qn::dsc::osdep::FileCall::OpenBinary), 0u);
}

TEST_F(HostileFiles, EveryPrefixOfADocumentIsSurvived) {
    Write("inc.xml", "<Inc names='a,b'><V>#{name}</V></Inc>");
    const std::string document =
        "<?xml version='1.0'?><!DOCTYPE R [<!ENTITY e '<E>x</E>'>]><R K='k'><!-- c --><P><V>#{K}</V></P>\n<Q "
        "names='q[i=1..2]' prototype='P'>"
        "<W>#{i}</W><:Link name='l'>../P</:Link></Q>&e;<:Include what='children'>inc.xml</:Include><S type='xml'><i "
        "a='1'/></S>"
        "<L localize='1'><![CDATA[eng=a]]>\xC3\xA9</L></R>";
    for (size_t length = 0; length <= document.size(); ++length) {
        Write("f.xml", document.substr(0, length));
        auto root = MakeUnnamedRoot();
        const int32_t result = root->LoadResourceFile(PathOf(u"f.xml"), false, nullptr);
        EXPECT_EQ(result == 0, length == document.size()) << length;
        EXPECT_EQ(Errors(*root) == "(none)", result == 0) << length;
    }
}

TEST_F(HostileFiles, EveryByteMayBeWrong) {
    const std::string document =
        "<R K='k'><P><V>#{K}</V></P><Q names='a,b' prototype='P'/><:Link name='l'>P</:Link><S type='xml'><i "
        "a='1'/></S></R>";
    for (size_t at = 0; at < document.size(); ++at) {
        for (const char wrong : {'\0', '<', '>', '&', '\'', ' ', '\xFF', '\xC3', '\xF0', '/', ':'}) {
            std::string bytes = document;
            bytes[at] = wrong;
            Write("f.xml", bytes);
            auto root = MakeUnnamedRoot();
            const int32_t result = root->LoadResourceFile(PathOf(u"f.xml"), false, nullptr);
            EXPECT_TRUE(result == 0 || Errors(*root).substr(0, 14) == "Error on line ") << at << " " << wrong;
        }
    }
}

}  // namespace
}  // namespace zkhw
