// The time profiler: nesting by call order, the ring of 64 samples, and the dump's columns.
#include "ui_time_profiler.h"

#include "qor_platform.h"
#include "ui.h"
#include "ui_stats_page.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

class TimeProfilerTest : public ::testing::Test {
protected:
    void SetUp() override { qorplatform::set_clock(&m_clock); }
    void TearDown() override { qorplatform::set_clock(nullptr); }

    // One measurement of _ms milliseconds on the clock the test holds.
    void measure(CTimeProfilerNode *_p_node, uint32_t _ms) {
        m_profiler.begin(_p_node);
        m_clock.advance_ms(_ms);
        m_profiler.end();
    }

    // The narrow text of a line of a page made by the service.
    std::string line(IStatsPage *_p_page, unsigned _idx) {
        CString const *p_line = static_cast<CStatsPage *>(_p_page)->get_text().get_string(_idx);
        std::string text = p_line ? p_line->get_c() : "";
        // Every printed line starts with the page's colour tag.
        std::string const tag = "<color 255 255 255 255>";
        return text.compare(0, tag.size(), tag) == 0 ? text.substr(tag.size()) : text;
    }

    qorplatform::CManualClock m_clock;
    CTimeProfiler m_profiler;
    CUserInterface m_service;
};

} // namespace

TEST_F(TimeProfilerTest, MeanAndTotalOfThreeMeasurements) {
    m_profiler.enable();
    CTimeProfilerNode *p_node = m_profiler.create_node("frame");
    measure(p_node, 1);
    measure(p_node, 2);
    measure(p_node, 3);
    EXPECT_EQ(2000, p_node->m_average_us);
    EXPECT_EQ(6000, p_node->m_total_us);
    EXPECT_EQ(3, p_node->m_count);
}

TEST_F(TimeProfilerTest, RingKeepsTheLast64Samples) {
    m_profiler.enable();
    CTimeProfilerNode *p_node = m_profiler.create_node("frame");
    measure(p_node, 65); // the one that falls out of the ring
    for (int i = 0; i < 64; ++i)
        measure(p_node, 1);
    EXPECT_EQ(64, p_node->m_count);
    EXPECT_EQ(1000, p_node->m_average_us);
    EXPECT_EQ(64 * 1000000, p_node->m_sum); // counter ticks are nanoseconds here
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
    EXPECT_EQ(nullptr, m_profiler.get_root());
}

TEST_F(TimeProfilerTest, DumpPutsTheNumbersAtColumn65) {
    m_profiler.enable();
    CTimeProfilerNode *p_frame = m_profiler.create_node("frame");
    m_profiler.begin(p_frame);
    CTimeProfilerNode *p_draw = m_profiler.create_node("draw");
    measure(p_draw, 2);
    m_clock.advance_ms(2);
    m_profiler.end();
    CTimeProfilerNode *p_long =
        m_profiler.create_node("a_name_of_seventy_characters_that_leaves_no_room_for_dots_at_all_0123456");

    IStatsPage *p_page = m_service.create_stats_page("profiler");
    m_profiler.dump(p_page, 0);

    std::string const frame = line(p_page, 0);
    EXPECT_EQ("frame" + std::string(60, '.') + " 4.000, 4.000", frame);
    EXPECT_EQ(" draw" + std::string(60, '.') + " 2.000, 2.000", line(p_page, 1));
    // The next root follows its predecessor's subtree; a name that reaches column 65 is cut there.
    EXPECT_EQ(std::string(p_long->mp_name).substr(0, 65) + " 0.000, 0.000", line(p_page, 2));
}

TEST_F(TimeProfilerTest, DumpWithNoNodesPrintsNothing) {
    IStatsPage *p_page = m_service.create_stats_page("empty");
    m_profiler.dump(p_page, 0);
    for (unsigned i = 0; i < 75; ++i)
        ASSERT_EQ("", line(p_page, i)) << "line " << i;
}
