// qorbase: the engine's configuration (the GDF registry) and its virtual file system.
//
// The GDF file is INI-like: "[section]" lines, then "key = value" lines; "; " and "# " start a
// comment line. Values are text; get_int and get_vec2 parse them ("20, 30" for a vec2).
// set_vec2 changes the value in memory and marks the file; the file is written back once at
// process end (or by qorbase::flush_gdf), through a temporary file and a rename, so it is never
// left half-written.
//
// File categories select root folders: 2 (stats output), 5 (configuration), 8 (fonts),
// 16 (interface data). The host sets them; by default all are the current directory.
#pragma once
#include "qor_math.h"

#include <cstddef>
#include <string>

// One value of a configuration file.
class IConfigValue {
public:
    // The value read as "x, y"; the defaults when the key has no content or no number.
    virtual vec2_t get_vec2(float _default_x, float _default_y) = 0;
    // The value read as an integer; the default when the key has no content or no number.
    virtual int get_int(int _default_value) = 0;
    // Owned by the value; valid until the value changes or its file is closed.
    virtual char const *get_string(char const *_default_value) = 0;
    // Stores "x, y" and marks the file for writing back.
    virtual void set_vec2(float _x, float _y) = 0;
    // Not used by the UI library:
    // Stores the text as it stands.
    virtual void set_string(char const *_value) = 0;
    // False for a key made by get_value with _create and never set.
    virtual bool has_content() const = 0;

protected:
    virtual ~IConfigValue() {}
};

// One "[section]" of a configuration file.
class IConfigSection {
public:
    // With _create true a missing key is added without content; otherwise null.
    virtual IConfigValue *get_value(char const *_name, bool _create) = 0;

protected:
    virtual ~IConfigSection() {}
};

// A configuration file of the GDF format.
class IConfigFile {
public:
    // Null when there's no section of that name.
    virtual IConfigSection *get_section(char const *_name) = 0;
    // With _destroy true the object is deleted; don't touch it afterwards.
    virtual void close(bool _destroy) = 0;

protected:
    virtual ~IConfigFile() {}
};

// The engine's configuration file.
class IGDFRegistry {
public:
    // The engine's GDF file; null when it couldn't be read. The registry owns it.
    virtual IConfigFile *get_config() = 0;

protected:
    virtual ~IGDFRegistry() {}
};

// A stream over one file. m_size is the file's size in bytes.
class IFileReader {
public:
    // The file's size in bytes.
    unsigned m_size = 0;

    // Closes the file.
    virtual ~IFileReader() {}
    // The next read starts _position bytes from the start.
    virtual void seek(unsigned _position) = 0;
    // Result: bytes read, fewer at the end of the file.
    virtual unsigned read(unsigned _count, void *_p_buffer) = 0;
};

// One file of IFileSystem::save_files.
struct SFileToSave {
    int m_category;      // the category whose folder the path is relative to
    char const *mp_path; // the file's path in the category
    void const *mp_data; // the bytes to write, _size of them
    unsigned m_size;     // in bytes
};

// The engine's files by category, and its log.
class IFileSystem {
public:
    // Result: the file's size, 0 when there's none. *_pp_content takes the content, allocated
    // with MMAllocate; the caller frees it with MMDeallocate. The caller sets *_pp_content to null
    // first; null after the call means the file couldn't be read. With a null _pp_content and
    // _quiet true the call only tests whether the file exists. Without _quiet, a missing file is
    // reported with qordebug::warning.
    virtual unsigned load_file(int _category, char const *_path, void **_pp_content, bool _quiet) = 0;
    // Writes through a temporary file and a rename; folders are created as needed.
    virtual void save_file(int _category, char const *_path, void const *_p_data, unsigned _size,
                           int _reserved) = 0;
    // Several files replaced together (qorbase::write_files_atomically): none when any fails,
    // which is reported with qordebug::warning.
    virtual bool save_files(SFileToSave const *_p_files, unsigned _count) = 0;
    // One line to the engine's log (the installed log sink, stdout by default).
    virtual void log(char const *_format, ...) __attribute__((format(printf, 2, 3))) = 0;
    // Null when the file can't be opened. The caller deletes the reader.
    virtual IFileReader *open_file(int _category, char const *_path) = 0;

protected:
    virtual ~IFileSystem() {}
};

