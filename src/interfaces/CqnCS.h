#pragma once

#include <memory>

#include "interfaces/CqnSyncObject.h"
#include "qn/dsc/osdep/CriticalSection.h"

namespace PartBin {

// A critical section: one thread at a time, which may take it again while it holds it. bad_alloc if it can't be made.
class CqnCS : public CqnSyncObject {
  public:
    CqnCS();
    ~CqnCS() override;

    // Waits for the section. Always true.
    bool Lock() override;

    // For each Lock once, on the same thread. Always true.
    bool Unlock() override;

  private:
    std::unique_ptr<qn::dsc::osdep::CriticalSection> section;
};

}  // namespace PartBin
