#pragma once

// A lock of the operating system for the threads of one process. The thread that holds it may enter again.

#include <memory>

namespace qn::dsc::osdep {

class CriticalSection {
  public:
    // bad_alloc if the system can't make one.
    CriticalSection();

    // Nobody may hold it.
    ~CriticalSection();
    CriticalSection(const CriticalSection&) = delete;
    CriticalSection& operator=(const CriticalSection&) = delete;

    // Waits until no other thread holds it.
    void Enter();

    // For each Enter once, on the thread that entered.
    void Leave();

  private:
    struct System;
    std::unique_ptr<System> system;
};

}  // namespace qn::dsc::osdep
