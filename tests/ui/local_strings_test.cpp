// Local strings: the reader of strings files in both encodings (comments, keys, quoted texts,
// broken lines, the line limit) and the buffered reader under it.
#include "ui_local_strings.h"

#include "qorbase.h"
#include "test_support.h"

#include <gtest/gtest.h>

#include <map>

using namespace qorui;

namespace {

typedef std::map<std::string, std::u16string> table_t;
typedef std::vector<std::string> lines_t;

std::string const k_warning_head = "[init_local_strings('test.lang')]:\nCannot load string ";

// The text as 16-bit units, little-endian, behind the byte-order mark.
std::string wide(std::u16string const &_text) {
    std::string bytes = "\xFF\xFE";
    for (char16_t const unit : _text)
        bytes += std::string{static_cast<char>(unit & 0xFF), static_cast<char>(unit >> 8)};
    return bytes;
}

std::u16string units(unsigned short const *_p_text) {
    std::u16string result;
    for (; _p_text && *_p_text; ++_p_text)
        result += static_cast<char16_t>(*_p_text);
    return result;
}

// The strings files of a test in a folder of its own that stands in for the interface data.
class LocalStringsTest : public ::testing::Test {
protected:
    void SetUp() override { qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str()); }
    // The table that the file's bytes give, "test.lang" named in its reports.
    table_t read(std::string const &_bytes) {
        qortest::write_file(m_dir + "/test.lang", _bytes);
        local_strings_t table;
        table[string("OLD")] = CString("from before");
        read_local_strings(GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "test.lang"), "test.lang",
                           table);
        table_t result;
        for (auto const &entry : table)
            result[entry.first.c_str()] = units(entry.second.c_str());
        return result;
    }

    std::string m_dir = qortest::make_temp_dir();
};

} // namespace

TEST_F(LocalStringsTest, WideAndNarrowFilesGiveTheSameTable) {
    table_t const expected = {{"TITLE", u"Caf\u00E9 <b>"}, {"OK", u"Yes"}};
    EXPECT_EQ(expected, read("TITLE \"Caf\xE9 <b>\"\nOK \"Yes\"\n")); // each byte is the unit of its value
    EXPECT_EQ(expected, read(wide(u"TITLE \"Caf\u00E9 <b>\"\nOK \"Yes\"\n")));
    EXPECT_EQ((table_t{{"\xD0\x9A\xD0\x9B\xD0\xAE\xD0\xA7", u"\u041E\u0442\u043C"}}), // a narrow key in UTF-8
              read(wide(u"\u041A\u041B\u042E\u0427 \"\u041E\u0442\u043C\"")));
    // The marks' bytes in the other order aren't a mark: they begin the first key.
    EXPECT_EQ((table_t{{"\xC3\xBE\xC3\xBFKEY", u"v"}}), read("\xFE\xFFKEY \"v\""));
    EXPECT_EQ(table_t{}, read("\xFF\xFE"));
}

