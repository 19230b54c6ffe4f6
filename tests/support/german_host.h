// A fixture for tests that play a German host: the host owns the locale and picks German
// through LANGUAGE, and the component's strings come from a small German table.
#pragma once

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>

class GermanHost : public ::testing::Test {
protected:
    void SetUp() override;
    void TearDown() override {
        unsetenv("LANGUAGE");
        unsetenv("LC_ALL");
        std::setlocale(LC_ALL, "C");
    }
};
