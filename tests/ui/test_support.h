// What the library's tests share beyond the common helpers: child processes and paths.
#pragma once
#include "test_common.h"

#include <string>
#include <vector>

namespace qortest {

struct SChildResult {
    int m_exit_code;      // -1 if it didn't exit normally
    std::string m_output; // stdout and stderr together
};

// Runs a program of the build's bin folder with extra environment entries ("NAME=value") and
// arguments, and waits for it.
SChildResult run_child(std::string const &_program, std::vector<std::string> const &_environment,
                       std::vector<std::string> const &_arguments = {});

// The folder of the running test program, where every module of the build lies.
std::string bin_dir();
// The source tree (data/, tests/golden/).
std::string source_dir();

} // namespace qortest
