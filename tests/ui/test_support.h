// What the library's tests share: captured reports, child processes, paths.
#pragma once
#include "qordebug.h"

#include <string>
#include <vector>

namespace qortest {

// Captures every report of qordebug while it lives; reports don't reach stderr.
class CReportCapture {
public:
    struct SReport {
        qordebug::EReportKind m_kind;
        std::string m_text;
    };

    CReportCapture();
    ~CReportCapture();
    CReportCapture(CReportCapture const &) = delete;
    CReportCapture &operator=(CReportCapture const &) = delete;

    std::vector<SReport> const &reports() const { return m_reports; }
    // The texts of the reports of one kind, in order.
    std::vector<std::string> texts(qordebug::EReportKind _kind) const;
    void clear() { m_reports.clear(); }

private:
    static void on_report(qordebug::EReportKind _kind, char const *_text, void *_user);
    std::vector<SReport> m_reports;
    qordebug::report_handler_t mp_previous;
    void *mp_previous_user;
};

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
// A new empty folder under the system's temporary folder, removed with all it holds when the
// test process ends.
std::string make_temp_dir();
void write_file(std::string const &_path, std::string const &_content);
std::string read_file(std::string const &_path);

} // namespace qortest
