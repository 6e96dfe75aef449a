// Local strings and the build-version page on the test host: the strings file in both encodings,
// its comments, keys and quoted texts, broken lines, the line limit, the lookups both ways, and
// the page that the service draws after the desktop.
#include "ui.h"

#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_stats_page.h"

#include "qorbase.h"
#include "test_host.h"
#include "test_support.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

// Each test writes its own strings file "test.lang" into a folder that stands in for the
// interface data; the fonts' table comes along, so the desktop is made as usual.
class LocalStringsTest : public ::testing::Test {
protected:
    void SetUp() override {
        qortest::use_host_data_folders();
        m_ui_root = qorbase::get_category_root(qorbase::FILE_CATEGORY_UI);
        m_dir = qortest::make_temp_dir();
        qortest::write_file(m_dir + "/fonts.lua", qortest::read_file(m_ui_root + "/fonts.lua"));
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
        use_strings_file("test.lang");
    }
    void TearDown() override {
        if (m_initialised) service().shutdown();
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_ui_root.c_str());
        qorbase::set_gdf_path(nullptr);
    }

    // A configuration that names the strings file; null leaves the key out.
    void use_strings_file(char const *_name) {
        std::string gdf = "[ui]\n";
        if (_name) gdf += std::string("strings_filename = ") + _name + "\n";
        gdf += "[ui_libraries]\ngameui_library = libgameui_demo.so\n";
        qortest::write_file(m_dir + "/qor.gdf", gdf);
        qorbase::set_gdf_path((m_dir + "/qor.gdf").c_str());
    }
    // The text as 16-bit units, little-endian, behind the byte-order mark.
    void write_wide(std::u16string const &_text, char const *_name = "test.lang") {
        std::string bytes = "\xFF\xFE";
        for (char16_t const unit : _text) {
            bytes += static_cast<char>(unit & 0xFF);
            bytes += static_cast<char>(unit >> 8);
        }
        qortest::write_file(m_dir + "/" + _name, bytes);
    }
    void write_narrow(std::string const &_bytes) { qortest::write_file(m_dir + "/test.lang", _bytes); }

    void init() {
        if (m_initialised) service().shutdown();
        service().init(true);
        m_initialised = true;
    }
    void load_wide(std::u16string const &_text) {
        write_wide(_text);
        init();
    }
    void load_narrow(std::string const &_bytes) {
        write_narrow(_bytes);
        init();
    }

    // The table's text for a key; "(null)" when there's none.
    std::u16string text(char const *_key) {
        unsigned short const *p_text = service().get_local_string(_key);
        if (!p_text) return u"(null)";
        std::u16string result;
        for (; *p_text; ++p_text)
            result += static_cast<char16_t>(*p_text);
        return result;
    }
    std::string key(std::u16string const &_text) {
        wstring units(_text.begin(), _text.end());
        char const *p_key = service().get_local_key(units.c_str());
        return p_key ? p_key : "(null)";
    }

    qorhost::CHost &host() { return qortest::shared_host(); }
    CUserInterface &service() { return *static_cast<CUserInterface *>(host().ui()); }

    std::string m_ui_root;
    std::string m_dir;
    bool m_initialised = false;
};

std::string const k_warning_head = "[init_local_strings('test.lang')]:\nCannot load string ";

} // namespace

// ---------------------------------------------------------------------------------------------
// Encodings
// ---------------------------------------------------------------------------------------------

TEST_F(LocalStringsTest, WideAndNarrowFilesGiveTheSameTable) {
    std::string const narrow = "TITLE \"Caf\xE9 <b>\"\nOK \"Yes\"\n";
    load_narrow(narrow);
    EXPECT_EQ(u"Caf\u00E9 <b>", text("TITLE")); // each byte is the unit of its value
    EXPECT_EQ(u"Yes", text("OK"));

    load_wide(u"TITLE \"Caf\u00E9 <b>\"\nOK \"Yes\"\n");
    EXPECT_EQ(u"Caf\u00E9 <b>", text("TITLE"));
    EXPECT_EQ(u"Yes", text("OK"));
}

