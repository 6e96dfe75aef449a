// The interfaces the UI library puts on the engine's interface server (the user-interface
// service and the time profiler) and the interfaces it hands out (console, stats pages).
// An engine sees the library through these and through RegisterInterface.
#pragma once
#include "qor_interfaces.h"

namespace qorui {
class CDesktop;
class CTimeProfilerNode;
class CConsole;

// The developer console as other modules see it; the service hands it out by get_console.
class IConsole {
public:
    // The console is a window: the window tree deletes it, not the caller.
    virtual ~IConsole() {}
    // Shows (true) or hides (false) the console window, by an event to it.
    virtual void show(bool _show) = 0;
    // True while the console window isn't hidden.
    virtual bool is_show() = 0;
    // The same object as the window class.
    virtual CConsole *get_console() = 0;
    // Empties the command line and the history shown; the list of past commands stays.
    virtual void clear() = 0;
};

// A named sheet of 75 numbered lines that any module prints to by line number.
class IStatsPage {
public:
    // Pages belong to the service, which deletes them at process end.
    virtual ~IStatsPage() {}
    // The colour of the prints that follow. Each value counts as 0 when 0 or less and as 255
    // when 1 or more: there are no shades between.
    virtual void set_color(int _r, int _g, int _b, int _a) = 0;
    // Replaces line _line (0 to 74) with the printf-style text behind the colour tag, cut to
    // 199 units. The narrow form ignores a line out of range and a null format; the wide form
    // reports a line out of range as a broken contract.
    // @{
    virtual void print(unsigned int _line, unsigned short const *_format, ...) = 0;
    virtual void print(unsigned int _line, char const *_format, ...) __attribute__((format(printf, 3, 4))) = 0;
    // @}
    // The name the page was made with.
    virtual char const *get_name() = 0;
    // Whether the page is to be shown; nothing else happens.
    // @{
    virtual void show(bool _show) = 0;
    virtual bool is_show() = 0;
    // @}
    // Empties every line; the 75 lines stay.
    virtual void clear() = 0;
};

// The user-interface service: the one object the engine talks to.
class IUserInterface : public IInterfaceBase {
public:
    // Starts the service: the start-up plaque, the screen size, the game's interface library,
    // the listeners, the local strings, the desktop of 1024 by 768 pixels with its fonts and
    // pointer, the console (hidden with _hide_console, else active), the commands.
    virtual void init(bool _hide_console) = 0;
    // Writes the console's geometry to the configuration, deletes the desktop with every window,
    // removes the listeners and the commands. Stats pages and local strings stay.
    virtual void shutdown() = 0;
    // The first call of a frame: pending deletions, EVENT_UPDATE through the tree, the pointer.
    // _time is passed on unchanged.
    virtual void update(int _time) = 0;
    // The second call of a frame: the whole tree back to front, the pointer, then the
    // build-version page. Nothing without a desktop.
    virtual void draw() = 0;
    // The console; not after shutdown.
    virtual IConsole *get_console() = 0;
    // The page of that name, made when there is none yet. The service owns it.
    virtual IStatsPage *create_stats_page(char const *_name) = 0;
    // How many pages exist, in order of creation.
    virtual unsigned get_stats_pages_count() = 0;
    // The page at that index, null when out of range.
    virtual IStatsPage *get_stats_page(unsigned _idx) = 0;
    // The first page with exactly that name, null if there is none.
    virtual IStatsPage *get_stats_page(char const *_name) = 0;
    // The desktop; null before init and after shutdown.
    virtual CDesktop *get_desktop() = 0;
    // The application lost (false) or won back (true) the focus; losing it sends
    // EVENT_LOST_FOCUS through the desktop.
    virtual void on_app_activate(bool _active) = 0;
    // The text of a key of the strings file; null when the key isn't there. The table owns it.
    virtual unsigned short const *get_local_string(char const *_key) = 0;
    // The first key, in key order, whose text equals _text exactly; null if none.
    virtual char const *get_local_key(unsigned short const *_text) = 0;
    // The desktop's width and height over the screen's; 1.0 without a desktop.
    // @{
    virtual float get_scale_w() = 0;
    virtual float get_scale_h() = 0;
    // @}
    // The earliest made page that is shown, null if none is.
    virtual IStatsPage *get_current_stats_page() = 0;
    // The argument of init.
    virtual bool get_hide_console() = 0;
    // Always null; kept for the engine's interface layout.
    virtual void *get_reserved() = 0;
};

// The engine-wide hierarchical timer.
class ITimeProfiler : public IInterfaceBase {
public:
    // A new node under the innermost open one (or a new root); the profiler owns it. Each
    // call makes a new node, so callers keep the pointer.
    virtual CTimeProfilerNode *create_node(char const *_name) = 0;
    virtual CTimeProfilerNode *get_root() = 0; // always null
    // Opens a measurement of the node; end closes the innermost one. Pairs must match; while
    // disabled they only keep the nesting.
    // @{
    virtual void begin(CTimeProfilerNode *_p_node) = 0;
    virtual void end() = 0;
    // @}
    virtual void reset_node(CTimeProfilerNode *_p_node) = 0; // no effect
    // Switches the taking of time on or off.
    // @{
    virtual void enable() = 0;
    virtual void disable() = 0;
    // @}
    // Prints the tree of nodes with their mean and total times to the page, a line each; the
    // second argument is unused.
    virtual void dump(IStatsPage *_p_page, int _reserved) = 0;
};

} // namespace qorui

// The library's entry point: the engine calls it once after loading the module.
extern "C" int RegisterInterface(IInterfaceServer *_p_server);
