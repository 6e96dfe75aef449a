// The host's log manager: loggers by name, running message indices, the ring of kept messages,
// reading them with get_messages, the printed lines, and the 16-bit and UTF-8 text conversions.
#include "log_manager.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorhost;

namespace {

// Copies what it is handed, as a reader of the log must: "#index level 'text'".
class CCopyingVisitor : public ILogMessageVisitor {
public:
    void on_message(SLogMessage const &_message) override {
        std::u16string text;
        for (unsigned short const *p = _message.mp_text; *p; ++p)
            text += static_cast<char16_t>(*p);
        m_messages.push_back("#" + std::to_string(_message.m_index) + " " + std::to_string(_message.m_level) +
                             " '" + utf16_to_utf8(text) + "'");
    }

    std::vector<std::string> m_messages;
};

std::vector<std::string> read(CLogManager &_log, unsigned _first, int _count) {
    CCopyingVisitor visitor;
    _log.get_messages(visitor, _first, _count);
    return visitor.m_messages;
}

class LogManagerTest : public testing::Test {
protected:
    LogManagerTest() { m_log.set_quiet(true); }
    CLogManager m_log;
};

} // namespace

// Loggers are found by their name (case-sensitive; the first of a name stays); the messages of all
// of them get running indices, an inactive logger keeps nothing.
TEST_F(LogManagerTest, LoggersByNameAndMessagesWithRunningIndices) {
    ILogger *p_a = m_log.create_logger("A", "A: ");
    ASSERT_NE(nullptr, p_a);
    EXPECT_STREQ("A", p_a->get_name());
    EXPECT_EQ(p_a, m_log.create_logger("A", "Other: "));
    EXPECT_EQ("A: ", static_cast<CHostLogger *>(p_a)->get_prefix());
    ILogger *p_b = m_log.create_logger("B", nullptr);
    EXPECT_NE(p_a, p_b);
    EXPECT_EQ(p_b, m_log.find_logger("B"));
    EXPECT_EQ(p_a, m_log.find_logger("A"));
    EXPECT_EQ(nullptr, m_log.find_logger("a"));
    EXPECT_EQ(nullptr, m_log.find_logger(nullptr));

    p_a->write("first", 0);
    unsigned short const wide[] = {'s', 'e', 'c', 0x00E9, 0};
    p_b->write(wide, 1);
    p_b->set_active(false);
    p_b->write("lost", 0);
    p_b->set_active(true);
    p_a->write("", 2);
    p_a->write(static_cast<char const *>(nullptr), 0); // nothing
    p_b->write(static_cast<unsigned short const *>(nullptr), 0);
    EXPECT_EQ(3u, m_log.get_next_index());
    EXPECT_EQ((std::vector<std::string>{"#0 0 'first'", "#1 1 'sec\xC3\xA9'", "#2 2 ''"}),
              read(m_log, 0, -1));
    EXPECT_EQ("sec\xC3\xA9", m_log.get_message_text(1));
    EXPECT_EQ("", m_log.get_message_text(3));
}

// get_messages starts at an index and stops after a count; only the newest messages are kept.
TEST_F(LogManagerTest, OnlyTheNewestMessagesAreKeptAndReadFromAnIndex) {
    ILogger *p_a = m_log.create_logger("A", "");
    unsigned const total = CLogManager::MAX_MESSAGES + 5;
    for (unsigned i = 0; i < total; ++i)
        p_a->write(std::to_string(i).c_str(), i % 3);
    EXPECT_EQ(total, m_log.get_next_index());
    std::string const last = std::to_string(total - 1); // of level 4100 % 3 = 2
    EXPECT_EQ((std::vector<std::string>{"#5 2 '5'", "#6 0 '6'"}), read(m_log, 0, 2));
    EXPECT_EQ((std::vector<std::string>{"#7 1 '7'", "#8 2 '8'"}), read(m_log, 7, 2));
    EXPECT_EQ(std::vector<std::string>{"#" + last + " 2 '" + last + "'"}, read(m_log, total - 1, 10));
    EXPECT_TRUE(read(m_log, total, -1).empty() && read(m_log, 7, 0).empty());
    EXPECT_EQ(size_t(CLogManager::MAX_MESSAGES), read(m_log, 0, -1).size());
    EXPECT_EQ("", m_log.get_message_text(4));
    EXPECT_EQ(last, m_log.get_message_text(total - 1));
}

TEST(LogManagerPrint, MessagesArePrintedWithTheLoggersPrefixUnlessQuiet) {
    CLogManager log;
    ILogger *p_game = log.create_logger("Game", "Game: ");
    testing::internal::CaptureStdout();
    p_game->write("one", 0);
    p_game->write("two\n", 1);
    log.set_quiet(true);
    p_game->write("three", 0);
    std::string const printed = testing::internal::GetCapturedStdout();
    EXPECT_EQ("Game: one\nGame: two\n", printed);
    EXPECT_EQ(3u, log.get_next_index());
}

// ---------------------------------------------------------------------------------------------
// Text conversion
// ---------------------------------------------------------------------------------------------

// UTF-8 and UTF-16 round trip every plane; invalid bytes and lone surrogates become replacement
// characters.
TEST(LogText, Utf8AndUtf16RoundTripEveryPlane) {
    char const *const text = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80z"; // a, e acute, euro, a smiley, z
    std::u16string const wide = utf8_to_utf16(text);
    EXPECT_EQ((std::u16string{u'a', 0x00E9, 0x20AC, 0xD83D, 0xDE00, u'z'}), wide);
    EXPECT_EQ(text, utf16_to_utf8(wide));
    EXPECT_EQ(u"", utf8_to_utf16(nullptr));
    // A stray continuation byte, a lead byte cut short, a byte that never starts a character.
    EXPECT_EQ((std::u16string{0xFFFD, u'x', 0xFFFD, u'y', 0xFFFD}), utf8_to_utf16("\x80x\xC3y\xFF"));
    // A lead byte of a code above U+10FFFF, with its continuation bytes.
    EXPECT_EQ((std::u16string{0xFFFD, 0xFFFD, 0xFFFD, 0xFFFD}), utf8_to_utf16("\xF7\xBF\xBF\xBF"));
    EXPECT_EQ("\xEF\xBF\xBD"
              "a\xEF\xBF\xBD",
              utf16_to_utf8(std::u16string{0xDE00, u'a', 0xD83D}));
}