TEST_F(LocalStringsTest, WideFileKeepsUnitsBeyondOneByte) {
    load_wide(u"\u041A\u041B\u042E\u0427 "
              u"\"\u041E\u0442\u043C\u0435\u043D\u0430\"\nCANCEL\t\"\u041E\u0442\u043C\u0435\u043D\u0430\"");
    EXPECT_EQ(u"\u041E\u0442\u043C\u0435\u043D\u0430", text("CANCEL"));
    EXPECT_EQ(u"\u041E\u0442\u043C\u0435\u043D\u0430",
              text("\xD0\x9A\xD0\x9B\xD0\xAE\xD0\xA7")); // a narrow key in UTF-8
}

TEST_F(LocalStringsTest, NarrowFileIsReadFromItsFirstByte) {
    load_narrow("FIRST \"1\"\nSECOND \"2\"");
    EXPECT_EQ(u"1", text("FIRST"));
    EXPECT_EQ(u"2", text("SECOND"));

    // The marks' bytes in the other order aren't a mark: they begin the first key.
    load_narrow("\xFE\xFFKEY \"v\"");
    EXPECT_EQ(u"v", text("\xC3\xBE\xC3\xBFKEY"));
    EXPECT_EQ(u"(null)", text("KEY"));
}

TEST_F(LocalStringsTest, TinyFilesGiveAnEmptyTableWithoutReports) {
    load_narrow("OLD \"kept until a file opens\"");
    for (std::string const &bytes : {std::string(), std::string("\xFF\xFE"), std::string("K")}) {
        qortest::CReportCapture capture;
        load_narrow(bytes);
        EXPECT_EQ(u"(null)", text("OLD")) << bytes.size() << " bytes";
        EXPECT_TRUE(capture.texts(qordebug::REPORT_WARNING).empty());
        EXPECT_TRUE(capture.texts(qordebug::REPORT_ASSERT).empty());
    }
}

// ---------------------------------------------------------------------------------------------
// Lines
// ---------------------------------------------------------------------------------------------

TEST_F(LocalStringsTest, CommentsStartOutsideQuotesOnly) {
    qortest::CReportCapture capture;
    load_wide(u"INSIDE \"a -- b\"\n"
              u"BEHIND \"a\" -- \"b\"\n"
              u"SLASHES \"x // y\" // z \"w\"\n"
              u"MIXED \"a\"-/\"b\"\n"
              u"-- COMMENTED \"dash\"\n"
              u"// SLASHED \"slash\"\n"
              u"AFTER \"c\"--tight");
    EXPECT_EQ(u"a -- b", text("INSIDE"));
    EXPECT_EQ(u"a", text("BEHIND"));
    EXPECT_EQ(u"x // y", text("SLASHES"));
    EXPECT_EQ(u"a\"-/\"b", text("MIXED")); // one dash and one slash are no comment
    EXPECT_EQ(u"(null)", text("COMMENTED"));
    EXPECT_EQ(u"(null)", text("SLASHED"));
    EXPECT_EQ(u"c", text("AFTER"));
    EXPECT_TRUE(capture.texts(qordebug::REPORT_WARNING).empty());
}

TEST_F(LocalStringsTest, KeysAndTextsAreKeptExactlyAsWritten) {
    load_wide(u"QUOTED \"a \"quoted\" b\"\n"
              u"TAGS \"<color 255 0 0 255>red</color>\\n\\t%s\"\n"
              u"TAB\t\"tab\"\n"
              u"TAB_FIRST\t \"tab then blank\"\n"
              u"key \"lower\"\n"
              u"KEY \"upper\"\n"
              u" \"empty key\"\n"
              u"TRAILING \"value\" and more\n"
              u"CRLF \"line\"\r\n"
              u"EMPTY \"\"\n"
              u"TWICE \"first\"\n"
              u"TWICE \"second\"\n");
    EXPECT_EQ(u"a \"quoted\" b", text("QUOTED"));
    EXPECT_EQ(u"<color 255 0 0 255>red</color>\\n\\t%s", text("TAGS"));
    EXPECT_EQ(u"tab", text("TAB"));
    EXPECT_EQ(u"tab then blank", text("TAB_FIRST"));
    EXPECT_EQ(u"lower", text("key"));
    EXPECT_EQ(u"upper", text("KEY"));
    EXPECT_EQ(u"empty key", text(""));
    EXPECT_EQ(u"value", text("TRAILING"));
    EXPECT_EQ(u"line", text("CRLF"));
    EXPECT_EQ(u"", text("EMPTY"));
    EXPECT_EQ(u"second", text("TWICE"));
    EXPECT_EQ(u"(null)", text("Key"));
    EXPECT_EQ(u"(null)", text("QUOTED ")); // the blank isn't part of the key
}

