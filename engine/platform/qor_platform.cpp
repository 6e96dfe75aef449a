// The platform layer over Linux: monotonic clocks, dlopen, and stderr for message boxes.
#include "qor_platform.h"

#include <cstdio>
#include <cstring>
#include <ctime>
#include <dlfcn.h>

namespace qorplatform {

namespace {

IClock *gp_clock = nullptr;
char g_module_error[512] = "";

int64_t monotonic_ns() {
    timespec now;
    clock_gettime(CLOCK_MONOTONIC, &now);
    return int64_t(now.tv_sec) * 1000000000 + now.tv_nsec;
}

} // namespace

uint32_t get_tick_count() {
    if (gp_clock) return gp_clock->tick_count();
    return static_cast<uint32_t>(monotonic_ns() / 1000000); // wraps, as a 32-bit tick count does
}

int64_t query_performance_counter() { return gp_clock ? gp_clock->performance_counter() : monotonic_ns(); }

int64_t query_performance_frequency() { return 1000000000; }

void set_clock(IClock *_p_clock) { gp_clock = _p_clock; }

void *load_library(char const *_file_name) {
    if (!_file_name) return nullptr;
    void *module = dlopen(_file_name, RTLD_NOW | RTLD_LOCAL);
    if (!module) {
        char const *error = dlerror();
        snprintf(g_module_error, sizeof(g_module_error), "%s", error ? error : "unknown error");
    }
    return module;
}

void *get_proc_address(void *_module, char const *_name) {
    if (!_module || !_name) return nullptr;
    dlerror();
    void *symbol = dlsym(_module, _name);
    if (!symbol) {
        char const *error = dlerror();
        snprintf(g_module_error, sizeof(g_module_error), "%s", error ? error : "symbol not found");
    }
    return symbol;
}

void free_library(void *_module) {
    if (_module) dlclose(_module);
}

char const *last_module_error() { return g_module_error; }

void message_box(char const *_text, char const *_caption) {
    fprintf(stderr, "%s: %s\n", _caption ? _caption : "", _text ? _text : "");
    fflush(stderr);
}

} // namespace qorplatform
