#include "qn/dsc/StringBase.h"

#include <algorithm>
#include <cassert>
#include <functional>

#include "qn/dsc/SafeInteger.h"
#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

namespace {

constexpr const char* moduleName = "qn/dsc/StringBase";

template <typename Unit>
uint32_t OffsetOrNone(size_t position) {
    return position == std::basic_string_view<Unit>::npos ? StringBase<Unit>::npos : static_cast<uint32_t>(position);
}

}  // namespace

template <typename Unit>
void StringBase<Unit>::ThrowNoMemory() {
    exception::ThrowBadAllocation();
}

template <typename Unit>
void StringBase<Unit>::ThrowTooLong() {
    exception::ThrowAt(exception::OutOfRange(), moduleName, __LINE__);
}

template <typename Unit>
StringBase<Unit>::StringBase(uint32_t count, Unit unit) {
    begin = AllocateUnits(count);
    std::fill_n(begin, count, unit);
    SetFull(begin, count);
}

// Frees the old buffer for `block`, which holds `count` units.
template <typename Unit>
void StringBase<Unit>::ReplaceBuffer(Unit* block, size_t count) {
    osdep::TaskMemFree(begin);
    SetFull(block, count);
}

template <typename Unit>
void StringBase<Unit>::AssignUnits(const Unit* text, size_t length) {
    if (text == begin && text != nullptr) {
        return;
    }
    const size_t count = text == nullptr ? 0 : length;
    if (!KeepsBuffer(count)) {
        // A new block and not a reallocation: the old content needs no copy, and `text` may be a part of it.
        Unit* block = AllocateUnits(count);
        if (count != 0) {
            std::memcpy(block, text, count * sizeof(Unit));
        }
        ReplaceBuffer(block, count);
        return;
    }
    if (count != 0) {
        std::memmove(begin, text, count * sizeof(Unit));
    }
    end = begin + count;
    *end = Unit();
}

template <typename Unit>
void StringBase<Unit>::Assign(const Unit* text) {
    Assign(ViewOf(text));
}

template <typename Unit>
void StringBase<Unit>::Assign(UnitView text) {
    if (text.size() > npos) {
        ThrowTooLong();
    }
    AssignUnits(text.data(), text.size());
}

// Makes room for `count` more units.
template <typename Unit>
void StringBase<Unit>::Grow(size_t count) {
    if (count > npos) {
        ThrowTooLong();
    }
    const size_t length = Size();
    const SafeInteger needed = SafeInteger(Length()) + SafeInteger(static_cast<uint32_t>(count));
    size_t capacity = needed.Doubled().Value();
    void* block = osdep::TaskMemRealloc(begin, (capacity + 1) * sizeof(Unit));
    if (block == nullptr) {
        capacity = needed.Value();
        block = osdep::TaskMemRealloc(begin, (capacity + 1) * sizeof(Unit));
        if (block == nullptr) {
            ThrowNoMemory();
        }
    }
    begin = static_cast<Unit*>(block);
    end = begin + length;
    capacityEnd = begin + capacity;
}

template <typename Unit>
void StringBase<Unit>::AppendGrowing(UnitView text) {
    const Unit* source = text.data();
    // std::less, since only it orders pointers into different arrays.
    const std::less<const Unit*> before;
    const bool isOwn = !before(source, begin) && !before(end, source);
    const ptrdiff_t offset = isOwn ? source - begin : 0;
    Grow(text.size());
    PutAtEnd(isOwn ? begin + offset : source, text.size());
}

template <typename Unit>
void StringBase<Unit>::Append(const StringBase& text, uint32_t offset, uint32_t count) {
    const uint32_t length = text.Length();
    const uint32_t limited = std::min(count, length);
    const uint32_t inside = offset < length ? std::min(limited, length - offset) : 0;
    if (limited > Free()) {
        // Before anything is appended: a failure leaves the string as it was. A `text` that is this string is read
        // through it again below.
        Grow(limited);
    }
    if (inside != 0) {
        PutAtEnd(text.begin + offset, inside);
    }
    Append(limited - inside, Unit());
}

template <typename Unit>
void StringBase<Unit>::Append(uint32_t count, Unit unit) {
    if (count > Free()) {
        Grow(count);
    }
    std::fill_n(end, count, unit);
    end += count;
    *end = Unit();
}