TEST_F(LocalStringsTest, BrokenLinesAreReportedAndTheOthersLoad) {
    qortest::CReportCapture capture;
    load_wide(u"KEY \"\n"
              u"GOOD \"ok\"\n"
              u"NOQUOTES text\n"
              u"KEYONLY\n"
              u"\n"
              u"CUT text -- \"in the comment\"\n"
              u"OPEN \"not -- closed\n"
              u"LAST \"fine\"");
    EXPECT_EQ(u"ok", text("GOOD"));
    EXPECT_EQ(u"fine", text("LAST"));
    EXPECT_EQ(u"(null)", text("KEY"));
    EXPECT_EQ(u"(null)", text("NOQUOTES"));
    EXPECT_EQ(u"(null)", text("KEYONLY"));
    EXPECT_EQ(u"(null)", text("CUT"));
    EXPECT_EQ((std::vector<std::string>{
                  k_warning_head + "1\n'KEY \"'\n\" expected",
                  k_warning_head + "3\n'NOQUOTES text'\n\" expected",
                  k_warning_head + "6\n'CUT text '\n\" expected", // without its comment
                  k_warning_head + "7\n'OPEN \"not -- closed'\n\" expected",
              }),
              capture.texts(qordebug::REPORT_WARNING));
    EXPECT_TRUE(capture.texts(qordebug::REPORT_ASSERT).empty());
}

TEST_F(LocalStringsTest, BrokenLineReportsItsTextInUtf8) {
    qortest::CReportCapture capture;
    load_wide(u"\u041A\u041B\u042E\u0427 \u0442\u0435\u043A\u0441\u0442");
    EXPECT_EQ((std::vector<std::string>{
                  k_warning_head +
                  "1\n'\xD0\x9A\xD0\x9B\xD0\xAE\xD0\xA7 \xD1\x82\xD0\xB5\xD0\xBA\xD1\x81\xD1\x82'\n\" "
                  "expected"}),
              capture.texts(qordebug::REPORT_WARNING));
}

// Of a longer file only the last 1024 lines count, and the lines of reports count from the
// first line kept. A line break opens a line, so the last line has none here.
TEST_F(LocalStringsTest, OnlyTheLast1024LinesCount) {
    auto lines = [](unsigned _count, unsigned _broken) {
        std::string file;
        for (unsigned i = 0; i < _count; ++i) {
            if (i) file += "\n";
            file += i == _broken ? "BROKEN" + std::to_string(i) + " x"
                                 : "K" + std::to_string(i) + " \"v" + std::to_string(i) + "\"";
        }
        return file;
    };
    load_narrow(lines(1024, 5000));
    EXPECT_EQ(u"v0", text("K0"));
    EXPECT_EQ(u"v1023", text("K1023"));

    qortest::CReportCapture capture;
    load_narrow(lines(1030, 9));
    for (char const *lost : {"K0", "K1", "K2", "K3", "K4", "K5"})
        EXPECT_EQ(u"(null)", text(lost)) << lost;
    EXPECT_EQ(u"v6", text("K6"));
    EXPECT_EQ(u"v1029", text("K1029"));
    // File line 10 is the fourth line kept.
    EXPECT_EQ((std::vector<std::string>{k_warning_head + "4\n'BROKEN9 x'\n\" expected"}),
              capture.texts(qordebug::REPORT_WARNING));
}

// ---------------------------------------------------------------------------------------------
// Lookups and the file
// ---------------------------------------------------------------------------------------------