// The engine's configuration, read at the first call; never null.
IGDFRegistry *GetGDFRegistry();
// The engine's files; never null.
IFileSystem *GetFileSystem();
// Parses a configuration file of the GDF format from the category's folder; null when it can't
// be read. Close it with close(true).
IConfigFile *ReadConfigFile(int _category, char const *_file_name, int _reserved);

// A buffered reader over an IFileReader, used by the UI library's loaders. The engine provides
// the cache buffer; the reader itself belongs to the UI library.
class CCachedFileReader {
public:
    // Reads from the start of _p_fr; with _owns_reader the reader is deleted with this object.
    CCachedFileReader(IFileReader *_p_fr, bool _owns_reader);
    // Gives the cache buffer back.
    ~CCachedFileReader();
    CCachedFileReader(CCachedFileReader const &) = delete;
    CCachedFileReader &operator=(CCachedFileReader const &) = delete;

    // True when all _count bytes were delivered; a short read leaves what was copied.
    bool read(void *_p_dst, unsigned _count);

    // The engine's cache buffers: *_pp_buffer and *_p_size (above 0) on success.
    static bool cache_create(void **_pp_buffer, unsigned *_p_size);
    // Gives back a buffer of cache_create; null is ignored.
    static void cache_release(void *_p_buffer);

private:
    bool m_owns_reader;
    IFileReader *mp_reader;
    void *mp_cache;
    unsigned m_cache_start;
    unsigned m_cache_size;
    unsigned m_cache_filled;
    unsigned m_pos;
};

namespace qorbase {

// The file categories of IFileSystem and LuaState::DoFile.
enum { FILE_CATEGORY_STATS = 2, FILE_CATEGORY_CONFIG = 5, FILE_CATEGORY_FONTS = 8, FILE_CATEGORY_UI = 16 };

// The GDF file that GetGDFRegistry reads at its first use, and the file that its changes are
// written back to: null _write_path for the same file, "" for none. Setting a new path drops the
// loaded registry (after writing back pending changes).
void set_gdf_path(char const *_path, char const *_write_path = nullptr);
// Writes pending set_vec2 changes now, atomically. Also runs at process end.
void flush_gdf();

// The folder of a category ("" for the current directory). Unknown categories map to "".
void set_category_root(int _category, char const *_folder);
// The folder set for the category; "" when none was set.
char const *get_category_root(int _category);
// Full path of a file in a category; result in _p_out, truncated to _size.
void make_path(int _category, char const *_path, char *_p_out, unsigned _size);

// A section of the engine's configuration (GetGDFRegistry's); null without the configuration or
// the section.
IConfigSection *find_config_section(char const *_section);
// The text of a key of a section of the engine's configuration; _default without the
// configuration, the section or the key. Reading creates nothing; the text belongs to the
// configuration.
char const *get_config_string(char const *_section, char const *_key, char const *_default);

// Files that must never be seen half-written: each is written to a temporary file beside it,
// flushed to the disk, and renamed over the old one, creating missing folders. With several files
// all temporaries are complete before the first rename; a failure before the renames replaces
// none (errno tells why). False on any failure.
struct SFileContent {
    std::string m_path;  // the full path
    void const *mp_data; // the bytes to write
    size_t m_size;       // how many
};
// Writes the _count files of _p_files together, as above.
bool write_files_atomically(SFileContent const *_p_files, size_t _count);
// One file, as write_files_atomically.
bool write_file_atomically(std::string const &_path, void const *_p_data, size_t _size);

// Where IFileSystem::log writes; null restores stdout.
// @{
typedef void (*log_sink_t)(char const *_line, void *_user);
void set_log_sink(log_sink_t _sink, void *_user);
// @}

} // namespace qorbase