TEST_F(LocalStringsTest, LinesAreKeyBlankAndQuotedTextWithCommentsOutsideQuotes) {
    qortest::CReportCapture capture;
    table_t const table = read(wide(u"INSIDE \"a -- b\"\n"
                                    u"BEHIND \"a\" -- \"b\"\n"
                                    u"MIXED \"a\"-/\"b\"\n"
                                    u"-- COMMENTED \"dash\"\n"
                                    u"AFTER \"c\"--tight\n"
                                    u"QUOTED \"a \"quoted\" b\"\n"
                                    u" \"empty key\"\n"
                                    u"TRAILING \"value\" and more\n"
                                    u"CRLF \"line\"\r\n"
                                    u"TWICE \"first\"\nTWICE \"second\"\n"
                                    u"KEY \"\n"
                                    u"NOQUOTES text\n"
                                    u"\n"
                                    u"CUT text -- \"in the comment\"\n"
                                    u"OPEN \"not -- closed\n"
                                    u"\u041A\u041B \u0442\u0435"));
    EXPECT_EQ((table_t{{"INSIDE", u"a -- b"},
                       {"BEHIND", u"a"},
                       {"MIXED", u"a\"-/\"b"}, // one dash and one slash are no comment
                       {"AFTER", u"c"},
                       {"QUOTED", u"a \"quoted\" b"},
                       {"", u"empty key"},
                       {"TRAILING", u"value"},
                       {"CRLF", u"line"},
                       {"TWICE", u"second"}}),
              table);
    EXPECT_EQ((lines_t{k_warning_head + "12\n'KEY \"'\n\" expected",
                       k_warning_head + "13\n'NOQUOTES text'\n\" expected",
                       k_warning_head + "15\n'CUT text '\n\" expected", // without its comment
                       k_warning_head + "16\n'OPEN \"not -- closed'\n\" expected",
                       k_warning_head + "17\n'\xD0\x9A\xD0\x9B \xD1\x82\xD0\xB5'\n\" expected"}), // in UTF-8
              capture.warnings());
    EXPECT_TRUE(capture.asserts().empty());
}

// Of a longer file only the last 1024 lines count, and the lines of reports count from the first
// line kept. A line break opens a line, so the last line has none here.
TEST_F(LocalStringsTest, OnlyTheLast1024LinesCount) {
    std::string file;
    for (unsigned i = 0; i < 1030; ++i)
        file += (i ? "\n" : "") + (i == 9 ? "BROKEN x" : "K" + std::to_string(i) + " \"v\"");
    qortest::CReportCapture capture;
    table_t const table = read(file);
    EXPECT_EQ(1023u, table.size());
    EXPECT_EQ(0u, table.count("K5"));
    EXPECT_EQ(1u, table.count("K6"));
    EXPECT_EQ(1u, table.count("K1029"));
    EXPECT_EQ((lines_t{k_warning_head + "4\n'BROKEN x'\n\" expected"}), capture.warnings()); // file line 10
}

// A key too long for its narrow form is bad data: reported, and the lines around it are kept.
TEST_F(LocalStringsTest, AKeyTooLongForItsNarrowFormIsReportedAndSkipped) {
    qortest::CReportCapture capture;
    table_t const table =
        read(std::string(255, 'K') + " \"fits\"\n" + std::string(256, 'L') + " \"too long\"\nOK \"yes\"\n");
    EXPECT_EQ(2u, table.size());
    EXPECT_EQ(1u, table.count(std::string(255, 'K')));
    ASSERT_EQ(1u, capture.warnings().size());
    EXPECT_EQ(0u, capture.warnings()[0].find(k_warning_head + "2\n"));
    EXPECT_TRUE(capture.asserts().empty());
}

// The buffered reader: small reads across its buffer, a short read at the end, and a stream it
// doesn't own left open.
TEST_F(LocalStringsTest, TheCachedReaderGivesTheFileInOrder) {
    std::string content;
    for (unsigned i = 0; i < 150000; ++i) // larger than the engine's cache buffer
        content += static_cast<char>(i * 7 + i / 251);
    qortest::write_file(m_dir + "/big.bin", content);
    IFileReader *p_stream = GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "big.bin");
    {
        CCachedFileReader reader(p_stream, false);
        std::string read(7, '\0');
        for (unsigned i = 0; i < 10000; ++i) // across the end of the 64 KiB buffer
            ASSERT_TRUE(reader.read(&read[0], 7) && read == content.substr(i * 7, 7)) << i;
        std::string rest(90000, '\0');
        EXPECT_FALSE(reader.read(&rest[0], 90000)); // 80,000 are left
        EXPECT_TRUE(rest.substr(0, 80000) == content.substr(70000));
    }
    char byte = 0;
    p_stream->seek(1);
    EXPECT_EQ(1u, p_stream->read(1, &byte)); // a stream it doesn't own stays open
    delete p_stream;
}
