// The engine's log manager: named loggers with a prefix, and the messages of all of them with
// running indices, which the developer console reads.
#pragma once
#include "qor_interfaces.h"

// One named logger of the log manager.
class ILogger {
public:
    // The name given to create_logger.
    virtual char const *get_name() const = 0;
    // An inactive logger drops what it is given.
    virtual void set_active(bool _active) = 0;
    // Adds a message: the text as 16-bit units or as bytes, terminated; _level 0 message,
    // 1 warning, 2 error.
    // @{
    virtual void write(unsigned short const *_text, int _level) = 0;
    virtual void write(char const *_text, int _level) = 0;
    // @}

protected:
    virtual ~ILogger() {}
};

// One message as the log manager keeps it. mp_text (16-bit units, terminated) is valid only
// during the visit that hands the record out.
struct SLogMessage {
    unsigned short const *mp_text; // 16-bit units, terminated; valid during the call only
    uint32_t m_level;              // 0 message, 1 warning, 2 error
    uint32_t m_index;              // running index, from 0
};

// Receives messages from get_messages, oldest first. Copies what it keeps: records don't survive
// the call, and no memory crosses the module boundary.
class ILogMessageVisitor {
public:
    // Called once for each message, oldest first.
    virtual void on_message(SLogMessage const &_message) = 0;

protected:
    virtual ~ILogMessageVisitor() {}
};

// The engine's log: named loggers, and the messages of them all.
class ILogManager : public IInterfaceBase {
public:
    // A new logger whose lines start with _prefix; the manager owns it.
    virtual ILogger *create_logger(char const *_name, char const *_prefix) = 0;
    // The logger of that name, null when there is none.
    virtual ILogger *find_logger(char const *_name) = 0;
    // The messages whose running index is _first or above, oldest first; _count -1 for all.
    virtual void get_messages(ILogMessageVisitor &_visitor, unsigned _first, int _count) = 0;
};
