// The time profiler on a clock the test holds: nesting by call order, the ring of 64 samples, and
// the dump's columns.
#include "ui_time_profiler.h"

#include "qor_platform.h"
#include "ui.h"
#include "ui_stats_page.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class TimeProfilerTest : public ::testing::Test {
protected:
    void SetUp() override { qorplatform::set_clock(&m_clock); }
    void TearDown() override { qorplatform::set_clock(nullptr); }
    void measure(CTimeProfilerNode *_p_node, uint32_t _ms) {
        m_profiler.begin(_p_node);
        m_clock.advance_ms(_ms);
        m_profiler.end();
    }

    qorplatform::CManualClock m_clock;
    CTimeProfiler m_profiler;
};

} // namespace

TEST_F(TimeProfilerTest, DisabledKeepsNestingThenTheMeanIsOfTheLast64SamplesAndTheTotalOfAll) {
    CTimeProfilerNode *p_node = m_profiler.create_node("frame");
    m_profiler.begin(p_node);
    CTimeProfilerNode *p_inner = m_profiler.create_node("inner"); // made while frame is open
    m_clock.advance_ms(5);
    m_profiler.end();
    m_profiler.end(); // an end with an empty stack does nothing
    EXPECT_TRUE(m_profiler.create_node("next")->m_children.empty());
    ASSERT_EQ(1u, p_node->m_children.size());
    EXPECT_EQ(p_inner, &p_node->m_children.front());
    EXPECT_EQ(0, p_node->m_total_us); // disabled: no time taken
    m_profiler.enable();
    measure(p_node, 59); // falls out of the ring below
    for (int i = 0; i < 64; ++i)
        measure(p_node, 1 + i % 2);
    EXPECT_EQ(64, p_node->m_count);
    EXPECT_EQ(1500, p_node->m_average_us);
    EXPECT_EQ(155000, p_node->m_total_us);
}

TEST_F(TimeProfilerTest, DumpPutsTheNumbersAtColumn65) {
    CUserInterface service;
    IStatsPage *p_page = service.create_stats_page("profiler");
    m_profiler.enable();
    CTimeProfilerNode *p_frame = m_profiler.create_node("frame");
    m_profiler.begin(p_frame);
    measure(m_profiler.create_node("draw"), 2);
    m_clock.advance_ms(2);
    m_profiler.end();
    std::string const long_name = "a_name_of_seventy_characters_that_leaves_no_room_for_dots_at_all_0123456";
    m_profiler.create_node(long_name.c_str());
    m_profiler.dump(p_page, 0);
    std::string lines;
    for (unsigned i = 0; i < 3; ++i) {
        std::string const text = static_cast<CStatsPage *>(p_page)->get_text().get_string(i)->get_c();
        lines += text.substr(text.find('>') + 1) + "\n";
    }
    // The next root follows its predecessor's subtree; a name that reaches column 65 is cut there.
    EXPECT_EQ("frame" + std::string(60, '.') + " 4.000, 4.000\n draw" + std::string(60, '.') +
                  " 2.000, 2.000\n" + long_name.substr(0, 65) + " 0.000, 0.000\n",
              lines);
}
