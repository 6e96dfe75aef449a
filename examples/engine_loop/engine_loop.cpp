// engine_loop: the least an engine does to run qorui without qorhost. It provides the interfaces
// the library needs on an interface server of its own, points the engine modules at a data
// folder, calls RegisterInterface and init, runs frames of update and draw, feeds input through
// the library's listeners, and shuts down.
//
//   engine_loop DATA_FOLDER
//
// The data folder's configuration names the game interface library (for example the data folder
// that the gameui_hello example builds); the engine runs its command "hello_scene", clicks the
// button twice through the input listeners and prints what the counter shows. The renderer here
// only counts what it is given: a real engine draws those quads with its own renderer.
#include "qor_commands.h"
#include "qor_input.h"
#include "qor_interfaces.h"
#include "qor_log.h"
#include "qor_platform.h"
#include "qor_render.h"
#include "qorbase.h"
#include "ui_desktop.h"
#include "ui_interfaces.h"
#include "ui_static_text.h"

#include <algorithm>
#include <cstdio>
#include <dlfcn.h>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace {

// ---------------------------------------------------------------------------------------------
// The interface server: modules register interfaces and find each other's
// ---------------------------------------------------------------------------------------------

class CServer : public IInterfaceServer {
public:
    explicit CServer(std::string const &_modules_folder) : m_modules_folder(_modules_folder) {}

    IInterfaceBase *query_interface(SInterfaceUID _uid, int _version) override {
        for (IInterfaceBase *p_interface : m_interfaces)
            if (p_interface->get_uid() == _uid && p_interface->get_version() == _version) return p_interface;
        return nullptr;
    }
    int register_interface(IInterfaceBase *_p_interface) override {
        if (!_p_interface) return -1;
        if (std::find(m_interfaces.begin(), m_interfaces.end(), _p_interface) != m_interfaces.end()) return 0;
        m_interfaces.push_back(_p_interface);
        for (IInterfaceServerListener *p_listener : m_listeners)
            p_listener->_isv_action(ISA_REGISTERED, _p_interface);
        return 1;
    }
    // The UI library loads the game interface library through this, by the configuration's name.
    void load_module(int, char const *_library_name) override {
        std::string const path = m_modules_folder + "/" + _library_name;
        void *p_module = dlopen(path.c_str(), RTLD_NOW);
        if (!p_module) {
            fprintf(stderr, "engine_loop: %s\n", dlerror());
            return;
        }
        if (void *p_entry = dlsym(p_module, "RegisterInterface"))
            reinterpret_cast<register_interface_fn>(p_entry)(this);
    }
    void add_listener(IInterfaceServerListener *_p_listener) override { m_listeners.push_back(_p_listener); }
    void remove_listener(IInterfaceServerListener *_p_listener) override {
        m_listeners.erase(std::remove(m_listeners.begin(), m_listeners.end(), _p_listener),
                          m_listeners.end());
    }
    // Listeners drop their pointers to the interface before it goes.
    void withdraw_interface(IInterfaceBase *_p_interface) override {
        std::vector<IInterfaceServerListener *> const listeners = m_listeners;
        for (IInterfaceServerListener *p_listener : listeners)
            p_listener->_isv_action(ISA_WITHDRAWN, _p_interface);
        m_interfaces.erase(std::remove(m_interfaces.begin(), m_interfaces.end(), _p_interface),
                           m_interfaces.end());
    }
    void withdraw_all() {
        while (!m_interfaces.empty())
            withdraw_interface(m_interfaces.back());
    }

private:
    std::string m_modules_folder;
    std::vector<IInterfaceBase *> m_interfaces;
    std::vector<IInterfaceServerListener *> m_listeners;
};

// An interface answers to its identifier, version 1.
template <class TInterface, SInterfaceUID const &t_uid>
class CInterface : public TInterface {
public:
    SInterfaceUID get_uid() const override { return t_uid; }
    int get_version() const override { return 1; }
};

// ---------------------------------------------------------------------------------------------
// Input: the library adds its listeners; the engine calls them with the platform's input
// ---------------------------------------------------------------------------------------------

class CInput : public CInterface<IInputSystem, qor_uid::INPUT_SYSTEM> {
public:
    void add_pointer_listener(IPointerListener *_p_listener) override { m_pointer.push_back(_p_listener); }
    void remove_pointer_listener(IPointerListener *_p_listener) override {
        m_pointer.erase(std::remove(m_pointer.begin(), m_pointer.end(), _p_listener), m_pointer.end());
    }
    void add_key_listener(IKeyListener *_p_listener) override { m_keys.push_back(_p_listener); }
    void remove_key_listener(IKeyListener *_p_listener) override {
        m_keys.erase(std::remove(m_keys.begin(), m_keys.end(), _p_listener), m_keys.end());
    }

