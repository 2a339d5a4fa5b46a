#include "restree/ElementReader.h"

#include <utility>
#include <vector>

#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/path.h"
#include "restree/InstallRoot.h"
#include "restree/LoadChain.h"
#include "restree/LocalizeText.h"
#include "restree/NodePath.h"
#include "restree/OpenElementParameters.h"
#include "restree/Parameters.h"
#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

using qn::dsc::osdep::JoinPath;

namespace {

// A file path of pieces that are joined one by one. In a text without backslashes no piece is an absolute path, and
// that comes to this: a run of slashes is one separator, and none at the front. Written over the text itself, which
// saves the memory for a copy; gives its new end.
char* JoinPlainPieces(char* begin, const char* end) {
    char* joined = begin;
    for (const char* next = begin; next != end; ++next) {
        if (*next != '/') {
            *joined++ = *next;
        } else if (joined != begin && joined[-1] != '\\') {
            *joined++ = '\\';
        }
    }
    return joined;
}

// The same for any text.
String JoinPieces(std::string_view text) {
    std::vector<String> pieces;
    SplitList(Widen(text).View(), u'/', pieces, false);
    String path;
    for (const String& piece : pieces) {
        qn::dsc::osdep::AppendPathPart(path, piece);
    }
    return path;
}

}  // namespace

void ElementReader::FlushPendingElement(ElementMode mode, std::string_view nextName,
                                        const char* const* nextAttributes) {
    if (frame.position != nullptr) {
        // The element lies inside an xml value. The tag that has just arrived is lost.
        AppendTagToXmlValue();
        frame.pendingName.Clear();
        frame.text.clear();
        return;
    }
    bool isNode = false;
    String entryName = ChooseEntryName(mode, isNode);
    if (!isNode) {
        MakeValue(std::move(entryName));
        frame.pendingName.Clear();
    } else if (Attributes().Is(AttributeName::Type, u"xml")) {
        BeginXmlValue(std::move(entryName), nextName, nextAttributes);
    } else {
        const bool isOrdered = IsNodeOrdered(frame.pendingName.Text());
        if (Attributes().Has(AttributeName::Replace)) {
            frame.mergeExisting = !Attributes().IsTrue(AttributeName::Replace);
        }
        if (!frame.rootTypeKnown) {
            // Its name stays pending in the frame, which sees no further start tag.
            BindDocumentElement(std::move(entryName), String(frame.pendingName.Text()), isOrdered);
            stack.PushFrame(node, nextName, nextAttributes);
        } else {
            ResTreeNode& child = MakeChild(std::move(entryName), frame.pendingName.TakeText(), isOrdered);
            stack.NoteNode(child);
            frame.pendingName.Clear();
            if (mode == ElementMode::Container) {
                stack.PushFrame(child, nextName, nextAttributes);
            }
        }
        frame.position = nullptr;
    }
    frame.text.clear();
}

// --- xml values ---

// Nothing is escaped, and the attributes come in the order of their names.
void ElementReader::AppendTagToXmlValue() {
    String* value = frame.position->Text();
    if (value == nullptr) {
        return;
    }
    ++frame.xmlDepth;
    value->Append(u"<");
    value->Append(frame.pendingName.Text());
    for (const auto& [key, text] : Attributes().InOrder()) {
        value->Append(u" ");
        value->Append(key);
        value->Append(u"=\"");
        value->Append(text);
        value->Append(u"\"");
    }
    value->Append(u">");
}

void ElementReader::BeginXmlValue(String&& entryName, std::string_view nextName, const char* const* nextAttributes) {
    frame.position = node.AddTextEntry(std::move(entryName), String(), TextEntry, Before()).entry;
    frame.xmlDepth = 1;
    // The tag that told of the content is the first one inside the value. Without content nothing stays pending.
    frame.pendingName.Assign(nextName);
    if (nextAttributes != nullptr) {
        frame.pendingAttributes.Assign(nextAttributes);
    }
    frame.ForgetInstances();
}

