#include "interfaces/CqnCS.h"

namespace PartBin {

namespace {

// One for the process, from its start to its end. The tree and its objects are for one thread at a time and don't take
// it.
CqnCS processSection;

}  // namespace

CqnCS::CqnCS() : section(std::make_unique<qn::dsc::osdep::CriticalSection>()) {}

CqnCS::~CqnCS() = default;

bool CqnCS::Lock() {
    section->Enter();
    return true;
}

bool CqnCS::Unlock() {
    section->Leave();
    return true;
}

}  // namespace PartBin
