// Stats pages: the service's bookkeeping, the 75 lines, colour tags, narrow and wide printing.
#include "ui_stats_page.h"

#include "test_support.h"
#include "ui.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(StatsPage, OnePagePerNameOf75LinesEachPrintedBehindItsColourTag) {
    CUserInterface service;
    IStatsPage *p_page = service.create_stats_page("print");
    IStatsPage *p_second = service.create_stats_page("second");
    EXPECT_EQ(p_page, service.create_stats_page("print"));
    EXPECT_EQ(nullptr, service.get_stats_page("Second"));
    p_second->show(true);
    p_page->show(true);
    EXPECT_EQ(p_page, service.get_current_stats_page()); // the earliest shown
    auto const line = [p_page](unsigned _idx) {
        return std::string(static_cast<CStatsPage *>(p_page)->get_text().get_string(_idx)->get_c());
    };
    p_page->print(3, "fps %d", 60);
    p_page->print(3, "fps %d", 59);
    p_page->set_color(128, 128, 128, 255); // anything of 1 or more is full
    p_page->print(74, "%s", std::string(300, 'x').c_str());
    p_page->set_color(0, 1, 0, 1);
    unsigned short const wide_format[] = {'%', 'S', ' ', '%', 'd', 0};
    p_page->print(0, wide_format, "\xD0\x9F", 7);
    qortest::CReportCapture capture;
    p_page->print(75, "ignored");           // narrow: beyond the last line is ignored
    p_page->print(75, wide_format, "x", 1); // wide: a contract
    EXPECT_EQ("<color 255 255 255 255>fps 59", line(3));
    EXPECT_EQ(199u, line(74).size()); // cut at the buffer
    EXPECT_EQ("<color 0 255 0 255>\xD0\x9F 7", line(0));
    EXPECT_EQ(75u, static_cast<CStatsPage *>(p_page)->get_text().get_num_strings());
    EXPECT_EQ(1u, capture.asserts().size());
    p_page->clear();
    EXPECT_EQ("", line(3));
}