// --- Nodes ---

String ElementReader::ChooseEntryName(ElementMode mode, bool& isNode) {
    if (Attributes().Has(AttributeName::Names)) {
        ParseNames(Attributes().Value(AttributeName::Names), frame.instances, frame.loopVariables);
        if (!frame.instances.empty()) {
            isNode = true;
            return frame.instances.front().name;
        }
    }
    if (Attributes().Has(AttributeName::Name)) {
        isNode = !frame.pendingName.IsLink();
        return Attributes().Value(AttributeName::Name);
    }
    isNode = mode == ElementMode::Container || Attributes().Has(AttributeName::Prototype);
    return isNode || frame.pendingName.IsLink() ? frame.pendingName.Text() : String::WithoutBuffer();
}

const String* ElementReader::Before() {
    if (!Attributes().Has(AttributeName::Next)) {
        return nullptr;
    }
    before = Attributes().Value(AttributeName::Next);
    return &before;
}

bool ElementReader::IsNodeOrdered(const String& elementName) const {
    if (Attributes().Has(AttributeName::Ordered)) {
        return Attributes().IsTrue(AttributeName::Ordered);
    }
    if (frame.typeTable != nullptr) {
        if (const TypeRecord* record = frame.typeTable->Find(elementName.View())) {
            return record->IsListType();
        }
    }
    return frame.pendingName.EndsInList();
}

void ElementReader::BindDocumentElement(String&& entryName, String&& elementName, bool isOrdered) {
    if (node.type.IsEmpty()) {
        node.TakeName(std::move(entryName));
        node.type = std::move(elementName);
        node.TakeOrder(isOrdered);
    }
    frame.rootTypeKnown = !node.type.IsEmpty();
    stack.NoteNode(node);
}

ResTreeNode* ElementReader::Lookup(const String& path) {
    // A path from the root is the same from any node, and deep down in a document the loading node is nearer to it.
    ResTreeNode& start = path.View().starts_with(u'/') ? stack.LoadingNode() : node;
    return start.Lookup(path.View(), stack.GetDocumentRoot());
}

ResTreeNode* ElementReader::FindPrototype() {
    if (!Attributes().Has(AttributeName::Prototype)) {
        return nullptr;
    }
    const String path = Attributes().Value(AttributeName::Prototype);
    ResTreeNode* prototype = Lookup(path);
    if (prototype == nullptr) {
        Report(u"Unable to find prototype node: ", path);
    }
    return prototype;
}

ResTreeNode& ElementReader::MakeChild(String&& entryName, String&& elementName, bool isOrdered) {
    ResTreeNode* prototype = FindPrototype();
    ResTreeNode* child = nullptr;
    const HashedKey hashed(entryName.View());
    node.ReplaceChild(!frame.mergeExisting, hashed, std::move(entryName), std::move(elementName), isOrdered, child,
                      Before());
    if (child == nullptr) {
        // An observer has put something else in the place that was just cleared. What follows is read all the same.
        return node;
    }
    if (prototype != nullptr) {
        // Ahead of the element's own children, so that these override it.
        child->MergeExpanded(*prototype, frame.mergeExisting, CollectParameters(stack));
    }
    return *child;
}

// --- Values ---

void ElementReader::MakeValue(String&& entryName) {
    const ElementName& name = frame.pendingName;
    const bool hasType = Attributes().Has(AttributeName::Type);
    const bool isPath =
        hasType ? Attributes().Is(AttributeName::Type, u"path") : name.EndsInPathOrDir() || name.IsInclude();
    String text = ReadValueText(isPath);
    frame.position = nullptr;
    if (name.IsInclude()) {
        Include(text);
    } else if (name.IsLink()) {
        MakeLink(std::move(entryName), text);
    } else {
        const bool isReferenceList = hasType ? Attributes().Is(AttributeName::Type, u"ref-list") : name.IsReserves();
        MakeOrdinaryValue(std::move(text), isReferenceList);
    }
    frame.xmlDepth = 0;
}

