// Child processes of the build and the paths of the tree, for the library's tests.
#include "test_support.h"

#include <cstdio>
#include <cstdlib>
#include <sys/wait.h>
#include <unistd.h>

namespace qortest {

std::string bin_dir() {
    char path[4096];
    ssize_t const length = readlink("/proc/self/exe", path, sizeof(path) - 1);
    if (length <= 0) return ".";
    std::string exe(path, static_cast<size_t>(length));
    return exe.substr(0, exe.rfind('/'));
}

std::string source_dir() {
    char const *dir = getenv("QOR_SOURCE_DIR");
#ifdef QOR_SOURCE_DIR
    if (!dir) dir = QOR_SOURCE_DIR;
#endif
    return dir ? dir : ".";
}

SChildResult run_child(std::string const &_program, std::vector<std::string> const &_environment,
                       std::vector<std::string> const &_arguments) {
    std::string const output_path = make_temp_dir() + "/output.txt";
    pid_t const pid = fork();
    if (pid == 0) {
        FILE *out = freopen(output_path.c_str(), "w", stdout);
        if (!out) _exit(127);
        dup2(fileno(stdout), fileno(stderr));
        for (std::string const &entry : _environment)
            putenv(const_cast<char *>(entry.c_str()));
        std::string const path = bin_dir() + "/" + _program;
        std::vector<char *> argv;
        argv.push_back(const_cast<char *>(path.c_str()));
        for (std::string const &argument : _arguments)
            argv.push_back(const_cast<char *>(argument.c_str()));
        argv.push_back(nullptr);
        execv(path.c_str(), argv.data());
        _exit(127);
    }
    int status = 0;
    waitpid(pid, &status, 0);
    SChildResult result;
    result.m_exit_code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    result.m_output = read_file(output_path);
    return result;
}

} // namespace qortest
