// The host's log manager: named loggers with a prefix; every message gets a running index and is
// kept in a ring for readers such as the developer console.
#pragma once
#include "qor_log.h"

#include <deque>
#include <memory>
#include <string>
#include <vector>

namespace qorhost {

class CLogManager;

class CHostLogger : public ILogger {
public:
    CHostLogger(CLogManager *_p_manager, char const *_name, char const *_prefix);

    char const *get_name() const override { return m_name.c_str(); }
    void set_active(bool _active) override { m_active = _active; }
    void write(unsigned short const *_text, int _level) override;
    void write(char const *_text, int _level) override;

    std::string const &get_prefix() const { return m_prefix; }

private:
    CLogManager *mp_manager;
    std::string m_name;
    std::string m_prefix;
    bool m_active;
};

class CLogManager : public ILogManager {
public:
    enum { MAX_MESSAGES = 4096 };

    CLogManager();

    SInterfaceUID get_uid() const override { return qor_uid::LOG_MANAGER; }
    int get_version() const override { return 1; }

    ILogger *create_logger(char const *_name, char const *_prefix) override;
    ILogger *find_logger(char const *_name) override;
    void get_messages(ILogMessageVisitor &_visitor, unsigned _first, int _count) override;

    // Quiet: messages are kept but not printed.
    void set_quiet(bool _quiet) { m_quiet = _quiet; }
    // Takes a message of a logger.
    void add_message(CHostLogger const &_logger, std::u16string const &_text, int _level);
    unsigned get_next_index() const { return m_next_index; }
    // The text of a kept message as UTF-8, "" when it's gone.
    std::string get_message_text(unsigned _index) const;

private:
    struct SMessage {
        std::u16string m_text;
        int m_level;
        unsigned m_index;
    };
    std::vector<std::unique_ptr<CHostLogger>> m_loggers;
    std::deque<SMessage> m_messages;
    unsigned m_next_index;
    bool m_quiet;
};

// 16-bit text to UTF-8 and back; surrogate pairs become one character, lone surrogates and
// invalid bytes U+FFFD.
std::string utf16_to_utf8(std::u16string const &_text);
std::u16string utf8_to_utf16(char const *_text);

} // namespace qorhost
