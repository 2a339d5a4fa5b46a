// A String beside a standard string that is put through the same changes, with its own text as the source every now and
// then, and with allocations that fail: the two must agree after every step.

#include <new>
#include <string>

#include "FuzzInput.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/AllocationFault.h"

namespace {

using qn::dsc::String;

constexpr uint32_t longest = 4000;

uint32_t Found(size_t offset) {
    return offset == std::u16string::npos ? String::npos : static_cast<uint32_t>(offset);
}

void Same(const String& text, const std::u16string& model) {
    fuzz::Require(text.View() == model, "the units are the same");
    fuzz::Require(*text.End() == 0 && text.CStr() + text.Length() == text.End(), "a NUL stands at the end");
    fuzz::Require(text.Capacity() >= text.Length(), "the capacity holds the text");
}

void Search(const String& text, const std::u16string& model, const std::u16string& part, uint32_t from) {
    if (from < model.size()) {
        fuzz::Require(text.Find(part, from) == Found(model.find(part, from)), "Find");
        fuzz::Require(text.FindFirstOf(part, from) == Found(model.find_first_of(part, from)), "FindFirstOf");
        fuzz::Require(text.FindFirstNotOf(part, from) == Found(model.find_first_not_of(part, from)), "FindFirstNotOf");
    } else {
        fuzz::Require(text.Find(part, from) == String::npos, "a search from behind the end finds nothing");
    }
    fuzz::Require(text.FindLastNotOf(part, from) == Found(model.find_last_not_of(part, from)), "FindLastNotOf");
    if (!part.empty()) {
        fuzz::Require(text.Find(part[0], 0) == Found(model.find(part[0])), "Find of a unit");
        fuzz::Require(text.FindLast(part[0], from) == Found(model.rfind(part[0], from)), "FindLast of a unit");
        fuzz::Require(text.FindLast(part, from) == Found(model.rfind(part, from)), "FindLast");
    }
}

// One step on both; what throws must leave both as they were.
void Step(fuzz::Input& input, String& text, std::u16string& model) {
    const uint8_t operation = input.TakeByte();
    const uint32_t offset = input.TakeByte();
    const uint32_t count = input.TakeByte();
    const std::u16string part = input.TakeText();
    std::u16string next = model;
    switch (operation % 10) {
        case 0:
            text.Append(part);
            next += part;
            break;
        case 1:
            text.Append(text);
            next += model;
            break;
        case 2:
            text.Append(count, u'x');
            next.append(count, u'x');
            break;
        case 3:
            text.Assign(part.data(), static_cast<uint32_t>(part.size()));
            next = part;
            break;
        case 4: {
            // A part of the own text that does not begin where the text begins.
            const size_t begin = model.empty() ? 0 : 1 + offset % model.size();
            next = model.substr(begin);
            text.Assign(text.CStr() + begin, static_cast<uint32_t>(next.size()));
            break;
        }
        case 5:
            if (offset <= model.size()) {
                next.erase(offset, count);
            }
            try {
                text.Erase(offset, count, (operation & 0x80) != 0);
                fuzz::Require(offset <= model.size(), "an offset behind the end is refused");
            } catch (const qn::dsc::exception::OutOfRange2&) {
                fuzz::Require(offset > model.size(), "an offset up to the end is taken");
            }
            break;
        case 6:
            if (offset <= model.size()) {
                next = model.substr(offset, count);
                text = text.CheckedSubstring(offset, count);
            }
            break;
        case 7: {
            String copy(text);
            text = std::move(copy);
            break;
        }
        case 8:
            text = String(part) + text;
            next = part + model;
            break;
        default:
            Search(text, model, part, offset);
    }
    model = std::move(next);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    String text;
    std::u16string model;
    while (!input.IsEmpty() && model.size() < longest) {
        const uint8_t failing = input.TakeByte();
        try {
            if (failing < 32) {
                qn::dsc::osdep::FailAllocation(1 + failing % 4, failing >= 16);
            }
            Step(input, text, model);
        } catch (const std::bad_alloc&) {
        }
        qn::dsc::osdep::ClearAllocationFault();
        Same(text, model);
    }
    return 0;
}
