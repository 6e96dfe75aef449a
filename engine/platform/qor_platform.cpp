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

// Keeps a copy of the loader's last error: dlerror() forgets it once read.
void keep_error(char const *_fallback) {
    char const *error = dlerror();
    snprintf(g_module_error, sizeof(g_module_error), "%s", error ? error : _fallback);
}

} // namespace

uint32_t get_tick_count() {
    if (gp_clock) return gp_clock->tick_count();
    return static_cast<uint32_t>(monotonic_ns() / 1000000); // wraps, as a 32-bit tick count does
}

int64_t query_performance_counter() {
    return gp_clock ? gp_clock->performance_counter() : monotonic_ns();
}

int64_t query_performance_frequency() {
    return 1000000000;
}

void set_clock(IClock *_p_clock) {
    gp_clock = _p_clock;
}

// A null file name would give the program itself; here it is a failure.
void *load_library(char const *_file_name) {
    if (!_file_name) {
        snprintf(g_module_error, sizeof(g_module_error), "no file name");
        return nullptr;
    }
    void *module = dlopen(_file_name, RTLD_NOW | RTLD_LOCAL);
    if (!module) keep_error("unknown error");
    return module;
}

void *get_proc_address(void *_module, char const *_name) {
    if (!_module || !_name) {
        snprintf(g_module_error, sizeof(g_module_error), "%s", _module ? "no symbol name" : "no module");
        return nullptr;
    }
    dlerror(); // a null symbol is an error only if dlerror says so afterwards
    void *symbol = dlsym(_module, _name);
    if (!symbol) keep_error("symbol is null");
    return symbol;
}

void free_library(void *_module) {
    if (_module && dlclose(_module) != 0) keep_error("unknown error");
}

char const *last_module_error() {
    return g_module_error;
}

void message_box(char const *_text, char const *_caption) {
    fprintf(stderr, "%s: %s\n", _caption ? _caption : "", _text ? _text : "");
    fflush(stderr);
}

} // namespace qorplatform
