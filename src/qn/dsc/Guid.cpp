#include "qn/dsc/Guid.h"

#include <string_view>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

namespace {

constexpr size_t textLength = 38;

// Takes a text apart from left to right. Whatever doesn't fit throws BadGuidString.
class GuidReader {
  public:
    explicit GuidReader(std::u16string_view text) : rest(text) {
        if (text.size() != textLength) {
            ThrowBad(__LINE__);
        }
    }

    void Expect(char16_t unit) {
        if (Take() != unit) {
            ThrowBad(__LINE__);
        }
    }

    template <typename Number>
    Number Hexadecimal() {
        uint32_t value = 0;
        for (size_t digits = 2 * sizeof(Number); digits > 0; --digits) {
            value = value << 4 | Digit();
        }
        return static_cast<Number>(value);
    }

  private:
    [[noreturn]] static void ThrowBad(int32_t line) {
        exception::ThrowAt(exception::BadGuidString(), "qn/dsc/Guid", line);
    }

    char16_t Take() {
        const char16_t unit = rest.front();
        rest.remove_prefix(1);
        return unit;
    }

    uint32_t Digit() {
        const char16_t unit = Take();
        if (unit >= u'0' && unit <= u'9') {
            return static_cast<uint32_t>(unit - u'0');
        }
        if (unit >= u'A' && unit <= u'F') {
            return static_cast<uint32_t>(unit - u'A' + 10);
        }
        if (unit >= u'a' && unit <= u'f') {
            return static_cast<uint32_t>(unit - u'a' + 10);
        }
        ThrowBad(__LINE__);
    }

    std::u16string_view rest;
};

class GuidWriter {
  public:
    void Put(char16_t unit) { units[length++] = unit; }

    template <typename Number>
    void PutHexadecimal(Number value) {
        for (int shift = 8 * static_cast<int>(sizeof(Number)) - 4; shift >= 0; shift -= 4) {
            Put(u"0123456789ABCDEF"[(value >> shift) & 0xF]);
        }
    }

    String Text() const { return String(std::u16string_view(units, length)); }

  private:
    char16_t units[textLength];
    size_t length = 0;
};

}  // namespace

void Guid::Assign(TextArgument text) {
    GuidReader reader(text.View());
    Guid parsed;
    reader.Expect(u'{');
    parsed.data1 = reader.Hexadecimal<uint32_t>();
    reader.Expect(u'-');
    parsed.data2 = reader.Hexadecimal<uint16_t>();
    reader.Expect(u'-');
    parsed.data3 = reader.Hexadecimal<uint16_t>();
    reader.Expect(u'-');
    for (int i = 0; i < 8; ++i) {
        if (i == 2) {
            reader.Expect(u'-');
        }
        parsed.data4[i] = reader.Hexadecimal<uint8_t>();
    }
    reader.Expect(u'}');
    *this = parsed;
}

String Guid::ToString() const {
    GuidWriter writer;
    writer.Put(u'{');
    writer.PutHexadecimal(data1);
    writer.Put(u'-');
    writer.PutHexadecimal(data2);
    writer.Put(u'-');
    writer.PutHexadecimal(data3);
    writer.Put(u'-');
    for (int i = 0; i < 8; ++i) {
        if (i == 2) {
            writer.Put(u'-');
        }
        writer.PutHexadecimal(data4[i]);
    }
    writer.Put(u'}');
    return writer.Text();
}

}  // namespace qn::dsc
