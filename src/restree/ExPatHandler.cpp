#include "restree/ExPatHandler.h"

#include <expat.h>

#include <new>
#include <utility>

#include "qn/dsc/osdep/TaskMemory.h"

namespace zkhw {

namespace {

constexpr XML_Memory_Handling_Suite memorySuite = {qn::dsc::osdep::TaskMemAlloc, qn::dsc::osdep::TaskMemRealloc,
                                                   qn::dsc::osdep::TaskMemFree};

// Whether libexpat takes a document with this beginning for UTF-16. In UTF-8 the first NUL is a fault.
bool IsUtf16(std::string_view beginning) {
    const auto first = static_cast<unsigned char>(beginning[0]);
    return first >= 0xFE || first == 0 || (beginning.size() > 1 && beginning[1] == 0);
}

}  // namespace

struct ExPatHandler::Callbacks {
    template <typename Call>
    static void Guard(void* userData, Call call) {
        auto& handler = *static_cast<ExPatHandler*>(userData);
        // libexpat may still report the end of an element whose start has failed.
        if (handler.failure) {
            return;
        }
        try {
            call(handler);
        } catch (...) {
            handler.failure = std::current_exception();
            XML_StopParser(handler.parser, XML_FALSE);
        }
    }

    static void StartElement(void* userData, const XML_Char* name, const XML_Char** attributes) {
        Guard(userData, [&](ExPatHandler& handler) { handler.StartElement(name, attributes); });
    }
    static void EndElement(void* userData, const XML_Char* name) {
        Guard(userData, [&](ExPatHandler& handler) { handler.EndElement(name); });
    }
    static void CharacterData(void* userData, const XML_Char* text, int length) {
        Guard(userData, [&](ExPatHandler& handler) { handler.CharacterData({text, static_cast<size_t>(length)}); });
    }
    static void ProcessingInstruction(void* userData, const XML_Char* target, const XML_Char* data) {
        Guard(userData, [&](ExPatHandler& handler) { handler.ProcessingInstruction(target, data); });
    }
    static void Comment(void* userData, const XML_Char* text) {
        Guard(userData, [&](ExPatHandler& handler) { handler.Comment(text); });
    }
    static void StartCdataSection(void* userData) {
        Guard(userData, [](ExPatHandler& handler) { handler.StartCdataSection(); });
    }
    static void EndCdataSection(void* userData) {
        Guard(userData, [](ExPatHandler& handler) { handler.EndCdataSection(); });
    }
};

ExPatHandler::ExPatHandler() : parser(XML_ParserCreate_MM("utf-8", &memorySuite, nullptr)) {
    if (parser == nullptr) {
        return;
    }
    XML_SetUserData(parser, this);
    XML_SetElementHandler(parser, Callbacks::StartElement, Callbacks::EndElement);
    XML_SetCharacterDataHandler(parser, Callbacks::CharacterData);
    XML_SetProcessingInstructionHandler(parser, Callbacks::ProcessingInstruction);
    XML_SetCommentHandler(parser, Callbacks::Comment);
    XML_SetCdataSectionHandler(parser, Callbacks::StartCdataSection, Callbacks::EndCdataSection);
}

ExPatHandler::~ExPatHandler() {
    if (parser != nullptr) {
        XML_ParserFree(parser);
    }
}

void ExPatHandler::SwitchText(bool isWanted) {
    isTextWanted = isWanted;
    XML_SetCharacterDataHandler(parser, isWanted ? Callbacks::CharacterData : nullptr);
}

bool ExPatHandler::Parse(const char* bytes, size_t count, bool isFinal) {
    if (!hasBegun && count != 0) {
        hasBegun = true;
        mayHoldNul = IsUtf16({bytes, count});
    }
    const XML_Status status = XML_Parse(parser, bytes, static_cast<int>(count), isFinal ? 1 : 0);
    if (failure) {
        std::rethrow_exception(std::exchange(failure, nullptr));
    }
    // No fault of the document, so no report about it.
    if (status != XML_STATUS_OK && XML_GetErrorCode(parser) == XML_ERROR_NO_MEMORY) {
        throw std::bad_alloc();
    }
    return status == XML_STATUS_OK;
}

namespace {

// The end of `before` that shows the line at fault and the one ahead of it, with the line feed that it starts with.
std::string_view ContextTail(std::string_view before) {
    size_t start = before.rfind('\n');
    if (start != std::string_view::npos && start != 0) {
        start = before.rfind('\n', start - 1);
    }
    return before.substr(start == std::string_view::npos ? 0 : start);
}

// The beginning of `after` up to its second line feed, or to its first NUL.
std::string_view ContextHead(std::string_view after) {
    size_t end = after.find('\n');
    if (end != std::string_view::npos) {
        end = after.find('\n', end + 1);
    }
    const std::string_view head = after.substr(0, end == std::string_view::npos ? end : end + 1);
    return head.substr(0, head.find('\0'));
}

String WidenContext(std::string_view bytes) {
    return String(bytes.data(), static_cast<uint32_t>(bytes.size()));
}

}  // namespace

void ExPatHandler::GetErrorInfo(String& message, uint32_t& line, uint32_t& column, String& context) const {
    const XML_Error error = XML_GetErrorCode(parser);
    message = error == XML_ERROR_NONE ? String() : String(XML_ErrorString(error));
    line = static_cast<uint32_t>(XML_GetCurrentLineNumber(parser));
    column = static_cast<uint32_t>(XML_GetCurrentColumnNumber(parser));
    int offset = 0;
    int size = 0;
    const char* buffer = XML_GetInputContext(parser, &offset, &size);
    if (buffer == nullptr) {
        context = String();
        return;
    }
    // Only what is shown is widened and searched: a long text may have a report on each of its lines.
    std::string_view before(buffer, static_cast<size_t>(offset));
    if (mayHoldNul) {
        before = before.substr(0, before.find('\0'));
    }
    context = WidenContext(ContextTail(before));
    context.Append(WidenContext(ContextHead({buffer + offset, static_cast<size_t>(size - offset)})));
}

}  // namespace zkhw
