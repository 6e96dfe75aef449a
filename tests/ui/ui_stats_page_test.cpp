// Stats pages: the service's bookkeeping, the 75 lines, colour tags, narrow and wide printing.
#include "ui_stats_page.h"

#include "test_support.h"
#include "ui.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

class StatsPageTest : public ::testing::Test {
protected:
    CStatsPage *page(char const *_name) {
        return static_cast<CStatsPage *>(m_service.create_stats_page(_name));
    }
    static std::string line(CStatsPage *_p_page, unsigned _idx) {
        return _p_page->get_text().get_string(_idx)->get_c();
    }

    CUserInterface m_service;
};

} // namespace

TEST_F(StatsPageTest, TheServiceKeepsOnePagePerNameInCreationOrder) {
    IStatsPage *p_first = m_service.create_stats_page("first");
    IStatsPage *p_second = m_service.create_stats_page("second");
    EXPECT_EQ(p_first, m_service.create_stats_page("first"));
    EXPECT_EQ(2u, m_service.get_stats_pages_count());
    EXPECT_EQ(p_second, m_service.get_stats_page(1u));
    EXPECT_EQ(nullptr, m_service.get_stats_page(2u));
    EXPECT_EQ(p_second, m_service.get_stats_page("second"));
    EXPECT_EQ(nullptr, m_service.get_stats_page("Second"));

    EXPECT_EQ(nullptr, m_service.get_current_stats_page());
    p_second->show(true);
    EXPECT_EQ(p_second, m_service.get_current_stats_page());
    p_first->show(true);
    EXPECT_EQ(p_first, m_service.get_current_stats_page()); // the earlier of two shown pages
}

TEST_F(StatsPageTest, ANewPageHasSeventyFiveEmptyLinesAndIsHidden) {
    CStatsPage *p_page = page("new");
    EXPECT_EQ(75u, p_page->get_text().get_num_strings());
    for (unsigned i = 0; i < 75; ++i)
        ASSERT_EQ("", line(p_page, i)) << i;
    EXPECT_FALSE(p_page->is_show());
    EXPECT_STREQ("new", p_page->get_name());
}

TEST_F(StatsPageTest, PrintingOverwritesOneLineBehindItsColourTag) {
    CStatsPage *p_page = page("print");
    p_page->print(3, "fps %d", 60);
    p_page->print(3, "fps %d", 59);
    p_page->set_color(128, 128, 128, 255); // anything of 1 or more is full
    p_page->print(74, "%s", "last");
    p_page->set_color(0, 1, 0, 1);
    unsigned short const wide_format[] = {'%', 'S', ' ', '%', 'd', 0};
    p_page->print(0, wide_format, "\xD0\x9F", 7);
    p_page->print(75, "ignored"); // narrow: beyond the last line is ignored
    EXPECT_EQ("<color 255 255 255 255>fps 59", line(p_page, 3));
    EXPECT_EQ("<color 255 255 255 255>last", line(p_page, 74));
    EXPECT_EQ("<color 0 255 0 255>\xD0\x9F 7", line(p_page, 0));
    EXPECT_EQ("", line(p_page, 1));
    EXPECT_EQ(75u, p_page->get_text().get_num_strings());

    qortest::CReportCapture capture;
    p_page->print(75, wide_format, "x", 1); // wide: a contract
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos, capture.texts(qordebug::REPORT_ASSERT)[0].find("_string_num < MAX_STRINGS"));
}

TEST_F(StatsPageTest, LongTextIsCutAtTheBufferAndClearKeepsTheLines) {
    CStatsPage *p_page = page("long");
    p_page->print(1, "%s", std::string(300, 'x').c_str());
    EXPECT_EQ(199u, line(p_page, 1).size());
    p_page->clear();
    EXPECT_EQ(75u, p_page->get_text().get_num_strings());
    EXPECT_EQ("", line(p_page, 1));
}
