// What every test program of the project shares: captured reports and temporary folders with
// their files. Header-only, so that the engine's, the host's, the library's and the tools' tests
// include it alike.
#pragma once
#include "qordebug.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace qortest {

// ---------------------------------------------------------------------------------------------
// Reports
// ---------------------------------------------------------------------------------------------

// Captures every report of qordebug while it lives; reports don't reach stderr.
class CReportCapture {
public:
    struct SReport {
        qordebug::EReportKind m_kind;
        std::string m_text;
    };

    CReportCapture() {
        qordebug::set_report_handler(on_report, this, false, &mp_previous, &mp_previous_user);
    }
    ~CReportCapture() { qordebug::set_report_handler(mp_previous, mp_previous_user); }
    CReportCapture(CReportCapture const &) = delete;
    CReportCapture &operator=(CReportCapture const &) = delete;

    std::vector<SReport> const &reports() const { return m_reports; }
    // The texts of the reports of one kind, in order.
    std::vector<std::string> texts(qordebug::EReportKind _kind) const {
        std::vector<std::string> result;
        for (SReport const &report : m_reports)
            if (report.m_kind == _kind) result.push_back(report.m_text);
        return result;
    }
    std::vector<std::string> warnings() const { return texts(qordebug::REPORT_WARNING); }
    std::vector<std::string> asserts() const { return texts(qordebug::REPORT_ASSERT); }
    std::vector<std::string> errors() const { return texts(qordebug::REPORT_ERROR); }
    void clear() { m_reports.clear(); }

private:
    static void on_report(qordebug::EReportKind _kind, char const *_text, void *_user) {
        static_cast<CReportCapture *>(_user)->m_reports.push_back({_kind, _text ? _text : ""});
    }

    std::vector<SReport> m_reports;
    qordebug::report_handler_t mp_previous = nullptr;
    void *mp_previous_user = nullptr;
};

// ---------------------------------------------------------------------------------------------
// Temporary folders and files
// ---------------------------------------------------------------------------------------------

// The folders of make_temp_dir, removed when the test process ends (a forked child leaves by
// _exit and removes nothing).
inline std::vector<std::string> &temp_dirs() {
    static std::vector<std::string> *sp_dirs = [] {
        std::atexit([] {
            std::error_code ignored;
            for (std::string const &dir : *sp_dirs)
                std::filesystem::remove_all(dir, ignored);
        });
        return new std::vector<std::string>;
    }();
    return *sp_dirs;
}

// A new empty folder under the system's temporary folder, removed with all it holds when the
// test process ends.
inline std::string make_temp_dir() {
    std::string pattern = (std::filesystem::temp_directory_path() / "qortest_XXXXXX").string();
    if (!mkdtemp(pattern.data())) {
        ADD_FAILURE() << "mkdtemp failed";
        return std::filesystem::temp_directory_path().string();
    }
    temp_dirs().push_back(pattern);
    return pattern;
}

// Writes a file, making its folders; the result is its path.
inline std::string write_file(std::string const &_path, std::string const &_content) {
    std::filesystem::path const path(_path);
    std::error_code ignored;
    if (path.has_parent_path()) std::filesystem::create_directories(path.parent_path(), ignored);
    std::ofstream out(_path, std::ios::binary);
    out << _content;
    return _path;
}

// The file's bytes; empty when it can't be read.
inline std::string read_file(std::string const &_path) {
    std::ifstream in(_path, std::ios::binary);
    std::stringstream content;
    content << in.rdbuf();
    return content.str();
}

} // namespace qortest
