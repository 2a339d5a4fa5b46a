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
        BeginXmlValue(entryName, nextName, nextAttributes);
    } else {
        const bool isOrdered = IsNodeOrdered(frame.pendingName.Text());
        if (Attributes().Has(AttributeName::Replace)) {
            frame.mergeExisting = !Attributes().IsTrue(AttributeName::Replace);
        }
        if (!frame.rootTypeKnown) {
            // Its name stays pending in the frame, which sees no further start tag.
            BindDocumentElement(entryName, frame.pendingName.Text(), isOrdered);
            stack.PushFrame(node, nextName, nextAttributes);
        } else {
            ResTreeNode& child = MakeChild(entryName, frame.pendingName.Text(), isOrdered);
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
    if (!frame.position->IsText()) {
        return;
    }
    String& value = node.EditEntryText(*frame.position);
    ++frame.xmlDepth;
    value.Append(u"<");
    value.Append(frame.pendingName.Text());
    for (const auto& [key, text] : Attributes().InOrder()) {
        value.Append(u" ");
        value.Append(key);
        value.Append(u"=\"");
        value.Append(text);
        value.Append(u"\"");
    }
    value.Append(u">");
}

void ElementReader::BeginXmlValue(const String& entryName, std::string_view nextName,
                                  const char* const* nextAttributes) {
    frame.position = node.AddTextEntry(entryName.View(), {}, TextEntry, Before()).entry;
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
    return isNode || frame.pendingName.IsLink() ? String(frame.pendingName.Text()) : String::WithoutBuffer();
}

const String* ElementReader::Before() {
    if (!Attributes().Has(AttributeName::Next)) {
        return nullptr;
    }
    before = Attributes().Value(AttributeName::Next);
    return &before;
}

bool ElementReader::IsNodeOrdered(std::u16string_view elementName) const {
    if (Attributes().Has(AttributeName::Ordered)) {
        return Attributes().IsTrue(AttributeName::Ordered);
    }
    if (frame.typeTable != nullptr) {
        if (const TypeRecord* record = frame.typeTable->Find(elementName)) {
            return record->IsListType();
        }
    }
    return frame.pendingName.EndsInList();
}

void ElementReader::BindDocumentElement(const String& entryName, std::u16string_view elementName, bool isOrdered) {
    if (node.GetType().empty()) {
        node.TakeTexts(NameAndType(entryName.View(), elementName));
        node.TakeOrder(isOrdered);
    }
    frame.rootTypeKnown = !node.GetType().empty();
    stack.NoteNode(node);
}

ResTreeNode* ElementReader::Lookup(std::u16string_view path) {
    // A path from the root is the same from any node, and deep down in a document the loading node is nearer to it.
    ResTreeNode& start = path.starts_with(u'/') ? stack.LoadingNode() : node;
    return start.Lookup(path, stack.GetDocumentRoot());
}

ResTreeNode* ElementReader::FindPrototype() {
    if (!Attributes().Has(AttributeName::Prototype)) {
        return nullptr;
    }
    const String path = Attributes().Value(AttributeName::Prototype);
    ResTreeNode* prototype = Lookup(path.View());
    if (prototype == nullptr) {
        Report(u"Unable to find prototype node: ", path);
    }
    return prototype;
}

ResTreeNode& ElementReader::MakeChild(const String& entryName, std::u16string_view elementName, bool isOrdered) {
    ResTreeNode* prototype = FindPrototype();
    ResTreeNode* child = nullptr;
    NameAndType texts(entryName.View(), elementName);
    node.ReplaceChild(!frame.mergeExisting, std::move(texts), HashKey(entryName.View()), isOrdered, child, Before());
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
    TextBuilder text;
    ReadValueText(isPath, text);
    frame.position = nullptr;
    if (name.IsInclude()) {
        Include(text.Text());
    } else if (name.IsLink()) {
        MakeLink(std::move(entryName), text.View());
    } else {
        const bool isReferenceList = hasType ? Attributes().Is(AttributeName::Type, u"ref-list") : name.IsReserves();
        MakeOrdinaryValue(text.View(), isReferenceList);
    }
    frame.xmlDepth = 0;
}

// Four-byte sequences are not supported: a value that holds one is empty.
void ElementReader::ReadValueText(bool isPath, TextBuilder& value) {
    std::string_view text = frame.text;
    if (!Attributes().Is(AttributeName::XmlSpace, u"preserve")) {
        text = TrimmedPart(text);
    }
    if (isPath && text.find('\\') != std::string_view::npos) {
        value.Append(JoinPieces(text).View());
        return;
    }
    if (isPath) {
        char* begin = frame.text.data() + (text.data() - frame.text.data());
        text = {begin, JoinPlainPieces(begin, begin + text.size())};
    }
    value.AppendUtf8(text);
}

void ElementReader::MakeOrdinaryValue(std::u16string_view text, bool isReferenceList) {
    TextBuilder expanded;
    // What is done to the text behind the expansion brings in none.
    bool holdsVariables = false;
    if (const size_t open = FindVariable(text); open != std::u16string_view::npos) {
        ExpandVariables(text, CollectParameters(stack), expanded, open);
        text = expanded.View();
        holdsVariables = FindVariable(text) != std::u16string_view::npos;
    }
    String rebased = String::WithoutBuffer();
    if (isReferenceList) {
        // The node's path is only wanted for pieces that begin with a slash.
        const bool hasPaths = text.find(u'/') != std::u16string_view::npos;
        rebased = RebaseListPaths(text, hasPaths ? node.GetPath() : String());
        text = rebased.View();
    }
    if (Attributes().IsTrue(AttributeName::Localize)) {
        StoreText(LocalizeText(text).View(), LocalizedTextEntry, holdsVariables);
    } else {
        StoreText(text, TextEntry, holdsVariables);
    }
}

void ElementReader::StoreText(std::u16string_view text, EntryKind kind, bool holdsVariables) {
    const ResTreeNode::Added added =
        node.AddText(frame.pendingName.Text(), text, kind, PropertyAdded, Before(), holdsVariables);
    frame.position = added.entry;
    if (!added.isNew && frame.mergeExisting && node.SetEntryText(added.entry, text) && kind == LocalizedTextEntry) {
        added.entry->SetTextKind(LocalizedTextEntry);
    }
}

void ElementReader::MakeLink(String&& entryName, std::u16string_view text) {
    const ResTreeNode* target = Lookup(text);
    if (target == nullptr) {
        // It stays a dead text, even when the target is read later. The first one of a node stays.
        String dead(u"UNRESOLVED LINK: ");
        dead.Append(text);
        frame.position = node.AddTextEntry(frame.pendingName.Text(), dead.View(), TextEntry, Before()).entry;
        return;
    }
    if (entryName == u":Link") {
        entryName.Assign(target->GetName());
    }
    const String path = MakeRelativeNodePath(target->GetPath(), node.GetPath());
    const ResTreeNode::Added added = node.AddLinkEntry(entryName.View(), path.View(), Before());
    frame.position = added.entry;
    if (!added.isNew && frame.mergeExisting) {
        node.SetEntryText(added.entry, path.View());
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
