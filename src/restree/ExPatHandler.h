#pragma once

// What libexpat reports, as calls on an object that owns the parser. Names and texts come as the UTF-8 that libexpat
// gave and live for the call: most of them are never needed wide.

#include <cstddef>
#include <cstdint>
#include <exception>
#include <string_view>

#include "qn/dsc/StringBase.h"

struct XML_ParserStruct;

namespace zkhw {

using qn::dsc::String;

class ExPatHandler {
  public:
    ExPatHandler(const ExPatHandler&) = delete;
    ExPatHandler& operator=(const ExPatHandler&) = delete;

    // `attributes`: name and value by turns, all NUL-terminated, then null.
    virtual void StartElement(std::string_view name, const char* const* attributes) = 0;
    virtual void EndElement(const char* name) = 0;
    // One piece of text; libexpat cuts a text at line ends, references and the ends of what it was given.
    virtual void CharacterData(std::string_view text) = 0;
    virtual void ProcessingInstruction(std::string_view target, std::string_view data) = 0;
    virtual void Comment(std::string_view text) = 0;
    virtual void StartCdataSection() = 0;
    virtual void EndCdataSection() = 0;

    // False if there was no memory for the parser.
    bool HasParser() const { return parser != nullptr; }

    // Parses the next piece of the document, which always counts as UTF-8 unless it begins with the mark of UTF-16.
    // False if it isn't well formed. An exception of a handler comes out here, and bad_alloc if the parser ran out of
    // memory.
    bool Parse(const char* bytes, size_t count, bool isFinal);

    // Where the parser stands: what is wrong (empty if nothing is), the line from 1 and the column from 0, and the text
    // from about the line before to the line after.
    void GetErrorInfo(String& message, uint32_t& line, uint32_t& column, String& context) const;

  protected:
    ExPatHandler();
    ~ExPatHandler();  // Not virtual: a handler lives as what it is.

    // Whether CharacterData is called from now on; it is at first. Most pieces of text are the white space between
    // elements, and not to hear of it saves more than this call costs.
    void WantText(bool isWanted) {
        if (isWanted != isTextWanted) {
            SwitchText(isWanted);
        }
    }

  private:
    struct Callbacks;

    void SwitchText(bool isWanted);

    XML_ParserStruct* parser;
    bool hasBegun = false;
    bool isTextWanted = true;
    bool mayHoldNul = false;     // Bytes of value 0 may stand ahead of where the parser is.
    std::exception_ptr failure;  // Kept while libexpat, which knows no exceptions, is on the stack.
};

}  // namespace zkhw
