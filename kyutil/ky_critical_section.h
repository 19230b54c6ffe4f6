// The lock every container operation is bracketed by. The containers are used from one thread
// only, so locking and unlocking do nothing; the calls mark where a real lock would act.
#pragma once

class CKyCriticalSection {
public:
    CKyCriticalSection() = default;
    virtual ~CKyCriticalSection() = default;

    CKyCriticalSection(const CKyCriticalSection&) = delete;
    CKyCriticalSection& operator=(const CKyCriticalSection&) = delete;

    // Enters the section (does nothing here).
    virtual void Lock() {}
    // Leaves the section (does nothing here).
    virtual void Unlock() {}
};
