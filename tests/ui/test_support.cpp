#include "test_support.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <sys/wait.h>
#include <unistd.h>

namespace qortest {

CReportCapture::CReportCapture() : mp_previous(nullptr), mp_previous_user(nullptr) {
    qordebug::set_report_handler(on_report, this, false, &mp_previous, &mp_previous_user);
}

CReportCapture::~CReportCapture() {
    qordebug::set_report_handler(mp_previous, mp_previous_user);
}

void CReportCapture::on_report(qordebug::EReportKind _kind, char const *_text, void *_user) {
    static_cast<CReportCapture *>(_user)->m_reports.push_back({_kind, _text ? _text : ""});
}

std::vector<std::string> CReportCapture::texts(qordebug::EReportKind _kind) const {
    std::vector<std::string> result;
    for (SReport const &report : m_reports)
        if (report.m_kind == _kind) result.push_back(report.m_text);
    return result;
}

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

namespace {

// The folders of make_temp_dir, removed when the test process ends (a forked child leaves by
// _exit and removes nothing).
std::vector<std::string> &temp_dirs() {
    static std::vector<std::string> *sp_dirs = [] {
        std::atexit([] {
            for (std::string const &dir : *sp_dirs)
                std::filesystem::remove_all(dir);
        });
        return new std::vector<std::string>;
    }();
    return *sp_dirs;
}

} // namespace

std::string make_temp_dir() {
    char pattern[] = "/tmp/qorui_test_XXXXXX";
    char *dir = mkdtemp(pattern);
    if (!dir) {
        ADD_FAILURE() << "mkdtemp failed";
        return "/tmp";
    }
    temp_dirs().push_back(dir);
    return dir;
}

void write_file(std::string const &_path, std::string const &_content) {
    std::ofstream out(_path, std::ios::binary);
    out << _content;
}

std::string read_file(std::string const &_path) {
    std::ifstream in(_path, std::ios::binary);
    std::stringstream content;
    content << in.rdbuf();
    return content.str();
}

} // namespace qortest
