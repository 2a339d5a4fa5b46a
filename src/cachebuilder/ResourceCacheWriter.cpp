#include <exception>
#include <memory>

#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/ResourceCache.h"
#include "qn/dsc/WideToUtf8.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/TextStream.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"
#include "restree/TreeWriter.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::WideToUtf8;
using qn::dsc::osdep::TextStream;

namespace {

constexpr std::u16string_view rootIndent;
constexpr std::u16string_view childIndent = u"   ";
constexpr std::u16string_view propertyIndent = u"      ";

void AppendTarget(ResTreeNode& target, String& text) {
    const String empty;
    WriteOpenTag(target, text, childIndent, false);
    for (const std::u16string_view key : summaryProperties) {
        WriteProperty(target, text, key, propertyIndent, nullptr, &empty);
    }
    WriteCloseTag(target, text, childIndent);
}

void AppendOther(ResTreeNode& node, String& text) {
    WriteOpenTag(node, text, childIndent, true);
    WriteProperty(node, text, u"FPGA_XMLSource", propertyIndent, nullptr, nullptr);
    WriteCloseTag(node, text, childIndent);
}

void AppendChild(ResTreeNode& child, String& text) {
    if (child.IsA(u"Target")) {
        AppendTarget(child, text);
    } else if (qn::dsc::osdep::Equal(child.GetName(), u"FPGAHostSet")) {
        WriteNode(child, text, childIndent);
    } else {
        AppendOther(child, text);
    }
}

String MakeCacheText(ResTreeNode& root) {
    // The host set is loaded as it is written, and what hears of that may change the tree.
    const ReleaseScope scope;
    String text(u"<?xml version=\"1.0\"?>");
    WriteOpenTag(root, text, rootIndent, false);
    for (EntryIterator entry = root.Begin(); !entry.IsEnd(); ++entry) {
        if (ResTreeNode* child = entry->Child()) {
            AppendChild(*child, text);
        }
    }
    WriteCloseTag(root, text, rootIndent);
    return text;
}

// The text up to its first NUL, which a localised value may have brought in. Null if there is no memory for it.
std::unique_ptr<char[]> EncodeCacheText(const String& text) {
    try {
        const std::u16string_view units = text.View().substr(0, text.View().find(u'\0'));
        return std::unique_ptr<char[]>(WideToUtf8(units.data(), units.data() + units.size()));
    } catch (const std::exception&) {
        return nullptr;
    }
}

}  // namespace

int32_t FPGAResTree::WriteResourceCache(ResTreeNode& root, const String& cachePath) {
    const std::unique_ptr<char[]> bytes = EncodeCacheText(MakeCacheText(root));
    if (bytes == nullptr) {
        return generalFailure;
    }
    TextStream file;
    if (!file.OpenForWriting(NarrowString(cachePath))) {
        return generalFailure;
    }
    return file.Put(bytes.get()) < 0 ? generalFailure : success;
}

}  // namespace zkhw
