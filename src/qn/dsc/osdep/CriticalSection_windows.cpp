#include <windows.h>

#include "qn/dsc/osdep/CriticalSection.h"

namespace qn::dsc::osdep {

struct CriticalSection::System {
    System() { InitializeCriticalSection(&section); }
    ~System() { DeleteCriticalSection(&section); }
    System(const System&) = delete;
    System& operator=(const System&) = delete;

    CRITICAL_SECTION section;
};

CriticalSection::CriticalSection() : system(std::make_unique<System>()) {}

CriticalSection::~CriticalSection() = default;

void CriticalSection::Enter() {
    EnterCriticalSection(&system->section);
}

void CriticalSection::Leave() {
    LeaveCriticalSection(&system->section);
}

}  // namespace qn::dsc::osdep
