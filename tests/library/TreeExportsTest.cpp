// The exported queries on a tree that was read from resource files.

#include "library/ExportsTest.h"
#include "support/ProcessEnd.h"

namespace {

using Texts = std::vector<std::string>;

class TreeExports : public ExportsTest {
  protected:
    struct Answer {
        HRESULT result;
        int found;
        std::string text;
        bool operator==(const Answer&) const = default;
    };
    friend void PrintTo(const Answer& answer, std::ostream* out) {
        *out << answer.result << " found " << answer.found << " \"" << answer.text << "\"";
    }
    static Answer Property(const char* base, const char* sub, const char* options = "") {
        const HostText value("before");
        unsigned char found = 0xAA;
        const HRESULT result = FPGAResTree_GetProperty(base, sub, options, value.Get(), &found);
        return {result, found, value.Bytes()};
    }
    static std::string Dump(const char* base, const char* sub, const char* options = "") {
        const HostText text("before");
        EXPECT_EQ(FPGAResTree_Dump(base, sub, options, text.Get()), S_OK);
        return text.Bytes();
    }
    using ListFunction = HRESULT (*)(const char*, const char*, const char*, ZkStringArrayHandle*, unsigned char*);
    static Texts List(ListFunction function, const char* base, const char* sub, const char* options) {
        HostTexts list;
        unsigned char found = 0xAA;
        EXPECT_EQ(function(base, sub, options, &list.array, &found), S_OK);
        Texts texts = list.Texts();
        texts.insert(texts.begin(), found == 1 ? "found" : found == 0 ? "not found" : "?");
        return texts;
    }
    static Texts Names(const char* base, const char* sub, const char* options = "") {
        return List(&FPGAResTree_GetDescendantNames, base, sub, options);
    }
    static Texts Properties(const char* base, const char* sub, const char* options = "") {
        return List(&FPGAResTree_GetMultipleProperties, base, sub, options);
    }
    static std::string Cluster(const std::string& name, const std::string& value) {
        return "<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>" + name +
               "</Val></String><String><Name>value</Name><Val>" + value + "</Val></String></Cluster>";
    }

