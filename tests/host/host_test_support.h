// What the host's tests share: a temporary folder for the files a test makes, quiet hosts and the
// category roots they set, little-endian byte writers, WAV files, a record of input, and a
// readable print of colours.
#pragma once
#include "host.h"
#include "input_system.h"
#include "qor_math.h"
#include "qorbase.h"
#include "test_common.h"

#include <cstdint>
#include <cstdio>
#include <functional>
#include <ostream>
#include <string>
#include <vector>

// gtest prints colours as their four bytes.
inline void PrintTo(rgba_t const &_c, std::ostream *_p_out) {
    *_p_out << "rgba(" << int(_c.r) << ", " << int(_c.g) << ", " << int(_c.b) << ", " << int(_c.a) << ")";
}

namespace hosttest {

using qortest::CReportCapture;

typedef std::vector<uint8_t> bytes_t;

// A temporary folder of the test (removed at process end) with writers of its files.
class CTempDir {
public:
    std::string const &path() const { return m_path; }
    std::string file(std::string const &_name) const { return m_path + "/" + _name; }
    // Writes a file of the folder (sub folders are made); result its full path.
    std::string write(std::string const &_name, bytes_t const &_content) const {
        return qortest::write_file(file(_name), std::string(_content.begin(), _content.end()));
    }

private:
    std::string m_path = qortest::make_temp_dir();
};

// A host on the data folder that prints nothing and writes no output.
inline qorhost::SHostOptions quiet_options(std::string const &_data, int _w = 320, int _h = 200) {
    qorhost::SHostOptions options;
    options.m_data = _data;
    options.m_out = "";
    options.m_quiet = true;
    options.m_w = _w;
    options.m_h = _h;
    return options;
}

// The category roots are process-wide: a test that sets them, or runs a host, puts them back.
inline void reset_category_roots() {
    for (int category : {qorbase::FILE_CATEGORY_STATS, qorbase::FILE_CATEGORY_CONFIG,
                         qorbase::FILE_CATEGORY_FONTS, qorbase::FILE_CATEGORY_UI})
        qorbase::set_category_root(category, "");
}

// Every input a listener hears, as a line of text ("<name> key_down 0xC0 0", codes of keys and
// characters in hexadecimal) in a list that the listeners of a test may share; then its action.
class CInputRecord : public IPointerListener, public IKeyListener {
public:
    explicit CInputRecord(std::vector<std::string> &_lines, std::string const &_name = std::string())
        : m_lines(_lines), m_prefix(_name.empty() ? _name : _name + " ") {}

    void on_button_down(unsigned _button) override { add("down %u", _button); }
    void on_button_up(unsigned _button) override { add("up %u", _button); }
    void on_pointer_move(vec2_t const &_movement) override { add("move %g %g", _movement.x, _movement.y); }
    void on_wheel(float _rotation) override { add("wheel %g", _rotation); }
    void on_key_down(unsigned _key, unsigned _extra) override { add("key_down 0x%X %u", _key, _extra); }
    void on_key_up(unsigned _key) override { add("key_up 0x%X", _key); }
    void on_char(unsigned _code) override { add("char 0x%X", _code); }

    std::function<void()> m_action;

private:
    template <class... Args>
    void add(char const *_format, Args... _args) {
        char line[64];
        snprintf(line, sizeof(line), _format, _args...);
        m_lines.push_back(m_prefix + line);
        if (m_action) m_action();
    }

    std::vector<std::string> &m_lines;
    std::string m_prefix;
};

// Appends the value's low _bytes bytes, least significant first.
inline void put(bytes_t &_out, uint32_t _value, int _bytes) {
    for (int i = 0; i < _bytes; ++i)
        _out.push_back(static_cast<uint8_t>(_value >> (8 * i)));
}

// A RIFF chunk, padded to an even size.
inline bytes_t chunk(char const *_id, bytes_t const &_payload) {
    bytes_t out(_id, _id + 4);
    put(out, static_cast<uint32_t>(_payload.size()), 4);
    out.insert(out.end(), _payload.begin(), _payload.end());
    if (_payload.size() & 1) out.push_back(0);
    return out;
}

// A WAV "fmt " chunk; format 1 is PCM.
inline bytes_t format_chunk(unsigned _format, unsigned _bits, unsigned _channels = 1,
                            unsigned _rate = 22050) {
    uint32_t const fields[] = {
        _format, _channels, _rate, _rate * _channels * _bits / 8, _channels * _bits / 8, _bits};
    bytes_t payload;
    for (int i = 0; i < 6; ++i)
        put(payload, fields[i], i == 2 || i == 3 ? 4 : 2);
    return chunk("fmt ", payload);
}

inline bytes_t wave(std::vector<bytes_t> const &_chunks) {
    bytes_t body = {'W', 'A', 'V', 'E'};
    for (bytes_t const &c : _chunks)
        body.insert(body.end(), c.begin(), c.end());
    return chunk("RIFF", body);
}

// A PCM WAV of 16-bit samples, interleaved when there are more channels.
inline bytes_t wave16(std::vector<int> const &_samples, unsigned _channels = 1, unsigned _rate = 22050) {
    bytes_t data;
    for (int sample : _samples)
        put(data, static_cast<uint16_t>(static_cast<int16_t>(sample)), 2);
    return wave({format_chunk(1, 16, _channels, _rate), chunk("data", data)});
}

} // namespace hosttest
