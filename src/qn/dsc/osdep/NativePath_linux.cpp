#include "qn/dsc/osdep/NativePath.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>

#include "qn/dsc/osdep/NativeFolder_linux.h"
#include "qn/dsc/osdep/NativeText.h"
#include "qn/dsc/osdep/path.h"

namespace qn::dsc::osdep {

namespace {

constexpr char16_t nativeBackslash = 0xF05C;

bool IsSeparator(char16_t unit) {
    return unit == u'\\' || unit == u'/';
}

bool IsLetter(char16_t unit) {
    return (unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z');
}

bool StartsWithDrive(std::u16string_view path) {
    return path.size() >= 2 && IsLetter(path[0]) && path[1] == u':';
}

bool StartsWithTwoLetterDrive(std::u16string_view path) {
    return path.size() >= 4 && IsLetter(path[0]) && IsLetter(path[1]) && path[2] == u':' && IsSeparator(path[3]);
}

bool IsNetworkPath(std::u16string_view path) {
    return path.size() >= 2 && IsSeparator(path[0]) && IsSeparator(path[1]);
}

void AppendNameBytes(std::u16string_view name, std::string& bytes) {
    std::u16string exchanged;
    if (name.find(nativeBackslash) != std::u16string_view::npos) {
        exchanged = name;
        for (char16_t& unit : exchanged) {
            unit = unit == nativeBackslash ? u'\\' : unit;
        }
        name = exchanged;
    }
    const size_t start = bytes.size();
    bytes.resize(start + 3 * name.size());
    bytes.resize(start + UnitsToNative(name, bytes.data() + start));
}

// Goes one name further down, or up for "..".
void Step(std::u16string_view name, NativePath& native) {
    if (name.empty() || name == u".") {
        return;
    }
    if (name == u"..") {
        const size_t slash = native.text.rfind('/');
        native.text.resize(slash == std::string::npos ? 0 : slash);
        return;
    }
    native.text.push_back('/');
    AppendNameBytes(name, native.text);
}

std::string_view LastNameOf(const std::string& path) {
    return std::string_view(path).substr(path.rfind('/') + 1);
}

// Steps through all names of `path` and notes the last one.
void StepThrough(std::u16string_view path, NativePath& native) {
    std::u16string_view last;
    size_t start = 0;
    while (start < path.size()) {
        size_t end = start;
        while (end < path.size() && !IsSeparator(path[end])) {
            ++end;
        }
        const std::u16string_view name = path.substr(start, end - start);
        Step(name, native);
        last = name.empty() ? last : name;
        start = end + 1;
    }
    if (last == u"." || last == u"..") {
        AppendNameUnits(LastNameOf(native.text), native.lastName);
    } else {
        native.lastName = last;
    }
}

}  // namespace

void AppendNameUnits(std::string_view name, std::u16string& units) {
    const size_t start = units.size();
    units.resize(start + name.size());
    units.resize(start + NativeToUnits(name, units.data() + start));
    for (size_t i = start; i < units.size(); ++i) {
        units[i] = units[i] == u'\\' ? nativeBackslash : units[i];
    }
}

String SystemPathFromNative(std::string_view native) {
    const bool isAbsolute = !native.empty() && native.front() == '/';
    std::u16string system;
    size_t start = 0;
    while (start < native.size()) {
        const size_t end = std::min(native.find('/', start), native.size());
        if (end > start) {
            if (isAbsolute || !system.empty()) {
                system.push_back(u'\\');
            }
            AppendNameUnits(native.substr(start, end - start), system);
        }
        start = end + 1;
    }
    if (isAbsolute && system.empty()) {
        return String(u"C:\\");
    }
    if (!system.empty() && native.back() == '/') {
        system.push_back(u'\\');
    }
    const String result{std::u16string_view(system)};
    if (isAbsolute) {
        return u"C:" + result;
    }
    return IsAbsolutePath(result) ? u".\\" + result : result;
}

int MakeNativePath(const String& path, NativePath& native) {
    std::u16string_view rest = path.View();
    rest = rest.substr(0, rest.find(u'\0'));
    if (rest.empty() || IsNetworkPath(rest) || StartsWithTwoLetterDrive(rest)) {
        return ENOENT;
    }
    if (rest.size() > longestSystemPath) {
        return ENAMETOOLONG;
    }
    if (StartsWithDrive(rest)) {
        if (rest[0] != u'C' && rest[0] != u'c') {
            return ENOENT;
        }
        rest.remove_prefix(2);
    }
    native = NativePath();
    if (rest.empty() || !IsSeparator(rest.front())) {
        const int error = ReadNativeWorkingFolder(native.text);
        if (error != 0) {
            return error;
        }
        // The root is the empty text until the end, as every step brings its slash.
        native.text.resize(native.text == "/" ? 0 : native.text.size());
    }
    StepThrough(rest, native);
    if (native.text.empty()) {
        native.text.push_back('/');
        native.lastName.clear();
    } else {
        native.endsInSeparator = !rest.empty() && IsSeparator(rest.back());
    }
    return 0;
}

}  // namespace qn::dsc::osdep