    static Answer Found(const char* text) { return {S_OK, 1, text}; }
    const Answer missing{S_OK, 0, ""};
};

TEST_F(TreeExports, BaseWithASlashIsOneElementAboveASubPath) {
    EXPECT_EQ(Property("a/b", "c"), Found("slashed"));
    EXPECT_EQ(Property("a/b", "s/d"), Found("deep"));
    EXPECT_EQ(Property("a/b", "/s/d"), Found("deep"));
}

TEST_F(TreeExports, BaseWithoutASubPathIsAPath) {
    EXPECT_EQ(Property("a/b", ""), Found("plain"));
    EXPECT_EQ(Property("a/b", "/"), Found("plain"));
    EXPECT_EQ(Property("a\\/b/c", ""), Found("slashed"));
    EXPECT_EQ(Property("/a/b", ""), Found("plain"));
}

TEST_F(TreeExports, SecondSlashOfASubPathStays) {
    EXPECT_EQ(Property("a", "//b"), missing);
    EXPECT_EQ(Property("a", "b"), Found("plain"));
}

TEST_F(TreeExports, NamesAreBlindToLetterCase) {
    EXPECT_EQ(Property("A/B", "S/D"), Found("deep"));
}

TEST_F(TreeExports, MissingPropertyIsNoFailure) {
    EXPECT_EQ(Property("a", "none"), missing);
    EXPECT_EQ(Property("none", "b"), missing);
    EXPECT_EQ(Property("", ""), missing);
    EXPECT_EQ(Property("/", ""), missing);
    // A node is no property.
    EXPECT_EQ(Property("a/b", "s"), missing);
    EXPECT_EQ(Property("a", ""), missing);
}

TEST_F(TreeExports, EmptyValueIsFound) {
    EXPECT_EQ(Property("Texts", "Empty"), Found(""));
}

TEST_F(TreeExports, ValuesComeInTheDefaultCodePage) {
    EXPECT_EQ(Property("Texts", "Umlaut"), Found("\xC3\x84\xE2\x82\xAC"));
}

TEST_F(TreeExports, LocalisedValueIsTheTextOfTheLanguage) {
    EXPECT_EQ(Property("Texts", "Label"), Found("Clock"));
}

TEST_F(TreeExports, OptionsMeanNothingToAProperty) {
    EXPECT_EQ(Property("a", "b", "protocol=None,recurse=true,,=,x"), Found("plain"));
}

TEST_F(TreeExports, PairsBecomeSequencesOfFourBytes) {
    SetRootProperty(u"pair", u"\xD83D\xDE00");
    EXPECT_EQ(Property("pair", ""), Found("\xF0\x9F\x98\x80"));
    SetRootProperty(u"\xD83D\xDE00", u"by a pair");
    EXPECT_EQ(Property("\xF0\x9F\x98\x80", ""), Found("by a pair"));
}

// Windows puts its default character in the place of what is no text.
TEST_F(TreeExports, BytesThatAreNoUtf8SurviveInBothDirectionsAsOnlyLinuxKeepsBytes) {
    SetRootProperty(u"\xDCFF", u"x\xDC80\xDCFE");
    EXPECT_EQ(Property("\xFF", ""), Found("x\x80\xFE"));
}

TEST_F(TreeExports, LoneSurrogateBecomesAQuestionMarkAsOnlyLinuxKeepsBytes) {
    SetRootProperty(u"lone", u"\xD800|\xDFFF");
    EXPECT_EQ(Property("lone", ""), Found("?|?"));
}

TEST_F(TreeExports, NamesAreRelativeToTheBase) {
    EXPECT_EQ(Names("a\\/b", ""), (Texts{"found", "s", "t"}));
    EXPECT_EQ(Names("Texts", ""), (Texts{"found"}));
    EXPECT_EQ(Names("None", ""), (Texts{"found", "x"}));
    EXPECT_EQ(Names("", ""), (Texts{"found", "/a", "/a\\/b", "/None", "/Texts"}));
    // As many units as the base has go, and one for a slash behind it, whatever they are; but not all of a name.
    EXPECT_EQ(Names("/", ""), (Texts{"found", "/a", "\\/b", "one", "exts"}));
}

TEST_F(TreeExports, NamesOfNoNodeAreNotFound) {
    EXPECT_EQ(Names("nobody", ""), (Texts{"not found"}));
    EXPECT_EQ(Names("a", "b"), (Texts{"not found"}));
    EXPECT_EQ(Names("a/b", ""), (Texts{"not found"}));
}

TEST_F(TreeExports, NamesObeyTheirOptions) {
    EXPECT_EQ(Names("a\\/b", "", "protocol=Part"), (Texts{"found", "t"}));
    EXPECT_EQ(Names("a\\/b", "", "protocol = Sub , recurse = TRUE"), (Texts{"found", "/s"}));
    EXPECT_EQ(Names("None", "", "includePath=false"), (Texts{"found", "x"}));
    EXPECT_EQ(Names("a\\/b", "", "includeDisplayNames=true,protocol=Part"),
              (Texts{"found",
                     "<Cluster><Name></Name><NumElts>3</NumElts><String><Name>resource</Name><Val>t</Val></String>"
                     "<String><Name>alias</Name><Val></Val></String><String><Name>display name</Name>"
                     "<Val>/a\\/b/T &amp; co</Val></String></Cluster>"}));
}

TEST_F(TreeExports, PropertiesAreClustersOfNameAndValue) {
    EXPECT_EQ(Properties("None", "x"), (Texts{"found"}));
    // The base is shorter by a backslash than what it stands for in the path: a slash too many stays.
    EXPECT_EQ(Properties("a/b", "s"), (Texts{"found", Cluster("/s/d", "deep")}));
    EXPECT_EQ(Properties("a/b", "t"), (Texts{"found", Cluster("/t/DisplayName", "T &amp; co")}));
    EXPECT_EQ(Properties("None", "y"), (Texts{"not found"}));
    EXPECT_EQ(Properties("a/b", "s", "protocol=Part"), (Texts{"found"}));
    EXPECT_EQ(Properties("a/b", "s", "includePath=false"), (Texts{"found", Cluster("d", "deep")}));
}

TEST_F(TreeExports, DumpIsTheTextOfTheNode) {
    EXPECT_EQ(Dump("a/b", "s"), "\n<Sub name=\"s\">\n   <d>deep</d>\n</Sub>");
    EXPECT_EQ(Dump("a/b", "/s", "anything"), "\n<Sub name=\"s\">\n   <d>deep</d>\n</Sub>");
    EXPECT_EQ(Dump("a\\/b/t", ""), "\n<Part name=\"t\">\n   <DisplayName>T &amp; co</DisplayName>\n</Part>");
    EXPECT_EQ(Dump("None", "x"), "\n<Only name=\"x\">\n</Only>");
}

TEST_F(TreeExports, DumpWithoutAHandleStoresNothing) {
    TakeCalls();
    EXPECT_EQ(FPGAResTree_Dump("None", "x", "", nullptr), S_OK);
    EXPECT_EQ(TakeCalls(), Texts{});
}

TEST_F(TreeExports, ErrorWhileADumpIsStoredLeavesTheFunction) {
    const HostText text("before");
    host.Fail("HostResizeArray", 9);
    EXPECT_EQ(ErrorOf([&] { FPGAResTree_Dump("None", "x", "", text.Get()); }),
              "9 | Error Code: 9 (00000009): Unknown error code or error text unavailable.");
    EXPECT_EQ(text.Bytes(), "before");
}

TEST_F(TreeExports, DumpOfNoNodeTraps) {
    EXPECT_EXIT(FPGAResTree_Dump("a", "b", "", nullptr), qn::dsc::osdep::EndsByTrap, "^$");
    EXPECT_EXIT(FPGAResTree_Dump("", "", "", nullptr), qn::dsc::osdep::EndsByTrap, "^$");
}

TEST_F(TreeExports, IdsOfOneObjectGiveOnePointer) {
    void* first = nullptr;
    void* second = nullptr;
    ASSERT_EQ(QueryResourceTreeInterface(&IID_IzkEIOGResourceTree, nullptr, nullptr, &first), S_OK);
    ASSERT_EQ(QueryResourceTreeInterface(&IID_IzkEIOGResourceTree2, nullptr, nullptr, &second), S_OK);
    EXPECT_EQ(first, second);
    static_cast<IUnknown*>(first)->Release();
    static_cast<IUnknown*>(second)->Release();
}

TEST_F(TreeExports, EveryReferenceComesBack) {
    IzkhwResourceTreeNode* const root = RootNode();
    const ULONG before = root->AddRef();
    Property("a", "b");
    Names("a\\/b", "");
    Properties("a/b", "s");
    Dump("a/b", "s");
    EXPECT_EQ(root->AddRef(), before + 1);
    for (int i = 0; i < 3; ++i) {
        root->Release();
    }
}

TEST_F(TreeExports, NoIdIsAFailure) {
    void* result = &host;
    EXPECT_EQ(QueryResourceTreeInterface(nullptr, nullptr, nullptr, &result), E_POINTER);
}

}  // namespace
