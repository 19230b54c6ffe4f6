#include "tests/support/safec_guard.h"

#include <gtest/gtest.h>
#include <safeclib/safe_mem_lib.h>
#include <safeclib/safe_str_lib.h>

namespace {

ExpectSafecViolation* g_pInnermost = nullptr;

}  // namespace

void ExpectSafecViolation::OnViolation(const char* msg, void* /*ptr*/, int error) {
    if (g_pInnermost != nullptr) {
        ++g_pInnermost->m_nCount;
        return;
    }
    ADD_FAILURE() << "bounded library refused an operation: " << (msg ? msg : "(no message)")
                  << " (error " << error << ")";
}

void InstallSafecGuard() {
    set_mem_constraint_handler_s(ExpectSafecViolation::OnViolation);
    set_str_constraint_handler_s(ExpectSafecViolation::OnViolation);
}

ExpectSafecViolation::ExpectSafecViolation() : m_pOuter(g_pInnermost), m_nCount(0) {
    g_pInnermost = this;
}

ExpectSafecViolation::~ExpectSafecViolation() {
    g_pInnermost = m_pOuter;
}
