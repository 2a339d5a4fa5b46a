#include <mutex>

#include "qn/dsc/osdep/CriticalSection.h"

namespace qn::dsc::osdep {

struct CriticalSection::System {
    std::recursive_mutex mutex;
};

CriticalSection::CriticalSection() : system(std::make_unique<System>()) {}

CriticalSection::~CriticalSection() = default;

void CriticalSection::Enter() {
    system->mutex.lock();
}

void CriticalSection::Leave() {
    system->mutex.unlock();
}

}  // namespace qn::dsc::osdep