TEST_F(LocalStringsTest, EveryTextGivesItsKeyBack) {
    load_wide(u"B_SECOND \"same\"\nA_FIRST \"same\"\nOTHER \"Other\"\nTAGGED \"<color 1 2 3 4>x\"\n");
    for (char const *name : {"OTHER", "TAGGED"})
        EXPECT_EQ(name, key(text(name)));
    EXPECT_EQ("A_FIRST", key(u"same")); // in key order, not file order
    EXPECT_EQ("(null)", key(u"other")); // exact: no folding of case
    EXPECT_EQ("(null)", key(u"Other "));
    EXPECT_EQ("(null)", key(u""));
    EXPECT_EQ(nullptr, service().get_local_key(nullptr));
    EXPECT_EQ(nullptr, service().get_local_string(nullptr));
}

TEST_F(LocalStringsTest, AFileThatCannotBeOpenedIsReportedAndKeepsTheTable) {
    load_narrow("KEPT \"from before\"");
    use_strings_file("missing.lang");
    qortest::CReportCapture capture;
    init();
    EXPECT_EQ((std::vector<std::string>{"Cannot open 'missing.lang'.\nPlease specify a valid file name as a "
                                        "value for 'strings_filename' parameter in GDF"}),
              capture.texts(qordebug::REPORT_WARNING));
    EXPECT_EQ(u"from before", text("KEPT"));
    EXPECT_NE(nullptr, service().get_desktop()); // init went on
}

TEST_F(LocalStringsTest, TheDefaultFileIsTheRussianOneOfTheData) {
    use_strings_file(nullptr);
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_ui_root.c_str());
    qortest::CReportCapture capture;
    init();
    EXPECT_EQ(u"\u041E\u041A", text("DEMO_OK"));
    EXPECT_EQ(u"\u041E\u0442\u043C\u0435\u043D\u0430", text("DEMO_CANCEL"));
    EXPECT_EQ(u"\u0414\u043E\u0431\u0440\u043E \u043F\u043E\u0436\u0430\u043B\u043E\u0432\u0430\u0442\u044C!",
              text("DEMO_GREETING"));
    EXPECT_NE(u"(null)", text("DEMO_TITLE"));
    EXPECT_EQ("DEMO_CANCEL", key(text("DEMO_CANCEL")));
    EXPECT_TRUE(capture.texts(qordebug::REPORT_WARNING).empty());
}

// ---------------------------------------------------------------------------------------------
// The build-version page
// ---------------------------------------------------------------------------------------------

TEST_F(LocalStringsTest, TheBuildVersionPageIsDrawnAfterTheDesktopWhenShown) {
    load_narrow("");
    service().draw(); // the page is made at the first drawn frame of the process
    CStatsPage *p_page = static_cast<CStatsPage *>(service().get_stats_page("build_version"));
    ASSERT_NE(nullptr, p_page);
    EXPECT_FALSE(p_page->is_show());
    CText const &sheet = p_page->get_text();
    EXPECT_STREQ("<color 255 255 255 255>qorui 1.0 (demo build)", sheet.get_string(47)->get_c());
    EXPECT_STREQ("<color 255 255 255 255>203", sheet.get_string(48)->get_c());
    EXPECT_STREQ("", sheet.get_string(46)->get_c());

    // Hidden, a frame is the desktop's alone.
    host().recorder().clear();
    service().draw();
    size_t const desktop_calls = host().recorder().calls().size();
    ASSERT_GT(desktop_calls, 0u);

    // Shown, a 2D batch of its own follows: the two lines in the fixed font at size 300.
    CFont *p_font = service().get_desktop()->get_font(FNT_NAME_FIXED);
    ASSERT_NE(nullptr, p_font);
    float const size = p_font->get_size();
    p_page->show(true);
    host().recorder().clear();
    service().draw();
    p_page->show(false);
    std::vector<qorhost::SRenderCall> const &calls = host().recorder().calls();
    ASSERT_GT(calls.size(), desktop_calls);
    EXPECT_EQ("begin_2d", calls[desktop_calls].m_op);
    EXPECT_EQ("end_2d", calls.back().m_op);
    std::vector<qorhost::SRenderCall> quads;
    for (size_t i = desktop_calls; i < calls.size(); ++i)
        if (calls[i].m_op == "draw_quad") quads.push_back(calls[i]);
    ASSERT_EQ(std::string("qorui 1.0 (demo build)203").size(), quads.size());
    EXPECT_EQ(size, p_font->get_size()); // restored

    // The sheet stands at (20, 20): the version's first character on line 47, "203" on line 48.
    int const line_h = static_cast<int>(300.0f * p_font->get_height());
    ASSERT_GT(line_h, 0);
    EXPECT_FLOAT_EQ(-1.0f + 2.0f * 20 / 1024, quads[0].m_points[0].x);
    EXPECT_FLOAT_EQ(1.0f - 2.0f * (20 + 47 * line_h) / 768, quads[0].m_points[0].y);
    EXPECT_FLOAT_EQ(-1.0f + 2.0f * 20 / 1024, quads[22].m_points[0].x);
    EXPECT_FLOAT_EQ(1.0f - 2.0f * (20 + 48 * line_h) / 768, quads[22].m_points[0].y);
}

