// Input scripts: their lines read into steps (moves, buttons, wheel, keys, characters, typed text,
// waits, screenshots, commands), with the line of the first bad one in the message, and the steps
// played on the host.
#include "input_script.h"
#include "host.h"
#include "image_io.h"
#include "qordebug.h"

#include <cmath>
#include <cstdlib>
#include <fstream>
#include <map>
#include <sstream>

namespace qorhost {

namespace {

// How many numbers each verb takes, at least and at most, and the range of each; whole numbers
// only where the step counts or names something. A value outside makes the line bad, so that a
// script can neither run for ever nor hand the input system what it can't take.
struct SArity {
    unsigned m_min, m_max;
    double m_lowest, m_highest;
    bool m_whole;
};

double const k_far = 1e6;             // pointer moves and wheel turns
double const k_most_frames = 100000;  // about half an hour of frames
double const k_most_ms = 86400000;    // a day of the clock
double const k_highest_code = 0xFFFF; // keys and characters are 16-bit codes
double const k_highest_button = 15;

std::map<std::string, SArity> const &verbs() {
    static std::map<std::string, SArity> const s_verbs = {
        {"move", {2, 2, -k_far, k_far, false}},         {"press", {0, 1, 0, k_highest_button, true}},
        {"release", {0, 1, 0, k_highest_button, true}}, {"wheel", {1, 1, -k_far, k_far, false}},
        {"key_down", {1, 2, 0, k_highest_code, true}},  {"key_up", {1, 1, 0, k_highest_code, true}},
        {"char", {1, 1, 0, k_highest_code, true}},      {"wait", {1, 1, 0, k_most_frames, true}},
    };
    return s_verbs;
}

// A file name that stays inside the output folder: relative, with no ".." among its parts.
bool stays_inside(std::string const &_file) {
    if (_file.empty() || _file[0] == '/') return false;
    std::istringstream parts(_file);
    std::string part;
    while (std::getline(parts, part, '/'))
        if (part == "..") return false;
    return true;
}

bool to_number(std::string const &_token, float &_value) {
    char *p_end = nullptr;
    bool const hex = _token.size() > 2 && _token[0] == '0' && (_token[1] == 'x' || _token[1] == 'X');
    _value = hex ? static_cast<float>(std::strtoul(_token.c_str(), &p_end, 16))
                 : std::strtof(_token.c_str(), &p_end);
    return !_token.empty() && p_end && *p_end == '\0';
}

std::string rest_of(std::istringstream &_in) {
    std::string rest;
    std::getline(_in >> std::ws, rest);
    return rest;
}

} // namespace

bool CInputScript::load(std::string const &_path, std::string &_error) {
    std::ifstream file(_path);
    if (!file) {
        _error = "cannot open the input script '" + _path + "'";
        return false;
    }
    std::stringstream text;
    text << file.rdbuf();
    return parse(text.str(), _path, _error);
}

bool CInputScript::parse(std::string const &_text, std::string const &_name, std::string &_error) {
    std::vector<SStep> steps;
    std::istringstream lines(_text);
    std::string line;
    for (unsigned number = 1; std::getline(lines, line); ++number) {
        std::string::size_type const comment = line.find('#');
        if (comment != std::string::npos) line.erase(comment);
        if (line.find_first_not_of(" \t\r") == std::string::npos) continue;
        SStep step;
        step.m_line = number;
        std::string error;
        if (!parse_line(line, step, error)) {
            _error = _name + ":" + std::to_string(number) + ": " + error;
            return false;
        }
        steps.push_back(step);
    }
    m_steps.swap(steps);
    return true;
}

bool CInputScript::parse_line(std::string const &_line, SStep &_step, std::string &_error) {
    std::istringstream in(_line);
    in >> _step.m_verb;
    static std::map<std::string, char const *> const s_text_verbs = {
        {"screenshot", "a file"}, {"command", "a line"}, {"type", "a text"}};
    auto const text_verb = s_text_verbs.find(_step.m_verb);
    if (text_verb != s_text_verbs.end()) {
        _step.m_text = rest_of(in);
        if (_step.m_text.empty())
            _error = "'" + _step.m_verb + "' needs " + text_verb->second;
        else if (_step.m_verb == "screenshot" && !stays_inside(_step.m_text))
            _error = "'" + _step.m_text + "' lies outside the output folder";
        return _error.empty();
    }
    auto const found = verbs().find(_step.m_verb);
    if (found == verbs().end()) {
        _error = "unknown step '" + _step.m_verb + "'";
        return false;
    }
    std::string token;
    while (in >> token) {
        if (_step.m_verb == "wait" && token.size() > 2 && token.compare(token.size() - 2, 2, "ms") == 0) {
            _step.m_milliseconds = true;
            token.resize(token.size() - 2);
        }
        float value;
        if (!to_number(token, value)) {
            _error = "'" + token + "' is no number";
            return false;
        }
        SArity const &arity = found->second;
        double const highest = _step.m_milliseconds ? k_most_ms : arity.m_highest;
        if (!(value >= arity.m_lowest && value <= highest) || (arity.m_whole && value != std::floor(value))) {
            _error = "'" + token + "' is out of range for '" + _step.m_verb + "'";
            return false;
        }
        _step.m_numbers.push_back(value);
    }
    SArity const arity = found->second;
    if (_step.m_numbers.size() < arity.m_min || _step.m_numbers.size() > arity.m_max) {
        _error = "'" + _step.m_verb + "' takes " + std::to_string(arity.m_min) +
                 (arity.m_max != arity.m_min ? " to " + std::to_string(arity.m_max) : "") + " numbers";
        return false;
    }
    return true;
}

unsigned long CInputScript::get_frames_count() const {
    unsigned long frames = 0;
    for (SStep const &step : m_steps)
        if (step.m_verb == "wait" && !step.m_milliseconds)
            frames += static_cast<unsigned long>(step.m_numbers[0]);
    return frames;
}

void CInputScript::play(CHost &_host) const {
    for (SStep const &step : m_steps)
        play_step(_host, step);
}

void CInputScript::play_step(CHost &_host, SStep const &_step) const {
    CInputSystem &input = _host.input();
    auto number = [&_step](size_t _i, float _default = 0.0f) {
        return _i < _step.m_numbers.size() ? _step.m_numbers[_i] : _default;
    };
    auto whole = [&number](size_t _i) { return static_cast<unsigned>(number(_i)); };
    std::string const &verb = _step.m_verb;
    if (verb == "move") {
        input.pointer_move(vec2_t{number(0), number(1)});
    } else if (verb == "press") {
        input.button_down(whole(0));
    } else if (verb == "release") {
        input.button_up(whole(0));
    } else if (verb == "wheel") {
        input.wheel(number(0));
    } else if (verb == "key_down") {
        input.key_down(whole(0), whole(1));
    } else if (verb == "key_up") {
        input.key_up(whole(0));
    } else if (verb == "char") {
        input.char_input(whole(0));
    } else if (verb == "type") {
        for (char const c : _step.m_text)
            input.char_input(static_cast<unsigned char>(c));
    } else if (verb == "wait" && _step.m_milliseconds) {
        _host.clock().advance_ms(whole(0));
    } else if (verb == "wait") {
        for (unsigned i = 0; i < whole(0); ++i)
            _host.frame();
    } else if (verb == "screenshot") {
        std::string const path = _host.options().m_out + "/" + _step.m_text;
        if (!write_png(path, _host.renderer().get_frame()))
            qordebug::warning("Cannot write the screenshot '%s'", path.c_str());
    } else if (verb == "command") {
        _host.commands().run_line(_step.m_text.c_str());
    }
}

} // namespace qorhost
