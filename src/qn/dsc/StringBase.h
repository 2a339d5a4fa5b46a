#pragma once

// The text type of the whole system, in two instances: String (UTF-16 units, without any awareness of pairs) and
// NarrowString (bytes). A string is three pointers into one buffer of task memory that it alone owns, also when it is
// empty; there is no sharing and no small-buffer form, and every copy is deep. *End() is always NUL, so CStr() is a
// NUL-terminated text; NUL units may stand inside as well.
//
// A string that was moved from has no buffer. It may only be assigned, swapped or destroyed.
//
// Lengths and offsets count units and have 32 bits; npos, all ones, is "to the end", "not found" or "none".
// Failures: std::bad_alloc if there is no memory, exception::OutOfRange if a length does not fit 32 bits. Either leaves
// the string as it was. Distinct strings may be used on distinct threads.

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <string_view>
#include <type_traits>
#include <utility>

#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace qn::dsc {

template <typename Unit>
class StringBase {
    static_assert(std::same_as<Unit, char16_t> || std::same_as<Unit, char>);

  public:
    using OtherUnit = std::conditional_t<std::same_as<Unit, char16_t>, char, char16_t>;
    using UnitView = std::basic_string_view<Unit>;

    static constexpr uint32_t npos = 0xFFFFFFFF;

    // An empty text; it has a buffer like any other.
    StringBase() {
        begin = AllocateUnits(0);
        end = begin;
        capacityEnd = begin;
        *begin = Unit();
    }

    // A NUL-terminated text; null is the empty text.
    StringBase(const Unit* text) : StringBase(ViewOf(text)) {}
    StringBase(std::nullptr_t) : StringBase() {}

    // `length` units; a null `text` is the empty text.
    StringBase(const Unit* text, uint32_t length) { Create(text, text == nullptr ? 0 : length); }

    // The units from `first` up to, not including, `last`.
    template <typename Pointer>
    requires(std::is_pointer_v<Pointer>&& std::convertible_to<Pointer, const Unit*>)
        StringBase(const Unit* first, Pointer last)
        : StringBase(UnitView(first, static_cast<size_t>(last - first))) {}

    // `count` times `unit`.
    StringBase(uint32_t count, Unit unit);

    explicit StringBase(UnitView text) {
        if (text.size() > npos) [[unlikely]] {
            ThrowTooLong();
        }
        Create(text.data(), text.size());
    }

    // Converted by the system's default code page (osdep/AnsiToWide.h, osdep/WideToAnsi.h). A counted text ends at its
    // first NUL, if there is one. Null is the empty text.
    explicit StringBase(const OtherUnit* text);
    explicit StringBase(const OtherUnit* text, uint32_t length);
    explicit StringBase(const StringBase<OtherUnit>& text);

    StringBase(const StringBase& other) { Create(other.begin, other.Size()); }

    StringBase(StringBase&& other) noexcept : begin(other.begin), end(other.end), capacityEnd(other.capacityEnd) {
        other.begin = nullptr;
        other.end = nullptr;
        other.capacityEnd = nullptr;
    }

    // NOLINTNEXTLINE(bugprone-unhandled-self-assignment): the own text may be assigned, whole or in part.
    StringBase& operator=(const StringBase& other) {
        AssignUnits(other.begin, other.Size());
        return *this;
    }

    StringBase& operator=(StringBase&& other) noexcept {
        StringBase taken(std::move(other));
        Swap(taken);
        return *this;
    }

    StringBase& operator=(const Unit* text) {
        Assign(text);
        return *this;
    }

    ~StringBase() {
        if (begin != nullptr) {
            osdep::TaskMemFree(begin);
        }
        begin = nullptr;
    }

    // A string in the state of one that was moved from: for a place that is filled before it is read, without the cost
    // of an empty text's buffer.
    static StringBase WithoutBuffer() noexcept { return StringBase(Unfilled()); }