// ---------------------------------------------------------------------------------------------
// The buffered reader under the loader
// ---------------------------------------------------------------------------------------------

namespace {

// A file larger than the engine's cache buffer, each byte telling its position.
class CachedFileReaderTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_dir = qortest::make_temp_dir();
        for (unsigned i = 0; i < k_size; ++i)
            m_content += static_cast<char>(i * 7 + i / 251);
        qortest::write_file(m_dir + "/big.bin", m_content);
        m_root = qorbase::get_category_root(qorbase::FILE_CATEGORY_UI);
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    }
    void TearDown() override { qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_root.c_str()); }

    IFileReader *open() { return GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "big.bin"); }

    static unsigned const k_size = 150000;
    std::string m_dir;
    std::string m_root;
    std::string m_content;
};

} // namespace

TEST_F(CachedFileReaderTest, SmallReadsAcrossTheBufferGiveTheFileInOrder) {
    IFileReader *p_stream = open();
    ASSERT_NE(nullptr, p_stream);
    CCachedFileReader reader(p_stream, true);
    std::string read;
    char chunk[7];
    while (reader.read(chunk, sizeof chunk))
        read.append(chunk, sizeof chunk);
    ASSERT_EQ(k_size - k_size % 7, read.size());
    EXPECT_TRUE(read == m_content.substr(0, read.size()));
}

TEST_F(CachedFileReaderTest, AShortReadAtTheEndKeepsWhatItCopied) {
    IFileReader *p_stream = open();
    ASSERT_NE(nullptr, p_stream);
    CCachedFileReader reader(p_stream, true);
    std::string first(100000, '\0');
    ASSERT_TRUE(reader.read(&first[0], 100000)); // more than one buffer at once
    EXPECT_TRUE(first == m_content.substr(0, 100000));

    std::string rest(60000, '\0');
    EXPECT_FALSE(reader.read(&rest[0], 60000)); // 50,000 are left
    EXPECT_TRUE(rest.substr(0, 50000) == m_content.substr(100000));
    EXPECT_EQ(std::string(10000, '\0'), rest.substr(50000));
    char byte = 'x';
    EXPECT_FALSE(reader.read(&byte, 1)); // at the end
    EXPECT_EQ('x', byte);
}

TEST_F(CachedFileReaderTest, AReaderThatDoesNotOwnTheStreamLeavesIt) {
    IFileReader *p_stream = open();
    ASSERT_NE(nullptr, p_stream);
    {
        CCachedFileReader reader(p_stream, false);
        char bytes[2];
        ASSERT_TRUE(reader.read(bytes, 2));
    }
    char byte = 0;
    p_stream->seek(1);
    EXPECT_EQ(1u, p_stream->read(1, &byte)); // still open
    EXPECT_EQ(m_content[1], byte);
    delete p_stream;

    qortest::CReportCapture capture;
    CCachedFileReader without(nullptr, true);
    EXPECT_FALSE(without.read(&byte, 1));
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
}
