#include "tests/support/safec_guard.h"

#include <gtest/gtest.h>
#include <safeclib/safe_mem_lib.h>
#include <safeclib/safe_str_lib.h>

#include <string>

namespace {

ExpectSafecViolation* g_pInnermost = nullptr;

}  // namespace

void ExpectSafecViolation::OnViolation(const char* msg, void* /*ptr*/, int error) {
    const std::string text = msg != nullptr ? msg : "(no message)";
    if (g_pInnermost == nullptr) {
        ADD_FAILURE() << "bounded library refused an operation: " << text << " (error " << error
                      << ")";
        return;
    }
    ++g_pInnermost->m_nCount;
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
