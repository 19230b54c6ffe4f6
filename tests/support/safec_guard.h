// Makes a refusal of the bounded memory and string library loud in tests: every constraint
// violation fails the running test, unless an ExpectSafecViolation guard is alive.
#pragma once

// Installs the failing constraint handler for both the memory and the string functions.
void InstallSafecGuard();

// While alive, violations are counted instead of failing the test (the innermost guard counts).
class ExpectSafecViolation {
public:
    ExpectSafecViolation();
    ~ExpectSafecViolation();
    ExpectSafecViolation(const ExpectSafecViolation&) = delete;
    ExpectSafecViolation& operator=(const ExpectSafecViolation&) = delete;

    // Violations seen while this guard was the innermost one.
    int Count() const { return m_nCount; }

private:
    friend void InstallSafecGuard();
    // The constraint handler: counts into the innermost guard, or fails the running test.
    static void OnViolation(const char* msg, void* ptr, int error);

    ExpectSafecViolation* m_pOuter;
    int m_nCount;
};
