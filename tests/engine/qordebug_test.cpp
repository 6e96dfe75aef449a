// qordebug: formatted reports to the handler and to stderr, the counts per kind, and that no kind
// of report ends the process.
#include "qordebug.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <utility>
#include <vector>

using namespace qordebug;

namespace {

typedef std::vector<std::pair<EReportKind, std::string>> report_list_t;

void capture(EReportKind _kind, char const *_text, void *_user) {
    static_cast<report_list_t *>(_user)->emplace_back(_kind, _text);
}

void ignore(EReportKind, char const *, void *) {}

// Captures every report of a test and puts the previous handler back afterwards.
class QordebugTest : public testing::Test {
protected:
    void SetUp() override { set_report_handler(capture, &m_reports, false, &mp_previous, &mp_previous_user); }
    void TearDown() override { set_report_handler(mp_previous, mp_previous_user, mp_previous == nullptr); }

    report_list_t m_reports;
    report_handler_t mp_previous = nullptr;
    void *mp_previous_user = nullptr;
};

} // namespace

TEST_F(QordebugTest, HandlerReceivesTheFormattedTextOfEachKind) {
    unsigned const asserts = report_count(REPORT_ASSERT);
    unsigned const warnings = report_count(REPORT_WARNING);
    unsigned const errors = report_count(REPORT_ERROR);

    assert_func("%s failed at %d", "index < count", 42);
    warning("file '%s' is broken", "layout.lua");
    error("%u%%", 100u);

    report_list_t const expected = {{REPORT_ASSERT, "index < count failed at 42"},
                                    {REPORT_WARNING, "file 'layout.lua' is broken"},
                                    {REPORT_ERROR, "100%"}};
    EXPECT_EQ(expected, m_reports);
    EXPECT_EQ(asserts + 1, report_count(REPORT_ASSERT));
    EXPECT_EQ(warnings + 1, report_count(REPORT_WARNING));
    EXPECT_EQ(errors + 1, report_count(REPORT_ERROR));
}

TEST_F(QordebugTest, TextIsCutToTheBufferAndHandlersHandTheirPredecessorBack) {
    warning("%s", std::string(10000, 'x').c_str());
    ASSERT_EQ(1u, m_reports.size());
    EXPECT_EQ(std::string(4095, 'x'), m_reports[0].second);   // 4 KiB with its terminator
    EXPECT_EQ(0u, report_count(static_cast<EReportKind>(3))); // no kind outside the three

    int user = 0;
    report_handler_t previous = nullptr;
    void *previous_user = nullptr;
    set_report_handler(ignore, &user, false, &previous, &previous_user);
    EXPECT_EQ(&capture, previous);
    EXPECT_EQ(&m_reports, previous_user);
    set_report_handler(nullptr, nullptr, false, &previous, &previous_user);
    EXPECT_EQ(&ignore, previous);
    set_report_handler(nullptr, nullptr, false, &previous, &previous_user);
    EXPECT_EQ(nullptr, previous); // the default has no handler
    EXPECT_EQ(nullptr, previous_user);
}

// Each runs in a child, where stderr is what the reports wrote and nothing else.
TEST_F(QordebugTest, DefaultWritesEachKindWithItsPrefixAndReturns) {
    EXPECT_EXIT(
        {
            set_report_handler(nullptr, nullptr);
            assert_func("a");
            warning("w");
            error("cannot find %s", "interface");
            exit(7);
        },
        testing::ExitedWithCode(7), "^\\[assert\\] a\n\\[warning\\] w\n\\[error\\] cannot find interface\n$");
}

// A handler keeps stderr quiet unless it asks for the echo.
TEST_F(QordebugTest, AHandlerEchoesToStderrOnlyWhenAsked) {
    EXPECT_EXIT(
        {
            warning("hidden");
            set_report_handler(capture, &m_reports, true);
            warning("shown");
            exit(m_reports.size() == 2 ? 0 : 1);
        },
        testing::ExitedWithCode(0), "^\\[warning\\] shown\n$");
}
