// Stats pages: the service's bookkeeping, the 75 lines, colour tags, narrow and wide printing.
#include "ui_stats_page.h"

#include "test_support.h"
#include "ui.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

std::string line(IStatsPage *_p_page, unsigned _idx) {
    return static_cast<CStatsPage *>(_p_page)->get_text().get_string(_idx)->get_c();
}

} // namespace

TEST(StatsPage, TheServiceKeepsOnePagePerNameAndTheEarliestShownIsCurrent) {
    CUserInterface service;
    IStatsPage *p_first = service.create_stats_page("first");
    IStatsPage *p_second = service.create_stats_page("second");
    EXPECT_EQ(p_first, service.create_stats_page("first"));
    EXPECT_EQ(2u, service.get_stats_pages_count());
    EXPECT_EQ(p_second, service.get_stats_page(1u));
    EXPECT_EQ(nullptr, service.get_stats_page(2u));
    EXPECT_EQ(nullptr, service.get_stats_page("Second"));
    EXPECT_EQ(nullptr, service.get_current_stats_page());
    p_second->show(true);
    EXPECT_EQ(p_second, service.get_current_stats_page());
    p_first->show(true);
    EXPECT_EQ(p_first, service.get_current_stats_page());
}

TEST(StatsPage, PrintingOverwritesOneOf75LinesBehindItsColourTag) {
    CUserInterface service;
    IStatsPage *p_page = service.create_stats_page("print");
    EXPECT_EQ(75u, static_cast<CStatsPage *>(p_page)->get_text().get_num_strings());
    p_page->print(3, "fps %d", 60);
    p_page->print(3, "fps %d", 59);
    p_page->set_color(128, 128, 128, 255); // anything of 1 or more is full
    p_page->print(74, "%s", std::string(300, 'x').c_str());
    p_page->set_color(0, 1, 0, 1);
    unsigned short const wide_format[] = {'%', 'S', ' ', '%', 'd', 0};
    p_page->print(0, wide_format, "\xD0\x9F", 7);
    qortest::CReportCapture capture;
    p_page->print(75, "ignored"); // narrow: beyond the last line is ignored
    EXPECT_EQ("<color 255 255 255 255>fps 59", line(p_page, 3));
    EXPECT_EQ("<color 255 255 255 255>xxx", line(p_page, 74).substr(0, 26));
    EXPECT_EQ(199u, line(p_page, 74).size()); // cut at the buffer
    EXPECT_EQ("<color 0 255 0 255>\xD0\x9F 7", line(p_page, 0));
    EXPECT_EQ("", line(p_page, 1));
    EXPECT_EQ(75u, static_cast<CStatsPage *>(p_page)->get_text().get_num_strings());
    p_page->print(75, wide_format, "x", 1); // wide: a contract
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_NE(std::string::npos, capture.asserts()[0].find("_string_num < MAX_STRINGS"));
    p_page->clear();
    EXPECT_EQ("", line(p_page, 3));
    EXPECT_EQ(75u, static_cast<CStatsPage *>(p_page)->get_text().get_num_strings());
}