String ElementReader::ReadValueText(bool isPath) {
    std::string_view text = frame.text;
    if (!Attributes().Is(AttributeName::XmlSpace, u"preserve")) {
        text = TrimmedPart(text);
    }
    if (!isPath) {
        return Widen(text);
    }
    if (text.find('\\') != std::string_view::npos) {
        return JoinPieces(text);
    }
    char* begin = frame.text.data() + (text.data() - frame.text.data());
    return Widen({begin, JoinPlainPieces(begin, begin + text.size())});
}

void ElementReader::MakeOrdinaryValue(String&& text, bool isReferenceList) {
    if (const uint32_t open = FindVariable(text); open != String::npos) {
        text = ExpandVariables(text, CollectParameters(stack), open);
    }
    if (isReferenceList) {
        // The node's path is only wanted for pieces that begin with a slash.
        const bool hasPaths = text.Find(u'/') != String::npos;
        text = RebaseListPaths(text, hasPaths ? node.GetPath() : String());
    }
    if (Attributes().IsTrue(AttributeName::Localize)) {
        StoreText(LocalizeText(text), LocalizedTextEntry);
    } else {
        StoreText(std::move(text), TextEntry);
    }
}

void ElementReader::StoreText(String&& text, EntryKind kind) {
    const ResTreeNode::Added added = node.AddTextEntry(frame.pendingName.TakeText(), std::move(text), kind, Before());
    frame.position = added.entry;
    // NOLINTNEXTLINE(bugprone-use-after-move): the text was taken only if an entry was made.
    if (!added.isNew && frame.mergeExisting && node.SetEntryText(added.entry, std::move(text)) &&
        kind == LocalizedTextEntry) {
        added.entry->SetTextKind(LocalizedTextEntry);
    }
}

void ElementReader::MakeLink(String&& entryName, const String& text) {
    const ResTreeNode* target = Lookup(text);
    if (target == nullptr) {
        // It stays a dead text, even when the target is read later. The first one of a node stays.
        String dead(u"UNRESOLVED LINK: ");
        dead.Append(text);
        frame.position = node.AddTextEntry(frame.pendingName.TakeText(), std::move(dead), TextEntry, Before()).entry;
        return;
    }
    if (entryName == u":Link") {
        entryName = target->GetName();
    }
    String path = MakeRelativeNodePath(target->GetPath(), node.GetPath());
    const ResTreeNode::Added added = node.AddLinkEntry(std::move(entryName), std::move(path), Before());
    frame.position = added.entry;
    if (!added.isNew && frame.mergeExisting) {
        // NOLINTNEXTLINE(bugprone-use-after-move): the path was taken only if an entry was made.
        node.SetEntryText(added.entry, std::move(path));
    }
}

void ElementReader::Include(const String& text) {
    try {
        IncludeFile(text);
    } catch (const qn::dsc::osdep::OSException&) {
        Report(u"Encountered an OS exception.", String());
    }
    frame.position = nullptr;
}

void ElementReader::IncludeFile(const String& text) {
    const bool asChild = !Attributes().Is(AttributeName::What, u"children");
    const String path = JoinPath(GetInstallRoot(), text);
    ResTreeNode* loaded = nullptr;
    node.LoadIncludedFile(NarrowString(path), asChild, &loaded, stack.Chain());
    if (loaded == nullptr) {
        Report(u"Unable to find include file node: ", path);
        return;
    }
    loaded->ApplyParameters(CollectParameters(stack));
}

void ElementReader::Report(std::u16string_view message, const String& subject) {
    String text(message);
    text.Append(subject);
    node.ReportParseError(stack, nullptr, &text);
}

}  // namespace zkhw
