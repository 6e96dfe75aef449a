// qorbase: the GDF registry, the file system with its categories, configuration files and the
// file reader's cache.
//
//   GDF registry ..... the engine's configuration file, read at first use, written back at exit
//   File system ...... category roots, whole-file loads and atomic saves, readers, the log
//   Entry points ..... the module's exported functions
#include "qorbase.h"

#include "config_file.h"
#include "qorMemoryManager.h"
#include "qordebug.h"

#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <map>
#include <string>
#include <unistd.h>
#include <vector>

namespace qorbase {

namespace {

// ---------------------------------------------------------------------------------------------
// GDF registry
// ---------------------------------------------------------------------------------------------

class CGDFRegistry : public IGDFRegistry {
public:
    // A missing file gives an empty registry: every section is missing and getters give defaults.
    // Changes go to _write_path ("" for nowhere).
    CGDFRegistry(std::string const &_path, std::string const &_write_path) : m_write_path(_write_path) {
        std::string text;
        if (read_text_file(_path, text))
            m_file.parse(text);
        else
            qordebug::warning("Cannot read the configuration file '%s'", _path.c_str());
    }
    ~CGDFRegistry() { flush(); }

    IConfigFile *get_config() override { return &m_file; }

    // Pending changes go to the file at once, or not at all.
    void flush() {
        if (!m_file.is_dirty() || m_write_path.empty()) return;
        std::string const text = m_file.write();
        if (write_file_atomically(m_write_path, text.data(), text.size()))
            m_file.clear_dirty();
        else
            qordebug::warning("Cannot write the configuration file '%s': %s", m_write_path.c_str(),
                              strerror(errno));
    }

private:
    // The registry's own file: close never deletes it.
    class CRegistryFile : public CConfigFile {
    public:
        void close(bool) override {}
    };

    std::string m_write_path;
    CRegistryFile m_file;
};

std::string g_gdf_path;
bool g_gdf_path_set = false;
std::string g_gdf_write_path;
bool g_gdf_write_path_set = false;
CGDFRegistry *gp_registry = nullptr;

// Deleting the registry at process end writes back what was set. Defined after g_gdf_path, so
// it is destroyed before it.
struct SRegistryKeeper {
    ~SRegistryKeeper() {
        delete gp_registry;
        gp_registry = nullptr;
    }
} g_registry_keeper;

std::string gdf_path() {
    if (g_gdf_path_set) return g_gdf_path;
    char const *path = getenv("QOR_GDF");
    return path && *path ? path : "qor.gdf";
}

// ---------------------------------------------------------------------------------------------
// File system
// ---------------------------------------------------------------------------------------------

std::map<int, std::string> &category_roots() {
    static std::map<int, std::string> s_roots;
    return s_roots;
}

log_sink_t gp_log_sink = nullptr;
void *gp_log_user = nullptr;

// This module's heap, for the contents that load_file hands out. Should the manager refuse a
// heap, the id -1 makes it use its default heap.
int file_heap() {
    static int s_heap = MMHeapCreate(0x100000, 0x100000);
    return s_heap;
}

std::string full_path(int _category, char const *_path) {
    char path[4096];
    make_path(_category, _path, path, sizeof(path));
    return path;
}

class CFileReader : public IFileReader {
public:
    CFileReader(int _fd, unsigned _size) : m_fd(_fd) { m_size = _size; }
    ~CFileReader() override { close(m_fd); }

    void seek(unsigned _position) override { lseek(m_fd, static_cast<off_t>(_position), SEEK_SET); }

    unsigned read(unsigned _count, void *_p_buffer) override {
        if (!_p_buffer) return 0;
        char *p = static_cast<char *>(_p_buffer);
        unsigned done = 0;
        while (done < _count) {
            ssize_t const count = ::read(m_fd, p + done, _count - done);
            if (count < 0 && errno == EINTR) continue;
            if (count <= 0) break; // the end of the file, or an error: what was read counts
            done += static_cast<unsigned>(count);
        }
        return done;
    }

private:
    int m_fd;
};

class CFileSystem : public IFileSystem {
public:
    unsigned load_file(int _category, char const *_path, void **_pp_content, bool _quiet) override {
        std::string const path = full_path(_category, _path);
        size_t size = 0;
        int const fd = _path ? open_regular_file(path, &size) : -1;
        if (fd < 0) {
            if (!_quiet) qordebug::warning("Cannot load file '%s'", path.c_str());
            return 0;
        }
        if (size >= UINT_MAX) { // the size has to fit the result, with the terminator behind it
            close(fd);
            qordebug::warning("Cannot load file '%s': too large", path.c_str());
            return 0;
        }
        if (!_pp_content) { // the existence test
            close(fd);
            return static_cast<unsigned>(size);
        }
        MMHeapSelect(file_heap());
        char *p_content = static_cast<char *>(MMAllocate(size + 1, 0));
        bool const read = p_content && read_exactly(fd, p_content, size);
        close(fd);
        if (!read) {
            MMDeallocate(p_content);
            qordebug::warning("Cannot read file '%s'", path.c_str());
            return 0;
        }
        p_content[size] = '\0'; // behind the content, so text parsers can stop at it
        *_pp_content = p_content;
        return static_cast<unsigned>(size);
    }

