#include "tests/support/german_host.h"

#include "platform/string_table.h"

void GermanHost::SetUp() {
    SetStringTableDirectory(QC_TEST_LOCALE_DIR);
    setenv("LC_ALL", "C.UTF-8", 1);
    setenv("LANGUAGE", "de", 1);
    std::setlocale(LC_ALL, "");
}
