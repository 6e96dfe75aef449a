// The GDF format: "[section]" lines and "key = value" lines; lines starting with ';' or '#' are
// comments. A file keeps its lines as read, so writing it back changes only the values set.
#pragma once
#include "qorbase.h"

#include <memory>
#include <string>
#include <vector>

namespace qorbase {

class CConfigFile;

class CConfigValue : public IConfigValue {
public:
    CConfigValue(CConfigFile *_p_file, std::string const &_text, bool _has_content)
        : mp_file(_p_file), m_text(_text), m_has_content(_has_content) {}

    vec2_t get_vec2(float _default_x, float _default_y) override;
    int get_int(int _default_value) override;
    char const *get_string(char const *_default_value) override;
    void set_vec2(float _x, float _y) override;
    void set_string(char const *_value) override;
    bool has_content() const override { return m_has_content; }

    std::string const &text() const { return m_text; }

private:
    CConfigFile *mp_file;
    std::string m_text;
    bool m_has_content;
};

class CConfigSection : public IConfigSection {
public:
    CConfigSection(CConfigFile *_p_file, std::string const &_name) : mp_file(_p_file), m_name(_name) {}

    IConfigValue *get_value(char const *_name, bool _create) override;

    struct SEntry {
        std::string m_key;                    // empty for a line that is no key
        std::string m_line;                   // the line as read (comments, blanks)
        std::unique_ptr<CConfigValue> mp_value;
        bool m_from_file;                     // the entry stood in the file
    };
    std::string const &name() const { return m_name; }
    std::vector<SEntry> &entries() { return m_entries; }

private:
    CConfigFile *mp_file;
    std::string m_name;
    std::vector<SEntry> m_entries;
};

class CConfigFile : public IConfigFile {
public:
    CConfigFile() {}
    virtual ~CConfigFile() {}

    IConfigSection *get_section(char const *_name) override;
    void close(bool _destroy) override;

    // Parses text of the GDF format; the previous content goes.
    void parse(std::string const &_text);
    // The file's text: lines as read, with the values that were set in place.
    std::string write() const;

    void mark_dirty() { m_dirty = true; }
    bool is_dirty() const { return m_dirty; }
    void clear_dirty() { m_dirty = false; }

private:
    std::vector<std::string> m_preamble; // lines before the first section
    std::vector<std::unique_ptr<CConfigSection>> m_sections;
    bool m_dirty = false;
};

// Reads a whole file; false when it can't be read.
bool read_text_file(std::string const &_path, std::string &_text);
// Writes through "<path>.tmp", fsync and rename, creating missing folders; false on failure.
bool write_file_atomically(std::string const &_path, void const *_p_data, size_t _size);

} // namespace qorbase