    void save_file(int _category, char const *_path, void const *_p_data, unsigned _size, int) override {
        SFileToSave const file = {_category, _path, _p_data, _size};
        save_files(&file, 1);
    }

    bool save_files(SFileToSave const *_p_files, unsigned _count) override {
        std::vector<SFileContent> contents;
        for (unsigned i = 0; i < _count; ++i) {
            SFileToSave const &file = _p_files[i];
            if (!file.mp_path || (!file.mp_data && file.m_size)) {
                qordebug::assert_func("Expression:   %s, \nFile: %s \nLine: %d\nFunction %s",
                                      "_path && (_p_data || !_size)", __FILE__, __LINE__, __func__);
                return false;
            }
            contents.push_back(
                SFileContent{full_path(file.m_category, file.mp_path), file.mp_data, file.m_size});
        }
        if (write_files_atomically(contents.data(), contents.size())) return true;
        int const error = errno;
        for (SFileContent const &content : contents)
            qordebug::warning("Cannot save file '%s': %s", content.m_path.c_str(), strerror(error));
        return false;
    }

    // The sink gets the line without its line break; stdout gets one after every line.
    void log(char const *_format, ...) override {
        char line[2048];
        va_list args;
        va_start(args, _format);
        vsnprintf(line, sizeof(line), _format ? _format : "", args);
        va_end(args);
        size_t length = strlen(line);
        while (length > 0 && (line[length - 1] == '\n' || line[length - 1] == '\r'))
            line[--length] = '\0';
        if (gp_log_sink) {
            gp_log_sink(line, gp_log_user);
        } else {
            printf("%s\n", line);
            fflush(stdout);
        }
    }

    IFileReader *open_file(int _category, char const *_path) override {
        if (!_path) return nullptr;
        size_t size = 0;
        int const fd = open_regular_file(full_path(_category, _path), &size);
        if (fd < 0) return nullptr;
        if (size >= UINT_MAX) {
            close(fd);
            return nullptr;
        }
        return new CFileReader(fd, static_cast<unsigned>(size));
    }
};

unsigned const k_cache_size = 64 * 1024;

} // namespace

// ---------------------------------------------------------------------------------------------
// Entry points
// ---------------------------------------------------------------------------------------------

void set_gdf_path(char const *_path, char const *_write_path) {
    delete gp_registry; // writes back what is pending
    gp_registry = nullptr;
    g_gdf_path = _path ? _path : "";
    g_gdf_path_set = _path != nullptr;
    g_gdf_write_path = _write_path ? _write_path : "";
    g_gdf_write_path_set = _write_path != nullptr;
}

void flush_gdf() {
    if (gp_registry) gp_registry->flush();
}

void set_category_root(int _category, char const *_folder) {
    category_roots()[_category] = _folder ? _folder : "";
}

char const *get_category_root(int _category) {
    auto found = category_roots().find(_category);
    return found == category_roots().end() ? "" : found->second.c_str();
}

void make_path(int _category, char const *_path, char *_p_out, unsigned _size) {
    if (!_p_out || !_size) return;
    char const *root = get_category_root(_category);
    char const *path = _path ? _path : "";
    bool const needs_slash = *root && root[strlen(root) - 1] != '/';
    snprintf(_p_out, _size, "%s%s%s", root, needs_slash ? "/" : "", path);
}

IConfigSection *find_config_section(char const *_section) {
    IConfigFile *p_config = _section ? GetGDFRegistry()->get_config() : nullptr;
    return p_config ? p_config->get_section(_section) : nullptr;
}

char const *get_config_string(char const *_section, char const *_key, char const *_default) {
    IConfigSection *p_section = find_config_section(_section);
    IConfigValue *p_value = p_section && _key ? p_section->get_value(_key, false) : nullptr;
    return p_value ? p_value->get_string(_default) : _default;
}

void set_log_sink(log_sink_t _sink, void *_user) {
    gp_log_sink = _sink;
    gp_log_user = _sink ? _user : nullptr;
}

} // namespace qorbase

IGDFRegistry *GetGDFRegistry() {
    using namespace qorbase;
    if (!gp_registry) {
        std::string const path = gdf_path();
        gp_registry = new CGDFRegistry(path, g_gdf_write_path_set ? g_gdf_write_path : path);
    }
    return gp_registry;
}

IFileSystem *GetFileSystem() {
    static qorbase::CFileSystem s_file_system;
    return &s_file_system;
}

IConfigFile *ReadConfigFile(int _category, char const *_file_name, int) {
    if (!_file_name) return nullptr;
    std::string text;
    if (!qorbase::read_text_file(qorbase::full_path(_category, _file_name), text)) return nullptr;
    qorbase::CConfigFile *p_file = new qorbase::CConfigFile;
    p_file->parse(text);
    return p_file;
}

// The cache buffers come from the C heap: they never cross into the UI library's allocator, as
// cache_release is the only way back.
bool CCachedFileReader::cache_create(void **_pp_buffer, unsigned *_p_size) {
    if (!_pp_buffer || !_p_size) return false;
    *_pp_buffer = malloc(qorbase::k_cache_size);
    if (!*_pp_buffer) return false;
    *_p_size = qorbase::k_cache_size;
    return true;
}

void CCachedFileReader::cache_release(void *_p_buffer) {
    free(_p_buffer);
}