    // Relative movement in screen pixels, buttons 0 (left), 1 (right), 2 (middle).
    void move(float _dx, float _dy) {
        for (IPointerListener *p_listener : m_pointer)
            p_listener->on_pointer_move(vec2_t{_dx, _dy});
    }
    void click(unsigned _button) {
        for (IPointerListener *p_listener : m_pointer)
            p_listener->on_button_down(_button);
        for (IPointerListener *p_listener : m_pointer)
            p_listener->on_button_up(_button);
    }

private:
    std::vector<IPointerListener *> m_pointer;
    std::vector<IKeyListener *> m_keys;
};

// ---------------------------------------------------------------------------------------------
// Commands and variables: the library registers its commands; it reads scr_resx and scr_resy
// ---------------------------------------------------------------------------------------------

class CCommands : public CInterface<ICmdManagerBase, qor_uid::CMD_MANAGER> {
public:
    void register_command(char const *_name, command_callback_t _callback, void *_user) override {
        m_commands[_name] = {_callback, _user};
    }
    void unregister_command(char const *_name) override { m_commands.erase(_name); }
    bool execute(char const *_name, char const *_arguments, bool) override {
        auto const found = m_commands.find(_name);
        if (found == m_commands.end()) return false;
        found->second.first(_arguments ? _arguments : "", found->second.second);
        return true;
    }
    char const *find_first_command(char const *_prefix) override { return find_after(_prefix, ""); }
    char const *find_next_command(char const *_name, bool) override { return find_after("", _name); }

private:
    // The first name after _after that starts with _prefix; the console completes names with it.
    char const *find_after(std::string const &_prefix, std::string const &_after) {
        for (auto const &command : m_commands)
            if (command.first > _after && command.first.compare(0, _prefix.size(), _prefix) == 0)
                return command.first.c_str();
        return nullptr;
    }

    std::map<std::string, std::pair<command_callback_t, void *>> m_commands;
};

class CVariables : public CInterface<IVarManagerBase, qor_uid::VAR_MANAGER> {
public:
    SVariable const *find_var(char const *_name) override {
        auto const found = m_vars.find(_name);
        return found == m_vars.end() ? nullptr : &found->second.m_record;
    }
    char const *find_first_var(char const *) override { return nullptr; }
    char const *find_next_var(char const *, bool) override { return nullptr; }
    void set_var(char const *_name, char const *_value) override {
        SVar &var = m_vars[_name];
        var.m_name = _name;
        var.m_value = _value;
        var.m_record = {var.m_name.c_str(), var.m_value.c_str(), std::atoi(_value),
                        static_cast<float>(std::atof(_value))};
    }

private:
    struct SVar {
        std::string m_name, m_value;
        SVariable m_record;
    };
    std::map<std::string, SVar> m_vars;
};

// ---------------------------------------------------------------------------------------------
// The log: named loggers whose lines are printed and kept; the console reads them back
// ---------------------------------------------------------------------------------------------

class CLog : public CInterface<ILogManager, qor_uid::LOG_MANAGER> {
public:
    ILogger *create_logger(char const *_name, char const *_prefix) override {
        m_loggers.push_back(std::make_unique<CLogger>(*this, _name, _prefix ? _prefix : ""));
        return m_loggers.back().get();
    }
    ILogger *find_logger(char const *_name) override {
        for (auto const &p_logger : m_loggers)
            if (p_logger->m_name == _name) return p_logger.get();
        return nullptr;
    }
    void get_messages(ILogMessageVisitor &_visitor, unsigned _first, int _count) override {
        for (unsigned i = _first; i < m_messages.size() && (_count < 0 || i < _first + unsigned(_count)); ++i)
            _visitor.on_message(SLogMessage{m_messages[i].first.c_str(), m_messages[i].second, i});
    }

private:
    class CLogger : public ILogger {
    public:
        CLogger(CLog &_log, std::string const &_name, std::string const &_prefix)
            : m_name(_name), m_prefix(_prefix), m_log(_log) {}
        char const *get_name() const override { return m_name.c_str(); }
        void set_active(bool _active) override { m_active = _active; }
        // 16-bit text as the log keeps it; only ASCII is printed here.
        void write(unsigned short const *_text, int _level) override {
            std::string narrow;
            for (unsigned short const *p = _text; p && *p; ++p)
                narrow += *p < 128 ? char(*p) : '?';
            write(narrow.c_str(), _level);
        }
        void write(char const *_text, int _level) override {
            if (!m_active || !_text) return;
            std::string const line = m_prefix + _text;
            printf("%s\n", line.c_str());
            m_log.m_messages.emplace_back(std::basic_string<unsigned short>(line.begin(), line.end()),
                                          unsigned(_level));
        }