    uint32_t Length() const { return static_cast<uint32_t>(end - begin); }
    bool IsEmpty() const { return end == begin; }
    const Unit* CStr() const { return begin; }
    // The place of the terminating NUL.
    const Unit* End() const { return end; }
    // Not checked: `index` is at most the length, where the NUL is.
    Unit At(uint32_t index) const { return begin[index]; }
    UnitView View() const { return UnitView(begin, Size()); }
    // How many units the buffer can hold before it must grow.
    uint32_t Capacity() const { return static_cast<uint32_t>(capacityEnd - begin); }

    void Swap(StringBase& other) noexcept {
        std::swap(begin, other.begin);
        std::swap(end, other.end);
        std::swap(capacityEnd, other.capacityEnd);
    }
    friend void swap(StringBase& left, StringBase& right) noexcept { left.Swap(right); }

    // Replaces the text. The buffer stays if it is large enough and at least half of it will be filled; otherwise one
    // of the exact size takes its place. A null `text` is the empty text. A `text` that is this string's own CStr()
    // changes nothing, whatever the length; any other part of the own text may be assigned.
    void Assign(const Unit* text, uint32_t length) { AssignUnits(text, length); }
    void Assign(const Unit* text);
    void Assign(const StringBase& text) { AssignUnits(text.begin, text.Size()); }
    void Assign(UnitView text);

    // Appends; what is appended may be a part of this string. A buffer that is too small grows to twice the new length,
    // or to the new length if there is no memory for that: appends take linear time in all. OutOfRange if the new
    // length is 0x80000000 or more and the buffer would have to grow.
    void Append(UnitView text) {
        if (text.size() > Free()) [[unlikely]] {
            AppendGrowing(text);
            return;
        }
        PutAtEnd(text.data(), text.size());
    }
    void Append(const Unit* text) { Append(ViewOf(text)); }
    void Append(const StringBase& text) { Append(text.View()); }
    // `count` units of `text` from `offset` on. `count` is limited to the length of `text`, not to what follows
    // `offset`: units behind the end of `text` are appended as NUL.
    void Append(const StringBase& text, uint32_t offset, uint32_t count);
    void Append(uint32_t count, Unit unit);

    // Makes the capacity at least `capacity` units; never less than it is.
    void Reserve(uint32_t capacity);

    // A new text of both, in a buffer of the exact size. OutOfRange if it would be longer than 0xFFFFFFFF.
    static StringBase Concat(const StringBase& left, const StringBase& right) {
        return Concat({left.View(), right.View()});
    }
    static StringBase Concat(std::initializer_list<UnitView> parts);
    friend StringBase operator+(const StringBase& left, const StringBase& right) { return Concat(left, right); }
    friend StringBase operator+(const StringBase& left, const Unit* right) {
        return Concat({left.View(), ViewOf(right)});
    }
    friend StringBase operator+(const Unit* left, const StringBase& right) {
        return Concat({ViewOf(left), right.View()});
    }
    friend StringBase operator+(const StringBase& left, Unit right) {
        return Concat({left.View(), UnitView(&right, 1)});
    }

    // `count` units from `offset` on, limited to the end; npos: all. `offset` is not checked: it must be at most the
    // length. OutOfRange if `count` is not npos and offset + count does not fit 32 bits.
    StringBase Substring(uint32_t offset, uint32_t count = npos) const;

    // The same with a check: OutOfRange2 "String offset out of range" for an `offset` greater than the length.
    StringBase CheckedSubstring(uint32_t offset, uint32_t count = npos) const;

    // Removes `count` units from `offset` on, limited to the end. OutOfRange2 "String offset out of range" for an
    // `offset` greater than the length. With `shrink` the rule of Assign is applied to what remains.
    void Erase(uint32_t offset, uint32_t count, bool shrink);

