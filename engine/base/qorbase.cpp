// qorbase: the GDF registry, the file system with its categories, configuration files and the
// file reader cache.
#include "qorbase.h"

#include "config_file.h"
#include "qorMemoryManager.h"
#include "qordebug.h"

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <map>
#include <string>

namespace qorbase {

namespace {

// ---------------------------------------------------------------------------------------------
// The GDF registry
// ---------------------------------------------------------------------------------------------

class CGDFRegistry : public IGDFRegistry {
public:
    explicit CGDFRegistry(std::string const &_path) : m_path(_path) {
        std::string text;
        if (read_text_file(m_path, text))
            m_file.parse(text);
        else
            qordebug::warning("Cannot read the configuration file '%s'", m_path.c_str());
    }
    ~CGDFRegistry() { flush(); }

    IConfigFile *get_config() override { return &m_file; }

    // Pending changes to the file, atomically.
    void flush() {
        if (!m_file.is_dirty()) return;
        std::string const text = m_file.write();
        if (write_file_atomically(m_path, text.data(), text.size()))
            m_file.clear_dirty();
        else
            qordebug::warning("Cannot write the configuration file '%s'", m_path.c_str());
    }

private:
    // The registry's own file: close never deletes it.
    class CRegistryFile : public CConfigFile {
    public:
        void close(bool) override {}
    };

    std::string m_path;
    CRegistryFile m_file;
};

std::string g_gdf_path;
bool g_gdf_path_set = false;
CGDFRegistry *gp_registry = nullptr;

// The registry's file is written back once at process end.
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
// The file system
// ---------------------------------------------------------------------------------------------

std::map<int, std::string> &category_roots() {
    static std::map<int, std::string> s_roots;
    return s_roots;
}

log_sink_t gp_log_sink = nullptr;
void *gp_log_user = nullptr;

// The heap of this module, for the contents handed out by load_file.
int file_heap() {
    static int s_heap = MMHeapCreate(0x100000, 0x100000);
    return s_heap;
}

class CFileReader : public IFileReader {
public:
    CFileReader(FILE *_p_file, unsigned _size) : mp_file(_p_file) { m_size = _size; }
    ~CFileReader() override { fclose(mp_file); }

    void seek(unsigned _position) override { fseek(mp_file, static_cast<long>(_position), SEEK_SET); }
    unsigned read(unsigned _count, void *_p_buffer) override {
        return _p_buffer ? static_cast<unsigned>(fread(_p_buffer, 1, _count, mp_file)) : 0;
    }

private:
    FILE *mp_file;
};

class CFileSystem : public IFileSystem {
public:
    unsigned load_file(int _category, char const *_path, void **_pp_content, bool _quiet) override {
        std::string const path = full_path(_category, _path);
        FILE *in = _path ? fopen(path.c_str(), "rb") : nullptr;
        if (!in) {
            if (!_quiet) qordebug::warning("Cannot load file '%s'", path.c_str());
            return 0;
        }
        fseek(in, 0, SEEK_END);
        long const size = ftell(in);
        fseek(in, 0, SEEK_SET);
        if (size < 0) {
            fclose(in);
            return 0;
        }
        if (_pp_content) {
            MMHeapSelect(file_heap());
            char *p_content = static_cast<char *>(MMAllocate(static_cast<size_t>(size) + 1, 0));
            size_t const read = fread(p_content, 1, static_cast<size_t>(size), in);
            p_content[read] = '\0'; // a terminator behind the content, for text readers
            *_pp_content = p_content;
        }
        fclose(in);
        return static_cast<unsigned>(size);
    }

    void save_file(int _category, char const *_path, void const *_p_data, unsigned _size, int) override {
        if (!_path) return;
        std::string const path = full_path(_category, _path);
        if (!write_file_atomically(path, _p_data, _size)) qordebug::warning("Cannot save file '%s'", path.c_str());
    }

    void log(char const *_format, ...) override {
        char line[2048];
        va_list args;
        va_start(args, _format);
        vsnprintf(line, sizeof(line), _format ? _format : "", args);
        va_end(args);
        if (gp_log_sink) {
            gp_log_sink(line, gp_log_user);
        } else {
            fputs(line, stdout);
            fflush(stdout);
        }
    }

    IFileReader *open_file(int _category, char const *_path) override {
        if (!_path) return nullptr;
        FILE *in = fopen(full_path(_category, _path).c_str(), "rb");
        if (!in) return nullptr;
        fseek(in, 0, SEEK_END);
        long const size = ftell(in);
        fseek(in, 0, SEEK_SET);
        return new CFileReader(in, size > 0 ? static_cast<unsigned>(size) : 0);
    }

private:
    static std::string full_path(int _category, char const *_path) {
        char path[4096];
        make_path(_category, _path ? _path : "", path, sizeof(path));
        return path;
    }
};

unsigned const k_cache_size = 64 * 1024;

} // namespace

void set_gdf_path(char const *_path) {
    if (gp_registry) {
        delete gp_registry; // writes back what is pending
        gp_registry = nullptr;
    }
    g_gdf_path = _path ? _path : "";
    g_gdf_path_set = _path != nullptr;
}

void flush_gdf() {
    if (gp_registry) gp_registry->flush();
}

void set_category_root(int _category, char const *_folder) { category_roots()[_category] = _folder ? _folder : ""; }

char const *get_category_root(int _category) {
    auto found = category_roots().find(_category);
    return found == category_roots().end() ? "" : found->second.c_str();
}

void make_path(int _category, char const *_path, char *_p_out, unsigned _size) {
    if (!_p_out || !_size) return;
    char const *root = get_category_root(_category);
    char const *path = _path ? _path : "";
    if (*root && path[0] != '/')
        snprintf(_p_out, _size, "%s%s%s", root, root[strlen(root) - 1] == '/' ? "" : "/", path);
    else
        snprintf(_p_out, _size, "%s", path);
}

void set_log_sink(log_sink_t _sink, void *_user) {
    gp_log_sink = _sink;
    gp_log_user = _sink ? _user : nullptr;
}

} // namespace qorbase

IGDFRegistry *GetGDFRegistry() {
    using namespace qorbase;
    if (!gp_registry) gp_registry = new CGDFRegistry(gdf_path());
    return gp_registry;
}

IFileSystem *GetFileSystem() {
    static qorbase::CFileSystem s_file_system;
    return &s_file_system;
}

IConfigFile *ReadConfigFile(int _category, char const *_file_name, int) {
    if (!_file_name) return nullptr;
    char path[4096];
    qorbase::make_path(_category, _file_name, path, sizeof(path));
    std::string text;
    if (!qorbase::read_text_file(path, text)) return nullptr;
    qorbase::CConfigFile *p_file = new qorbase::CConfigFile;
    p_file->parse(text);
    return p_file;
}

bool CCachedFileReader::cache_create(void **_pp_buffer, unsigned *_p_size) {
    if (!_pp_buffer || !_p_size) return false;
    *_pp_buffer = malloc(qorbase::k_cache_size);
    if (!*_pp_buffer) return false;
    *_p_size = qorbase::k_cache_size;
    return true;
}

void CCachedFileReader::cache_release(void *_p_buffer) { free(_p_buffer); }