        std::string m_name, m_prefix;

    private:
        CLog &m_log;
        bool m_active = true;
    };

    std::vector<std::unique_ptr<CLogger>> m_loggers;
    std::vector<std::pair<std::basic_string<unsigned short>, unsigned>> m_messages;
};

// ---------------------------------------------------------------------------------------------
// The renderer: materials by handle, quads and lines in device coordinates, clip rectangles
// ---------------------------------------------------------------------------------------------

class CRenderer : public CInterface<IRenderQOR, qor_uid::RENDER> {
public:
    void render_view(IRenderCamera *) override {}
    void finish_view() override {}
    void present() override { ++m_frames; }
    int create_material(char const *, char const *, char const *, char const *, char const *, char const *,
                        bool, bool) override {
        return m_next_handle++;
    }
    void destroy_material(int) override {}
    IAviTexture *get_avi_texture(int) override { return nullptr; }
    void begin_2d() override { m_quads = m_lines = 0; }
    void end_2d() override {}
    void set_material(int) override {}
    void draw_quad(vec2_t const &, vec2_t const &, rgba_t const &, vec2_t const &, vec2_t const &,
                   rgba_t const &, vec2_t const &, vec2_t const &, rgba_t const &, vec2_t const &,
                   vec2_t const &, rgba_t const &) override {
        ++m_quads;
    }
    void set_clip_rect(vec2_t const &, vec2_t const &) override {}
    void push_clip_rect() override {}
    void pop_clip_rect() override {}
    void draw_line(vec2_t const &, rgba_t const &, vec2_t const &, rgba_t const &, float) override {
        ++m_lines;
    }

    unsigned m_frames = 0, m_quads = 0, m_lines = 0;

private:
    int m_next_handle = 1;
};

// The engine's parts live as long as the process: the library's statics, which end after main,
// may still speak to the server.
CServer *gp_server = nullptr;
CInput g_input;
CCommands g_commands;
CVariables g_variables;
CRenderer g_renderer;
CLog g_log;
// Frames 16 ms apart on a clock that only moves between frames, so the example runs in no time
// and the same way every time (windows fade in over 150 ms before they take the pointer). A real
// engine leaves the system clock in place.
qorplatform::CManualClock g_clock;

} // namespace

int main(int _argc, char **_argv) {
    if (_argc != 2) {
        fprintf(stderr, "usage: engine_loop DATA_FOLDER\n");
        return 2;
    }
    std::string const data = _argv[1];
    qorplatform::set_clock(&g_clock);
    // The engine modules' file categories and the configuration.
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, data.c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (data + "/ui").c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (data + "/fonts").c_str());
    qorbase::set_gdf_path((data + "/qor.gdf").c_str(), ""); // nothing is written back
    g_variables.set_var("scr_resx", "1024");
    g_variables.set_var("scr_resy", "768");

    gp_server = new CServer(data);
    for (IInterfaceBase *p_interface :
         std::initializer_list<IInterfaceBase *>{&g_input, &g_commands, &g_variables, &g_renderer, &g_log})
        gp_server->register_interface(p_interface);
    // The library is linked to this program; an engine may as well load it with dlopen.
    RegisterInterface(gp_server);
    auto *p_ui = static_cast<qorui::IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
    if (!p_ui) return 1;

    p_ui->init(false);                            // loads the game interface library, makes the desktop
    g_commands.execute("hello_scene", "", false); // the game builds its scene on the desktop
    g_input.move(0, 62); // from the desktop's centre, where the pointer starts, onto the button
    for (int frame = 0; frame < 20; ++frame) {
        if (frame == 12 || frame == 16) g_input.click(0);
        p_ui->update(frame * 16); // milliseconds since the start
        p_ui->draw();
        g_renderer.present();
        g_clock.advance_ms(16);
    }
    qorui::CStaticText *p_counter = qorui::class_cast<qorui::CStaticText>(
        p_ui->get_desktop()->get_child("counter", "ClickCounter", false));
    printf("%u frames presented, %u quads and %u lines in the last; the counter shows \"%s\"\n",
           g_renderer.m_frames, g_renderer.m_quads, g_renderer.m_lines,
           p_counter ? p_counter->get_text().get_c() : "(no counter)");
    p_ui->shutdown();
    gp_server->withdraw_all();
    qorplatform::set_clock(nullptr);
    return 0;
}