    // Compare of CheckedSubstring(offset, count) with `textLength` units of `text` (npos: it is NUL-terminated),
    // without making the substring. Of String alone.
    int CompareSub(uint32_t offset, uint32_t count, const Unit* text, uint32_t textLength = npos) const;

    // The offset of the first occurrence at `from` or behind it; npos if there is none, always if `from` is not less
    // than the length. Exact units, no folding of case. An empty text is found at `from`. The time for a text is at
    // most the product of both lengths.
    uint32_t Find(Unit unit, uint32_t from = 0) const;
    uint32_t Find(UnitView text, uint32_t from = 0) const;
    uint32_t Find(const Unit* text, uint32_t from = 0) const { return Find(ViewOf(text), from); }
    uint32_t Find(const StringBase& text, uint32_t from = 0) const { return Find(text.View(), from); }

    // The offset of the last occurrence that begins at `from` or before it, npos if there is none. A `from` behind the
    // last offset at which it could stand means that one. Exact units.
    uint32_t FindLast(Unit unit, uint32_t from = npos) const;
    uint32_t FindLast(UnitView text, uint32_t from = npos) const;
    uint32_t FindLast(const Unit* text, uint32_t from = npos) const { return FindLast(ViewOf(text), from); }
    uint32_t FindLast(const StringBase& text, uint32_t from = npos) const { return FindLast(text.View(), from); }

    // The first offset, at `from` or behind it, of a unit that is (is not) one of `set`; npos if there is none. Exact
    // units; the time is at most the product of both lengths.
    uint32_t FindFirstOf(UnitView set, uint32_t from = 0) const;
    uint32_t FindFirstOf(const Unit* set, uint32_t from = 0) const { return FindFirstOf(ViewOf(set), from); }
    uint32_t FindFirstOf(const StringBase& set, uint32_t from = 0) const { return FindFirstOf(set.View(), from); }
    uint32_t FindFirstNotOf(UnitView set, uint32_t from = 0) const;
    uint32_t FindFirstNotOf(const Unit* set, uint32_t from = 0) const { return FindFirstNotOf(ViewOf(set), from); }
    uint32_t FindFirstNotOf(const StringBase& set, uint32_t from = 0) const { return FindFirstNotOf(set.View(), from); }

    // The last offset, at `from` or before it, of a unit that is not one of `set`; npos if there is none. A `from`
    // behind the last offset means that one.
    uint32_t FindLastNotOf(UnitView set, uint32_t from = npos) const;
    uint32_t FindLastNotOf(const Unit* set, uint32_t from = npos) const { return FindLastNotOf(ViewOf(set), from); }
    uint32_t FindLastNotOf(const StringBase& set, uint32_t from = npos) const {
        return FindLastNotOf(set.View(), from);
    }

    // The text that `length` bytes of UTF-8 stand for, by the rules of Utf8ToWide.h, in a buffer of the exact size.
    // exception::InvalidSequence if they are not such text. Null `bytes`: the empty text. Of String alone, both.
    static StringBase FromUtf8(const char* bytes, uint32_t length);

    // The same into `text`, by the rule of Assign. False, and `text` is as it was, if the bytes are not such text.
    static bool TryFromUtf8(const char* bytes, uint32_t length, StringBase& text);

  private:
    struct Unfilled {};
    explicit StringBase(Unfilled) noexcept : begin(nullptr), end(nullptr), capacityEnd(nullptr) {}

    static UnitView ViewOf(const Unit* text) { return text == nullptr ? UnitView() : UnitView(text); }

    [[noreturn]] static void ThrowNoMemory();
    [[noreturn]] static void ThrowTooLong();

    // A block for `count` units and the NUL.
    static Unit* AllocateUnits(size_t count) {
        void* block = osdep::TaskMemAlloc((count + 1) * sizeof(Unit));
        if (block == nullptr) [[unlikely]] {
            ThrowNoMemory();
        }
        return static_cast<Unit*>(block);
    }

