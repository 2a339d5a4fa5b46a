#include "support/NativeProgram_windows.h"

#include <windows.h>

#include <algorithm>

namespace qn::dsc::osdep {

namespace {

// Wine splits at blanks and takes quotation marks away.
std::string Quoted(const std::string& argument) {
    return " \"" + argument + "\"";
}

}  // namespace

std::u16string Widened(const std::string& utf8) {
    std::u16string text(utf8.size(), u'\0');
    const int length = MultiByteToWideChar(CP_UTF8, 0, utf8.data(), static_cast<int>(utf8.size()), text.data(),
                                           static_cast<int>(text.size()));
    text.resize(static_cast<size_t>(length));
    return text;
}

std::string Narrowed(const std::u16string& text) {
    std::string utf8(3 * text.size(), '\0');
    const int length = WideCharToMultiByte(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), utf8.data(),
                                           static_cast<int>(utf8.size()), nullptr, nullptr);
    utf8.resize(static_cast<size_t>(length));
    return utf8;
}

std::string PathOutsideWine(const std::string& path) {
    using Translate = char*(__cdecl*)(const char16_t*);
    const FARPROC found = GetProcAddress(GetModuleHandleA("kernel32.dll"), "wine_get_unix_file_name");
    if (found == nullptr) {
        return path;
    }
    std::u16string wide = Widened(path);
    std::replace(wide.begin(), wide.end(), u'/', u'\\');
    char* const translated = reinterpret_cast<Translate>(reinterpret_cast<void*>(found))(wide.c_str());
    const std::string result = translated == nullptr ? path : translated;
    HeapFree(GetProcessHeap(), 0, translated);
    return result;
}

bool StartOutsideWine(const std::string& path, const std::vector<std::string>& arguments) {
    std::string line = path;
    for (const std::string& argument : arguments) {
        line += Quoted(argument);
    }
    std::u16string program = u"\\\\?\\unix" + Widened(path);
    std::replace(program.begin(), program.end(), u'/', u'\\');
    std::u16string wideLine = Widened(line);
    STARTUPINFOW start{};
    start.cb = sizeof start;
    PROCESS_INFORMATION process{};
    return CreateProcessW(program.c_str(), wideLine.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &start,
                          &process) != 0;
}

}  // namespace qn::dsc::osdep