template <typename Unit>
void StringBase<Unit>::Reserve(uint32_t capacity) {
    if (capacity <= Capacity()) {
        return;
    }
    const size_t length = Size();
    void* block = osdep::TaskMemRealloc(begin, (size_t{capacity} + 1) * sizeof(Unit));
    if (block == nullptr) {
        ThrowNoMemory();
    }
    begin = static_cast<Unit*>(block);
    end = begin + length;
    capacityEnd = begin + capacity;
}

template <typename Unit>
StringBase<Unit> StringBase<Unit>::Concat(std::initializer_list<UnitView> parts) {
    size_t length = 0;
    for (const UnitView part : parts) {
        length += part.size();
    }
    if (length > npos) {
        ThrowTooLong();
    }
    StringBase result = WithoutBuffer();
    Unit* block = AllocateUnits(length);
    Unit* target = block;
    for (const UnitView part : parts) {
        if (!part.empty()) {
            std::memcpy(target, part.data(), part.size() * sizeof(Unit));
            target += part.size();
        }
    }
    result.SetFull(block, length);
    return result;
}

template <typename Unit>
void StringBase<Unit>::RequireOffset(uint32_t offset) const {
    if (offset > Length()) {
        exception::ThrowAt(exception::OutOfRange2("String offset out of range"), moduleName, __LINE__);
    }
}

template <typename Unit>
auto StringBase<Unit>::SubView(uint32_t offset, uint32_t count) const -> UnitView {
    assert(offset <= Length());
    const uint32_t length = Length();
    uint32_t last = length;
    if (count != npos) {
        last = std::min(length, (SafeInteger(offset) + SafeInteger(count)).Value());
    }
    return UnitView(begin + offset, last - offset);
}

template <typename Unit>
StringBase<Unit> StringBase<Unit>::Substring(uint32_t offset, uint32_t count) const {
    return StringBase(SubView(offset, count));
}

template <typename Unit>
StringBase<Unit> StringBase<Unit>::CheckedSubstring(uint32_t offset, uint32_t count) const {
    RequireOffset(offset);
    return StringBase(SubView(offset, count));
}

template <typename Unit>
void StringBase<Unit>::Erase(uint32_t offset, uint32_t count, bool shrink) {
    RequireOffset(offset);
    const size_t removed = std::min(count, Length() - offset);
    const size_t length = Size() - removed;
    const Unit* rest = begin + offset + removed;
    if (shrink && !KeepsBuffer(length)) {
        Unit* block = AllocateUnits(length);
        std::memcpy(block, begin, offset * sizeof(Unit));
        std::memcpy(block + offset, rest, (length - offset) * sizeof(Unit));
        ReplaceBuffer(block, length);
        return;
    }
    std::memmove(begin + offset, rest, (length - offset) * sizeof(Unit));
    end = begin + length;
    *end = Unit();
}

template <>
int StringBase<char16_t>::CompareSub(uint32_t offset, uint32_t count, const char16_t* text, uint32_t textLength) const {
    RequireOffset(offset);
    const UnitView other = text == nullptr || textLength == npos ? ViewOf(text) : UnitView(text, textLength);
    return osdep::Compare(SubView(offset, count), other);
}

template <typename Unit>
uint32_t StringBase<Unit>::Find(Unit unit, uint32_t from) const {
    return OffsetOrNone<Unit>(View().find(unit, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::Find(UnitView text, uint32_t from) const {
    return from >= Length() ? npos : OffsetOrNone<Unit>(View().find(text, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::FindLast(Unit unit, uint32_t from) const {
    return OffsetOrNone<Unit>(View().rfind(unit, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::FindLast(UnitView text, uint32_t from) const {
    return OffsetOrNone<Unit>(View().rfind(text, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::FindFirstOf(UnitView set, uint32_t from) const {
    return OffsetOrNone<Unit>(View().find_first_of(set, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::FindFirstNotOf(UnitView set, uint32_t from) const {
    return OffsetOrNone<Unit>(View().find_first_not_of(set, from));
}

template <typename Unit>
uint32_t StringBase<Unit>::FindLastNotOf(UnitView set, uint32_t from) const {
    return OffsetOrNone<Unit>(View().find_last_not_of(set, from));
}

template class StringBase<char16_t>;
template class StringBase<char>;

}  // namespace qn::dsc