    // The fields are not set before; `text` may be null if `count` is 0.
    void Create(const Unit* text, size_t count) {
        begin = AllocateUnits(count);
        if (count != 0) {
            std::memcpy(begin, text, count * sizeof(Unit));
        }
        SetFull(begin, count);
    }

    void SetFull(Unit* block, size_t count) {
        begin = block;
        end = block + count;
        capacityEnd = end;
        *end = Unit();
    }

    size_t Size() const { return static_cast<size_t>(end - begin); }
    size_t Free() const { return static_cast<size_t>(capacityEnd - end); }

    // Whether the buffer stays for a text of `count` units. A string without a buffer never keeps it.
    bool KeepsBuffer(size_t count) const {
        const size_t capacity = static_cast<size_t>(capacityEnd - begin);
        return count <= capacity && 2 * count >= capacity && begin != nullptr;
    }

    void PutAtEnd(const Unit* text, size_t count) {
        if (count != 0) {
            // The source may be this text together with its NUL, which is where the copy begins.
            std::memmove(end, text, count * sizeof(Unit));
            end += count;
            *end = Unit();
        }
    }

    void AssignUnits(const Unit* text, size_t length);
    void AppendGrowing(UnitView text);
    void Grow(size_t count);
    void ReplaceBuffer(Unit* block, size_t count);
    UnitView SubView(uint32_t offset, uint32_t count) const;
    void RequireOffset(uint32_t offset) const;

    Unit* begin;
    // The terminating NUL.
    Unit* end;
    // The last usable unit: where the NUL stands when the buffer is full.
    Unit* capacityEnd;
};

using String = StringBase<char16_t>;
using NarrowString = StringBase<char>;

static_assert(sizeof(String) == 3 * sizeof(void*) && sizeof(NarrowString) == 3 * sizeof(void*));

template <>
StringBase<char16_t>::StringBase(const char* text);
template <>
StringBase<char16_t>::StringBase(const char* text, uint32_t length);
template <>
StringBase<char16_t>::StringBase(const NarrowString& text);
template <>
StringBase<char>::StringBase(const char16_t* text);
template <>
StringBase<char>::StringBase(const char16_t* text, uint32_t length);
template <>
StringBase<char>::StringBase(const String& text);
template <>
int StringBase<char16_t>::CompareSub(uint32_t offset, uint32_t count, const char16_t* text, uint32_t textLength) const;
template <>
String StringBase<char16_t>::FromUtf8(const char* bytes, uint32_t length);
template <>
bool StringBase<char16_t>::TryFromUtf8(const char* bytes, uint32_t length, String& text);

extern template class StringBase<char16_t>;
extern template class StringBase<char>;

// Order and equality are those of osdep/Compare.h: blind to letter case and by the user's language. == says nothing
// about the units themselves. Null is the empty text.
inline int Compare(const String& left, const String& right) {
    return osdep::Compare(left.View(), right.View());
}
inline int Compare(const String& left, const char16_t* right) {
    return osdep::Compare(left.View(), right == nullptr ? std::u16string_view() : std::u16string_view(right));
}

inline bool operator==(const String& left, const String& right) {
    return osdep::Equal(left.View(), right.View());
}
// Templates, so that a view is not made a String to be compared so: views compare by their units.
template <std::same_as<String> T>
bool operator==(const T& left, std::u16string_view right) {
    return osdep::Equal(left.View(), right);
}
template <std::same_as<String> T>
bool operator==(const T& left, const char16_t* right) {
    return Compare(left, right) == 0;
}

inline bool operator<(const String& left, const String& right) {
    return osdep::Compare(left.View(), right.View()) < 0;
}
template <std::same_as<String> T>
bool operator<(const T& left, const char16_t* right) {
    return Compare(left, right) < 0;
}
template <std::same_as<String> T>
bool operator<(const char16_t* left, const T& right) {
    return Compare(right, left) > 0;
}

}  // namespace qn::dsc
