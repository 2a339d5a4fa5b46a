#include "hostbridge/ResourceLanguage.h"

#include "hostbridge/HostFunctions.h"
#include "hostbridge/RuntimeModule.h"

namespace zkhw {

using qn::dsc::String;

namespace {

struct Language {
    const char16_t* hostName;
    const char16_t* code;
};

constexpr Language languages[] = {{u"English", u"eng"}, {u"Japanese", u"jpn"}, {u"ChineseS", u"chs"}};

String AskHost() {
    unsigned char buffer[260] = {};
    HostGetLanguageName(buffer);
    return String(reinterpret_cast<const char*>(buffer + 1), buffer[0]);
}

void ChooseLanguage(String& chosen) {
    chosen = u"eng";
    if (FindRuntimeModule() == nullptr) {
        return;
    }
    const String hostName = AskHost();
    for (const Language& language : languages) {
        if (hostName == language.hostName) {
            chosen = language.code;
            return;
        }
    }
}

}  // namespace

const String& GetResourceLanguage() {
    static String resourceLanguage;
    if (resourceLanguage.IsEmpty()) {
        ChooseLanguage(resourceLanguage);
    }
    return resourceLanguage;
}

}  // namespace zkhw
