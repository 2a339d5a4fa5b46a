#include "restree/NodeEntry.h"

#include <memory>
#include <new>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "restree/ResTreeNode.h"
#include "support/AllocationFaultScope.h"

namespace zkhw {
namespace {

using namespace std::string_view_literals;

struct Releaser {
    void operator()(NodeEntry* entry) const { NodeEntry::Release(entry); }
};
using OwnedEntry = std::unique_ptr<NodeEntry, Releaser>;

OwnedEntry MakeText(std::u16string_view key, std::u16string_view text, EntryKind kind = TextEntry) {
    return OwnedEntry(NodeEntry::MakeText(key, kind, text));
}

// What a text entry holds, in each of its two forms.
class TextForms : public ::testing::TestWithParam<bool> {
  protected:
    static OwnedEntry Make(std::u16string_view key, std::u16string_view text) {
        OwnedEntry entry = MakeText(key, text);
        if (GetParam()) {
            entry->OwnKey();
        }
        return entry;
    }
};

INSTANTIATE_TEST_SUITE_P(BothForms, TextForms, ::testing::Bool(),
                         [](const auto& form) { return form.param ? "Unpacked" : "Packed"; });

TEST_P(TextForms, KeepsKeyAndTextApart) {
    const std::u16string many(70'000, u'x');
    const char16_t loneSurrogate = 0xD800;
    for (const std::u16string_view key :
         {u""sv, u"k"sv, u"a\0b"sv, std::u16string_view(&loneSurrogate, 1), std::u16string_view(many)}) {
        for (const std::u16string_view text :
             {u""sv, u"t"sv, u"c\0d\0"sv, u"\u00E4\u65E5"sv, std::u16string_view(many)}) {
            const OwnedEntry entry = Make(key, text);
            EXPECT_EQ(entry->Key(), key);
            EXPECT_EQ(entry->Text(), text);
            EXPECT_EQ(entry->Kind(), TextEntry);
        }
    }
}

TEST_P(TextForms, TakesATextOfAnyLength) {
    const OwnedEntry entry = Make(u"Key", u"twelve units");
    for (const std::u16string_view text :
         {u"other twelve"sv, u"short"sv, u""sv, u"twelve again"sv, u"thirteen long"sv, u""sv, u"x"sv}) {
        entry->SetText(text);
        EXPECT_EQ(entry->Text(), text);
        EXPECT_EQ(entry->Key(), u"Key");
    }
}

TEST_P(TextForms, TakesAPartOfItsOwnText) {
    const OwnedEntry entry = Make(u"Key", u"0123456789");
    entry->SetText(entry->Text()->substr(2, 7));
    EXPECT_EQ(entry->Text(), u"2345678");
    entry->SetText(*entry->Text());
    EXPECT_EQ(entry->Text(), u"2345678");
    entry->SetText(entry->Text()->substr(0, 0));
    EXPECT_EQ(entry->Text(), u"");
}

TEST_P(TextForms, TakesItsOwnKeyAsItsText) {
    const OwnedEntry entry = Make(u"A key that is longer", u"text");
    entry->SetText(entry->Key());
    EXPECT_EQ(entry->Text(), u"A key that is longer");
    EXPECT_EQ(entry->Key(), u"A key that is longer");
}

TEST_P(TextForms, IsEditedInPlace) {
    const OwnedEntry entry = Make(u"Key", u"a");
    entry->EditText().Append(u"bc");
    entry->EditText().Append(std::u16string_view(u"\0", 1));
    EXPECT_EQ(entry->Text(), u"abc\0"sv);
    EXPECT_EQ(entry->Key(), u"Key");
}

TEST_P(TextForms, MarkGoesWithTheTextThatBoreIt) {
    const OwnedEntry entry = Make(u"Key", u"text");
    EXPECT_FALSE(entry->IsTextMarked());
    entry->MarkText();
    EXPECT_EQ(entry->Text(), u"text");
    EXPECT_TRUE(entry->IsTextMarked());
    entry->SetText(u"text");
    EXPECT_FALSE(entry->IsTextMarked());
    entry->MarkText();
    entry->EditText();
    EXPECT_FALSE(entry->IsTextMarked());
}

TEST_P(TextForms, OwnKeyChangesNothingThatShows) {
    const OwnedEntry entry = Make(u"Key", u"text");
    const uint8_t hash = entry->KeyHash();
    entry->OwnKey();
    EXPECT_EQ(entry->Key(), u"Key");
    EXPECT_EQ(entry->KeyHash(), hash);
    EXPECT_EQ(entry->Text(), u"text");
}

TEST_P(TextForms, ReleasedTextLeavesTheKey) {
    const OwnedEntry entry = Make(u"Key", u"text");
    entry->ReleaseText();
    EXPECT_EQ(entry->Kind(), EmptyEntry);
    EXPECT_EQ(entry->Key(), u"Key");
    EXPECT_FALSE(entry->Text());
    EXPECT_FALSE(entry->LinkPath());
    EXPECT_EQ(entry->Child(), nullptr);
}

TEST_P(TextForms, StaysAsItWasWithoutMemoryForALongerText) {
    const OwnedEntry entry = Make(u"Key", u"text");
    const std::u16string longer(100, u'x');
    uint64_t failures = 0;
    for (bool failed = true; failed;) {
        failed = false;
        try {
            const support::AllocationFaultScope fault(failures + 1, true);
            entry->SetText(longer);
        } catch (const std::bad_alloc&) {
            failed = true;
            ++failures;
            ASSERT_EQ(entry->Key(), u"Key");
            ASSERT_EQ(entry->Text(), u"text");
        }
    }
    EXPECT_EQ(entry->Text(), longer);
    EXPECT_GE(failures, 1u);
}

TEST_P(TextForms, TakesATextThatIsNoLongerWithoutMemory) {
    const OwnedEntry entry = Make(u"Key", u"text");
    const support::AllocationFaultScope fault(1, true);
    entry->SetText(u"next");
    EXPECT_EQ(entry->Text(), u"next");
}

TEST(NodeEntry, EditTextOfAPackedEntryWithoutMemoryLeavesIt) {
    const OwnedEntry entry = MakeText(u"Key", u"text");
    for (uint64_t at = 1; at <= 2; ++at) {
        const support::AllocationFaultScope fault(at, true);
        EXPECT_THROW(entry->EditText(), std::bad_alloc);
    }
    EXPECT_EQ(entry->Text(), u"text");
    EXPECT_EQ(entry->EditText().View(), u"text");
}

TEST(NodeEntry, TextThatNoStringCanHoldIsRefused) {
    if constexpr (sizeof(size_t) > sizeof(uint32_t)) {
        // Its units are never looked at.
        const std::u16string_view tooLong(u"x", size_t{String::npos} + 1);
        EXPECT_THROW(NodeEntry::MakeText(u"Key", TextEntry, tooLong), qn::dsc::exception::OutOfRange);
        EXPECT_THROW(NodeEntry::MakeText(HashedKey(tooLong, 1), TextEntry, u"text"), qn::dsc::exception::OutOfRange);
        EXPECT_THROW(NameAndType(u"Name", tooLong), qn::dsc::exception::OutOfRange);
        for (const bool unpacked : {false, true}) {
            const OwnedEntry entry = MakeText(u"Key", u"text");
            if (unpacked) {
                entry->EditText();
            }
            EXPECT_THROW(entry->SetText(tooLong), qn::dsc::exception::OutOfRange);
            EXPECT_EQ(entry->Text(), u"text");
        }
    }
}

TEST(NodeEntry, LocalizedTextIsAText) {
    const OwnedEntry entry = MakeText(u"Key", u"shown\0eng=shown"sv, LocalizedTextEntry);
    EXPECT_TRUE(entry->IsText());
    EXPECT_EQ(entry->Text(), u"shown\0eng=shown"sv);
    entry->SetTextKind(TextEntry);
    EXPECT_EQ(entry->Kind(), TextEntry);
    EXPECT_EQ(entry->Text(), u"shown\0eng=shown"sv);
}

TEST(NodeEntry, LinkHasAPathAndNoText) {
    const OwnedEntry entry = MakeText(u"Key", u"../other", LinkEntry);
    EXPECT_FALSE(entry->IsText());
    EXPECT_FALSE(entry->Text());
    EXPECT_EQ(entry->LinkPath(), u"../other");
    entry->OwnKey();
    EXPECT_EQ(entry->LinkPath(), u"../other");
}

TEST(NodeEntry, ChildHasItsNodesNameAsKeyUntilItOwnsOne) {
    ResTreeNode node(u"Name", u"T", false);
    NameAndType texts(u"Name", u"T");
    const OwnedEntry entry(NodeEntry::MakeChild(texts, HashKey(u"Name"), &node));
    EXPECT_EQ(entry->Key().data(), texts.Name().data());
    EXPECT_EQ(entry->Child(), &node);
    EXPECT_FALSE(entry->Text());
    EXPECT_FALSE(entry->LinkPath());
    entry->OwnKey();
    texts = NameAndType(u"Else", u"T");
    EXPECT_EQ(entry->Key(), u"Name");
    EXPECT_EQ(entry->TakeChild(), &node);
    EXPECT_EQ(entry->Child(), nullptr);
    EXPECT_EQ(entry->Kind(), EmptyEntry);
    EXPECT_EQ(entry->Key(), u"Name");
}

TEST(NodeEntry, ChildMayHaveAKeyOfItsOwnFromTheBeginning) {
    ResTreeNode node(u"Name", u"T", false);
    const OwnedEntry entry(NodeEntry::MakeChild(String(u"Key"), &node));
    EXPECT_EQ(entry->Key(), u"Key");
    EXPECT_EQ(entry->KeyHash(), HashKey(u"Key"));
    entry->TakeChild();
}

}  // namespace
}  // namespace zkhw
