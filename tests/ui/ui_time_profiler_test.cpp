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

    // One measurement of _ms milliseconds.
    void measure(CTimeProfilerNode *_p_node, uint32_t _ms) {
        m_profiler.begin(_p_node);
        m_clock.advance_ms(_ms);
        m_profiler.end();
    }
    // A line of a page without the colour tag that starts every printed line.
    static std::string line(IStatsPage *_p_page, unsigned _idx) {
        std::string const text = static_cast<CStatsPage *>(_p_page)->get_text().get_string(_idx)->get_c();
        return text.substr(text.empty() ? 0 : text.find('>') + 1);
    }

    qorplatform::CManualClock m_clock;
    CTimeProfiler m_profiler;
    CUserInterface m_service;
};

} // namespace

TEST_F(TimeProfilerTest, MeanOfTheLast64SamplesAndTotalOfAll) {
    m_profiler.enable();
    CTimeProfilerNode *p_node = m_profiler.create_node("frame");
    measure(p_node, 1);
    measure(p_node, 2);
    measure(p_node, 3);
    EXPECT_EQ(2000, p_node->m_average_us);
    EXPECT_EQ(6000, p_node->m_total_us);
    measure(p_node, 59); // falls out of the ring below
    for (int i = 0; i < 64; ++i)
        measure(p_node, 1);
    EXPECT_EQ(64, p_node->m_count);
    EXPECT_EQ(1000, p_node->m_average_us);
    EXPECT_EQ(129000, p_node->m_total_us);
}

TEST_F(TimeProfilerTest, DisabledKeepsNestingButTakesNoTime) {
    CTimeProfilerNode *p_outer = m_profiler.create_node("outer");
    m_profiler.begin(p_outer);
    CTimeProfilerNode *p_inner = m_profiler.create_node("inner"); // made while outer is open
    m_clock.advance_ms(5);
    m_profiler.end();
    m_profiler.end(); // an end with an empty stack does nothing
    CTimeProfilerNode *p_next = m_profiler.create_node("next");
    ASSERT_EQ(1u, p_outer->m_children.size());
    EXPECT_EQ(p_inner, &p_outer->m_children.front());
    EXPECT_TRUE(p_next->m_children.empty());
    EXPECT_EQ(0, p_outer->m_count);
    EXPECT_EQ(0, p_outer->m_total_us);
}

TEST_F(TimeProfilerTest, DumpPutsTheNumbersAtColumn65) {
    IStatsPage *p_page = m_service.create_stats_page("profiler");
    m_profiler.dump(p_page, 0);
    EXPECT_EQ("", line(p_page, 0)); // no nodes: nothing
    m_profiler.enable();
    CTimeProfilerNode *p_frame = m_profiler.create_node("frame");
    m_profiler.begin(p_frame);
    measure(m_profiler.create_node("draw"), 2);
    m_clock.advance_ms(2);
    m_profiler.end();
    std::string const long_name = "a_name_of_seventy_characters_that_leaves_no_room_for_dots_at_all_0123456";
    m_profiler.create_node(long_name.c_str());
    m_profiler.dump(p_page, 0);
    EXPECT_EQ("frame" + std::string(60, '.') + " 4.000, 4.000", line(p_page, 0));
    EXPECT_EQ(" draw" + std::string(60, '.') + " 2.000, 2.000", line(p_page, 1));
    // The next root follows its predecessor's subtree; a name that reaches column 65 is cut there.
    EXPECT_EQ(long_name.substr(0, 65) + " 0.000, 0.000", line(p_page, 2));
}
