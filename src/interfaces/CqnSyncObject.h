#pragma once

#include <cstdint>

namespace PartBin {

// A lock. Its flag is the owner's to use; nothing here reads it.
class CqnSyncObject {
  public:
    CqnSyncObject() = default;
    CqnSyncObject(const CqnSyncObject&) = delete;
    CqnSyncObject& operator=(const CqnSyncObject&) = delete;
    virtual ~CqnSyncObject() = default;

    // Stores the value, and gives it back.
    virtual uint8_t SetFlag(uint8_t value) { return flag = value; }

    // True when the lock is held, or given back.
    virtual bool Lock() = 0;
    virtual bool Unlock() = 0;

  protected:
    uint8_t flag = 0;
};

}  // namespace PartBin
