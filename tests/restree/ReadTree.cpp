#include "restree/ReadTree.h"

namespace zkhw {

String Wide(const std::string& utf8) {
    return String::FromUtf8(utf8.data(), static_cast<uint32_t>(utf8.size()));
}

std::unique_ptr<ResTreeNode> MakeUnnamedRoot() {
    return std::make_unique<ResTreeNode>(u"", u"", false);
}

std::unique_ptr<ResTreeNode> MakeRoot() {
    return std::make_unique<ResTreeNode>(u"Root", u"Root", false);
}

std::string Load(ResTreeNode& root, const std::string& xml) {
    EXPECT_EQ(root.LoadResourceText(Wide(xml), false, nullptr), 0) << xml;
    return "\n" + DumpTree(root);
}

std::string LoadChild(ResTreeNode& root, const std::string& xml) {
    EXPECT_EQ(root.LoadResourceText(Wide(xml), true, nullptr), 0) << xml;
    return "\n" + DumpTree(root);
}

std::string TreeOf(const std::string& xml) {
    return Load(*MakeUnnamedRoot(), xml);
}

std::string ChildTreeOf(const std::string& xml) {
    return LoadChild(*MakeRoot(), xml);
}

std::string Errors(ResTreeNode& node) {
    const NodeEntry* entry = node.FindRaw(u"XMLParseErrors");
    return entry == nullptr || !entry->IsText() ? "(none)" : qn::dsc::ExactText(*entry->Text());
}

ResTreeNode& At(ResTreeNode& root, const char16_t* path) {
    ResTreeNode* node = root.Lookup(path, nullptr);
    EXPECT_NE(node, nullptr) << qn::dsc::ExactText(std::u16string_view(path));
    return *node;
}

std::string TextAt(ResTreeNode& node, const char16_t* key) {
    const auto text = node.GetProperty(key);
    EXPECT_TRUE(text) << qn::dsc::ExactText(std::u16string_view(key));
    return text ? qn::dsc::ExactText(*text) : "(none)";
}

ResourceFiles::ResourceFiles() : scope(files) {
    files.SetExecutablePath(folder.System(u"host.exe"));
}

std::string ResourceFiles::LoadFile(ResTreeNode& root, const char16_t* name, bool asChild) {
    EXPECT_EQ(root.LoadResourceFile(PathOf(name), asChild, nullptr), 0) << Errors(root);
    return "\n" + DumpTree(root);
}

}  // namespace zkhw
