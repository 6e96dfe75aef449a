// qorhost: the reference engine. Loads libqorui.so, runs its frames headless and writes each
// presented frame as a PNG file, or with --window shows them in a window that gives the input.
#include "host.h"
#ifdef QORHOST_WITH_SDL2
#include "window_host.h"
#endif

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

namespace {

void usage() {
    fprintf(stderr, "usage: qorhost [--data DIR] [--size WxH] [--frames N] [--out DIR] [--script FILE] "
                    "[--window] [--quiet] [+command args ...]\n");
}

// Result false on a bad argument. A window runs until it is closed unless --frames is given.
bool parse(int _argc, char **_argv, qorhost::SHostOptions &_options) {
    bool frames_given = false;
    for (int i = 1; i < _argc; ++i) {
        std::string const argument = _argv[i];
        bool const has_value = i + 1 < _argc;
        if (argument == "--data" && has_value) {
            _options.m_data = _argv[++i];
        } else if (argument == "--out" && has_value) {
            _options.m_out = _argv[++i];
        } else if (argument == "--frames" && has_value) {
            char *end = nullptr;
            long const frames = strtol(_argv[++i], &end, 10);
            if (*end || frames < 0) return false;
            _options.m_frames = static_cast<unsigned>(frames);
            frames_given = true;
        } else if (argument == "--size" && has_value) {
            if (sscanf(_argv[++i], "%dx%d", &_options.m_w, &_options.m_h) != 2 || _options.m_w <= 0 ||
                _options.m_h <= 0)
                return false;
        } else if (argument == "--script" && has_value) {
            _options.m_script = _argv[++i];
        } else if (argument == "--quiet") {
            _options.m_quiet = true;
        } else if (argument == "--window") {
            _options.m_window = true;
        } else if (argument.size() > 1 && argument[0] == '+') {
            // "+name" and the words up to the next "+..." make one command line.
            std::string line = argument.substr(1);
            while (i + 1 < _argc && _argv[i + 1][0] != '+')
                line += std::string(" ") + _argv[++i];
            _options.m_commands.push_back(line);
        } else {
            return false;
        }
    }
    if (_options.m_window) {
        _options.m_manual_clock = false; // a person is watching: real time
        if (!frames_given) _options.m_frames = 0;
    }
    if (_options.m_window && !_options.m_script.empty()) {
        fprintf(stderr, "qorhost: --script plays headless, on the host's own clock; not with --window\n");
        return false;
    }
    return true;
}

} // namespace

int main(int _argc, char **_argv) {
    qorhost::SHostOptions options;
    if (!parse(_argc, _argv, options)) {
        usage();
        return 2;
    }
#ifndef QORHOST_WITH_SDL2
    if (options.m_window) {
        fprintf(stderr, "qorhost: this build has no window: SDL2 was not found when it was built\n");
        return 2;
    }
#endif
    qorhost::CHost host(options);
    if (!host.load_ui()) {
        fprintf(stderr, "qorhost: libqorui.so could not be loaded\n");
        return 1;
    }
    host.load_frame_timer("libqorhost_graph_profiler.so"); // the command "graph_profiler"
#ifdef QORHOST_WITH_SDL2
    if (options.m_window) return qorhost::run_window(host);
#endif
    return host.run();
}
