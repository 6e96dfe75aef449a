// The interfaces the UI library puts on the engine's interface server (the user-interface
// service and the time profiler) and the interfaces it hands out (console, stats pages).
// An engine sees the library through these and through RegisterInterface.
#pragma once
#include "qor_interfaces.h"

namespace qorui {
class CDesktop;
class CTimeProfilerNode;
class CConsole;

class IConsole {
public:
    virtual ~IConsole() {}
    virtual void show(bool _show) = 0;
    virtual bool is_show() = 0;
    virtual CConsole *get_console() = 0;
    virtual void clear() = 0;
};

// A named sheet of 75 numbered lines that any module prints to by line number.
class IStatsPage {
public:
    virtual ~IStatsPage() {}
    virtual void set_color(int _r, int _g, int _b, int _a) = 0;
    virtual void print(unsigned int _line, unsigned short const *_format, ...) = 0;
    virtual void print(unsigned int _line, char const *_format, ...) __attribute__((format(printf, 3, 4))) = 0;
    virtual char const *get_name() = 0;
    virtual void show(bool _show) = 0;
    virtual bool is_show() = 0;
    virtual void clear() = 0;
};

// The user-interface service: the one object the engine talks to.
class IUserInterface : public IInterfaceBase {
public:
    virtual void init(bool _hide_console) = 0;
    virtual void shutdown() = 0;
    virtual void update(int _time) = 0;
    virtual void draw() = 0;
    virtual IConsole *get_console() = 0;
    virtual IStatsPage *create_stats_page(char const *_name) = 0;
    virtual unsigned get_stats_pages_count() = 0;
    virtual IStatsPage *get_stats_page(unsigned _idx) = 0;
    virtual IStatsPage *get_stats_page(char const *_name) = 0;
    virtual CDesktop *get_desktop() = 0;
    virtual void on_app_activate(bool _active) = 0;
    virtual unsigned short const *get_local_string(char const *_key) = 0;
    virtual char const *get_local_key(unsigned short const *_text) = 0;
    virtual float get_scale_w() = 0;
    virtual float get_scale_h() = 0;
    virtual IStatsPage *get_current_stats_page() = 0;
    virtual bool get_hide_console() = 0;
    virtual void *get_reserved() = 0;
};

// The engine-wide hierarchical timer.
class ITimeProfiler : public IInterfaceBase {
public:
    virtual CTimeProfilerNode *create_node(char const *_name) = 0;
    virtual CTimeProfilerNode *get_root() = 0; // always null
    virtual void begin(CTimeProfilerNode *_p_node) = 0;
    virtual void end() = 0;
    virtual void reset_node(CTimeProfilerNode *_p_node) = 0; // no effect
    virtual void enable() = 0;
    virtual void disable() = 0;
    virtual void dump(IStatsPage *_p_page, int _reserved) = 0;
};

} // namespace qorui

// The library's entry point: the engine calls it once after loading the module.
extern "C" int RegisterInterface(IInterfaceServer *_p_server);
