// The host in a window, on SDL's dummy video and audio drivers: keys as Windows virtual-key codes,
// SDL's events as the library's input, frames shown in the window, and the mixer that plays the
// sound system's sources.
#ifdef QORHOST_WITH_SDL2
#include "host.h"
#include "host_test_support.h"
#include "qorbase.h"
#include "sdl_audio.h"
#include "sdl_renderer.h"
#include "window_host.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

using namespace qorhost;
using hosttest::bytes_t;
using hosttest::chunk;
using hosttest::CInputRecord;
using hosttest::CReportCapture;
using hosttest::CTempDir;
using hosttest::format_chunk;
using hosttest::wave;
using hosttest::wave16;

namespace {

SDL_Event event_of(Uint32 _type) {
    SDL_Event event;
    SDL_zero(event);
    event.type = _type;
    return event;
}

SDL_Event key_event(Uint32 _type, SDL_Keycode _key, SDL_Scancode _place, Uint8 _repeat = 0) {
    SDL_Event event = event_of(_type);
    event.key.repeat = _repeat;
    event.key.keysym.sym = _key;
    event.key.keysym.scancode = _place;
    return event;
}

SDL_Event motion_event(int _dx, int _dy) {
    SDL_Event event = event_of(SDL_MOUSEMOTION);
    event.motion.xrel = _dx;
    event.motion.yrel = _dy;
    return event;
}

SDL_Event button_event(Uint32 _type, Uint8 _button) {
    SDL_Event event = event_of(_type);
    event.button.button = _button;
    return event;
}

SDL_Event wheel_event(float _y, Uint32 _direction) {
    SDL_Event event = event_of(SDL_MOUSEWHEEL);
    event.wheel.preciseY = _y;
    event.wheel.direction = _direction;
    return event;
}

SDL_Event text_event(char const *_utf8) {
    SDL_Event event = event_of(SDL_TEXTINPUT);
    snprintf(event.text.text, sizeof(event.text.text), "%s", _utf8);
    return event;
}

// A host of 512 by 384 pixels, half the desktop's size, without the UI library, in a window of
// SDL's dummy driver.
class WindowHostTest : public testing::Test {
protected:
    WindowHostTest() {
        setenv("SDL_VIDEODRIVER", "dummy", 1);
        setenv("SDL_AUDIODRIVER", "dummy", 1);
        SHostOptions options = hosttest::quiet_options(m_dir.path(), 512, 384);
        options.m_window = true;
        options.m_manual_clock = false;
        mp_host = std::make_unique<CHost>(options);
        mp_window = std::make_unique<CWindowHost>(*mp_host);
        mp_host->input().add_pointer_listener(&m_record);
        mp_host->input().add_key_listener(&m_record);
    }
    ~WindowHostTest() override {
        mp_window.reset();
        mp_host.reset();
        hosttest::reset_category_roots();
    }

    void open() {
        std::string error;
        ASSERT_TRUE(mp_window->open(error)) << error;
    }
    static void push(SDL_Event _event) { ASSERT_EQ(1, SDL_PushEvent(&_event)); }
    static rgba_t pixel(SImage const &_image, int _x, int _y) {
        uint8_t const *p = _image.pixel(_x, _y);
        return rgba_t(p[0], p[1], p[2], p[3]);
    }

    CTempDir m_dir;
    CReportCapture m_reports;
    std::vector<std::string> m_lines;
    CInputRecord m_record{m_lines};
    std::unique_ptr<CHost> mp_host;
    std::unique_ptr<CWindowHost> mp_window;
};

// A mixer of one channel at 1000 Hz: a millisecond is a frame, and WAVs of that rate play as
// they are.
class SoundMixerTest : public testing::Test {
protected:
    unsigned add(std::vector<int> const &_samples, float _volume = 1.0f) {
        bytes_t const file = wave16(_samples, 1, 1000);
        unsigned const voice = m_mixer.add_voice(file.data(), static_cast<unsigned>(file.size()));
        m_mixer.set_volume(voice, _volume);
        return voice;
    }
    std::vector<int> mix(unsigned _frames) {
        std::vector<int16_t> out(_frames * static_cast<unsigned>(m_mixer.get_channels()), 12345);
        m_mixer.mix(out.data(), _frames);
        return std::vector<int>(out.begin(), out.end());
    }

    CSoundMixer m_mixer{1000, 1};
};

} // namespace

TEST(WindowKeys, KeysAreWindowsVirtualKeyCodesByMeaningOrElseByPlace) {
    struct {
        SDL_Keycode m_key;
        SDL_Scancode m_place;
        unsigned m_vk;
    } const rows[] = {
        {SDLK_BACKQUOTE, SDL_SCANCODE_GRAVE, 0xC0},
        {SDLK_a, SDL_SCANCODE_A, 0x41},
        {SDLK_z, SDL_SCANCODE_Z, 0x5A},
        {SDLK_0, SDL_SCANCODE_0, 0x30},
        {SDLK_9, SDL_SCANCODE_9, 0x39},
        {SDLK_F1, SDL_SCANCODE_F1, 0x70},
        {SDLK_F13, SDL_SCANCODE_F13, 0x7C},
        {SDLK_LEFT, SDL_SCANCODE_LEFT, 0x25},
        {SDLK_BACKSPACE, SDL_SCANCODE_BACKSPACE, 0x08},
        {SDLK_KP_ENTER, SDL_SCANCODE_KP_ENTER, 0x0D},
        {SDLK_RSHIFT, SDL_SCANCODE_RSHIFT, 0x10},
        {SDLK_LALT, SDL_SCANCODE_LALT, 0x12},
        {SDLK_ESCAPE, SDL_SCANCODE_ESCAPE, 0x1B},
        {SDLK_SPACE, SDL_SCANCODE_SPACE, 0x20},
        {SDLK_DELETE, SDL_SCANCODE_DELETE, 0x2E},
        {SDLK_CARET, SDL_SCANCODE_GRAVE, 0xC0}, // a layout with '^' left of 1: still the console key
        {0xDF, SDL_SCANCODE_MINUS, 0xBD},       // 'ß' right of 0
        {SDLK_MINUS, SDL_SCANCODE_SLASH, 0xBD}, // a symbol with a code by its meaning, wherever it lies
        {SDLK_a, SDL_SCANCODE_Q, 0x41},
        {SDLK_AUDIOPLAY, SDL_SCANCODE_AUDIOPLAY, 0},
        {SDLK_UNKNOWN, SDL_SCANCODE_UNKNOWN, 0},
    };
    for (auto const &row : rows)
        EXPECT_EQ(row.m_vk, virtual_key(row.m_key, row.m_place)) << SDL_GetKeyName(row.m_key);
}

TEST(WindowText, Utf8TextBecomesCharacterCodesOfTheSixteenBitRange) {
    EXPECT_EQ((std::vector<unsigned>{0x61, 0xE9, 0x20AC, 0x44F}),
              utf8_characters("a\xC3\xA9\xE2\x82\xAC\xD1\x8F"));
    EXPECT_EQ((std::vector<unsigned>{0x78, 0x79}), utf8_characters("x\xF0\x9F\x98\x80y")); // beyond 0xFFFF
    // Broken sequences: a stray continuation byte, a cut sequence, a byte no sequence starts with.
    EXPECT_EQ((std::vector<unsigned>{0x78, 0x79}), utf8_characters("\x80x\xE2\x82y"));
    EXPECT_EQ((std::vector<unsigned>{0x7A}), utf8_characters("\xFFz\xC3"));
    EXPECT_TRUE(utf8_characters(nullptr).empty());
}

TEST_F(WindowHostTest, EventsReachTheListenersAsTheLibrarysInputAtTheNextFrame) {
    open();
    push(motion_event(3, -2)); // window pixels, twice as many on the desktop
    push(button_event(SDL_MOUSEBUTTONDOWN, SDL_BUTTON_LEFT));
    push(button_event(SDL_MOUSEBUTTONUP, SDL_BUTTON_LEFT));
    push(button_event(SDL_MOUSEBUTTONDOWN, SDL_BUTTON_RIGHT));
    push(button_event(SDL_MOUSEBUTTONDOWN, SDL_BUTTON_MIDDLE));
    push(wheel_event(1.0f, SDL_MOUSEWHEEL_NORMAL));
    push(wheel_event(2.0f, SDL_MOUSEWHEEL_FLIPPED));
    push(key_event(SDL_KEYDOWN, SDLK_BACKQUOTE, SDL_SCANCODE_GRAVE));
    push(key_event(SDL_KEYUP, SDLK_BACKQUOTE, SDL_SCANCODE_GRAVE));
    push(key_event(SDL_KEYDOWN, SDLK_BACKSPACE, SDL_SCANCODE_BACKSPACE, 1));
    push(key_event(SDL_KEYDOWN, SDLK_AUDIOPLAY, SDL_SCANCODE_AUDIOPLAY)); // no code: not delivered
    push(text_event("h\xC3\xA9"));
    push(motion_event(0, 0));
    EXPECT_TRUE(m_lines.empty()); // nothing before the frame's events are polled
    EXPECT_TRUE(mp_window->step());
    EXPECT_EQ((std::vector<std::string>{"move 6 -4", "down 0", "up 0", "down 1", "down 2", "wheel 1",
                                        "wheel -2", "key_down 0xC0 0", "key_up 0xC0", "key_down 0x8 1",
                                        "char 0x68", "char 0xE9"}),
              m_lines);
    m_lines.clear();
    vec2_t const scale = {2.0f, 0.5f}; // delivering tells whether anything was input
    EXPECT_TRUE(deliver_input(motion_event(-4, 8), mp_host->input(), scale));
    EXPECT_FALSE(deliver_input(motion_event(0, 0), mp_host->input(), scale));
    EXPECT_FALSE(deliver_input(wheel_event(0.0f, SDL_MOUSEWHEEL_NORMAL), mp_host->input(), scale));
    EXPECT_FALSE(deliver_input(text_event("\xF0\x9F\x98\x80"), mp_host->input(), scale));
    EXPECT_EQ((std::vector<std::string>{"move -8 4"}), m_lines);
}

TEST_F(WindowHostTest, RunsShowTheRenderersPictureUntilTheWindowCloses) {
    EXPECT_FALSE(mp_window->step()); // not open: nothing
    EXPECT_EQ(0u, mp_window->run(3));
    open();
    // The host draws with the window's renderer while it is open; its frame sink sees what is
    // shown.
    CHostRenderer &renderer = mp_host->active_renderer();
    ASSERT_EQ(mp_window->screen(), &renderer);
    SImage shown;
    renderer.set_frame_sink([&](SImage const &_frame, unsigned) { shown = _frame; });
    renderer.begin_frame(rgba_t(10, 20, 30, 255));
    rgba_t const red(200, 0, 0, 255); // the left half
    renderer.draw_quad(vec2_t{-1, 1}, vec2_t{0, 0}, red, vec2_t{0, 1}, vec2_t{1, 0}, red, vec2_t{0, -1},
                       vec2_t{1, 1}, red, vec2_t{-1, -1}, vec2_t{0, 1}, red);
    renderer.present();
    ASSERT_EQ(512, shown.m_w);
    EXPECT_EQ(red, pixel(shown, 255, 383));
    EXPECT_EQ(rgba_t(10, 20, 30, 255), pixel(shown, 256, 0));
    EXPECT_EQ(3u, mp_window->run(3));
    push(event_of(SDL_QUIT));
    EXPECT_EQ(0u, mp_window->run(0)); // 0: until the window is closed
    EXPECT_TRUE(mp_window->is_closed());
    EXPECT_FALSE(mp_window->step());
    EXPECT_EQ(3u, mp_window->get_presented());
    mp_window.reset(); // headless again
    EXPECT_EQ(&mp_host->renderer(), &mp_host->active_renderer());
    EXPECT_EQ(&mp_host->renderer(), mp_host->server().query_interface(qor_uid::RENDER, 1));
}

TEST_F(WindowHostTest, SoundGoesToTheAudioDeviceWhileTheWindowIsOpen) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.path().c_str());
    m_dir.write("click.wav", wave16({1000, 2000}));
    EXPECT_EQ(nullptr, mp_host->sound().get_output());
    open();
    ASSERT_TRUE(mp_window->has_audio());
    std::shared_ptr<CSoundMixer> const p_mixer =
        std::static_pointer_cast<CSoundMixer>(mp_host->sound().get_output());
    ASSERT_NE(nullptr, p_mixer);
    EXPECT_EQ(2, p_mixer->get_channels());
    std::unique_ptr<ISoundSource> p_source(mp_host->sound().create_sound("click.wav", SOUND_GROUP_UI, 0));
    ASSERT_NE(nullptr, p_source);
    EXPECT_TRUE(m_reports.reports().empty());
    // The source outlives the device and keeps its voice on the mixer.
    mp_window.reset();
    EXPECT_EQ(nullptr, mp_host->sound().get_output());
    p_source->set_state(SOUND_STATE_START, 0.0f);
    EXPECT_EQ(1u, p_mixer->get_playing_count());
    p_source.reset();
    EXPECT_EQ(0u, p_mixer->get_voices_count());
}

TEST_F(SoundMixerTest, VoicesAddUpAtTheirVolumesClippedToSixteenBits) {
    unsigned const half = add({1000, -2000, 3001, 4000, -5000, 6000}, 0.5f);
    unsigned const full = add({100, 200, 300});
    m_mixer.start(half, 0.0f);
    EXPECT_EQ((std::vector<int>{500, -1000}), mix(2));
    m_mixer.start(full, 0.0f);
    // 1600.5 rounds away from zero; the shorter voice ends first, the other after it.
    EXPECT_EQ((std::vector<int>{1601, 2200, -2200, 3000, 0, 0}), mix(6));
    EXPECT_EQ(0u, m_mixer.get_playing_count());
    unsigned const a = add({30000, -30000, 20000}), b = add({30000, -30000, -20000});
    m_mixer.start(a, 0.0f);
    m_mixer.start(b, 0.0f);
    EXPECT_EQ((std::vector<int>{32767, -32768, 0}), mix(3));
}

TEST_F(SoundMixerTest, LoopsFadesStopsAndResets) {
    unsigned const loop = add({1, 2, 3});
    m_mixer.set_looping(loop, true);
    m_mixer.start(loop, 0.0f);
    EXPECT_EQ((std::vector<int>{1, 2, 3, 1, 2, 3, 1}), mix(7));
    m_mixer.set_looping(loop, false);
    EXPECT_EQ((std::vector<int>{2, 3, 0}), mix(3));
    m_mixer.start(loop, 0.0f); // ended: from the start
    EXPECT_EQ((std::vector<int>{1}), mix(1));
    m_mixer.start(loop, 0.0f); // still playing: on from where it is
    EXPECT_EQ((std::vector<int>{2}), mix(1));
    m_mixer.stop(loop, 0.0f); // at once
    EXPECT_EQ((std::vector<int>{0}), mix(1));
    m_mixer.start(loop, 0.0f); // stopped: from the start
    EXPECT_EQ((std::vector<int>{1}), mix(1));
    m_mixer.reset(loop);
    EXPECT_EQ((std::vector<int>{0}), mix(1));
    m_mixer.remove_voice(loop);

    unsigned const voice = add(std::vector<int>(16, 1000));
    m_mixer.start(voice, 4.0f); // 4 ms: four frames
    EXPECT_EQ((std::vector<int>{0, 250, 500, 750, 1000}), mix(5));
    m_mixer.stop(voice, 4.0f);
    EXPECT_EQ((std::vector<int>{1000, 750, 500, 250, 0}), mix(5));
    EXPECT_EQ(0u, m_mixer.get_playing_count());
    // Started again while fading out, it rises from where it is.
    m_mixer.start(voice, 0.0f);
    m_mixer.stop(voice, 4.0f);
    EXPECT_EQ((std::vector<int>{1000, 750}), mix(2));
    m_mixer.start(voice, 2.0f);
    EXPECT_EQ((std::vector<int>{500, 1000}), mix(2));
    m_mixer.set_volume(voice, -1.0f); // no negative volume: silent
    EXPECT_EQ((std::vector<int>{0}), mix(1));
}

TEST(SoundMixerFormat, WavesAreConvertedToTheMixersChannelsRateAndBitsOrRefused) {
    CSoundMixer mixer(1000, 2);
    // 8-bit samples are unsigned around 128; one channel goes to both.
    bytes_t const eight = wave({format_chunk(1, 8, 1, 1000), chunk("data", {128, 255, 0, 128})});
    std::vector<int16_t> const samples =
        mixer.get_samples(mixer.add_voice(eight.data(), static_cast<unsigned>(eight.size())));
    ASSERT_EQ(8u, samples.size());
    EXPECT_EQ(0, samples[1]);
    EXPECT_GT(samples[2], 32000);
    EXPECT_EQ(samples[2], samples[3]);
    EXPECT_LT(samples[5], -32000);
    // 16-bit stereo at the mixer's rate stays as it is; at half the rate it lasts as long.
    bytes_t const same = wave16({1, -1, 2, -2}, 2, 1000);
    EXPECT_EQ((std::vector<int16_t>{1, -1, 2, -2}),
              mixer.get_samples(mixer.add_voice(same.data(), static_cast<unsigned>(same.size()))));
    bytes_t const slow = wave16(std::vector<int>(200, 0), 2, 500);
    unsigned const doubled = mixer.add_voice(slow.data(), static_cast<unsigned>(slow.size()));
    EXPECT_NEAR(400.0, static_cast<double>(mixer.get_samples(doubled).size()), 8.0);

    // Bad waves make no voice; unknown voices change nothing.
    bytes_t const text = {'n', 'o', 't', ' ', 'a', ' ', 'w', 'a', 'v', 'e'};
    bytes_t const no_channels = wave({format_chunk(1, 16, 0, 1000), chunk("data", {1, 2, 3, 4})});
    EXPECT_EQ(0u, mixer.add_voice(text.data(), static_cast<unsigned>(text.size())));
    EXPECT_EQ(0u, mixer.add_voice(nullptr, 100));
    EXPECT_EQ(0u, mixer.add_voice(no_channels.data(), static_cast<unsigned>(no_channels.size())));
    for (unsigned unknown : {0u, doubled + 1}) {
        mixer.start(unknown, 0.0f);
        mixer.set_volume(unknown, 2.0f);
        mixer.remove_voice(unknown);
    }
    EXPECT_EQ(3u, mixer.get_voices_count());
    EXPECT_EQ(0u, mixer.get_playing_count());
}

// Sources of the sound system play through the output with their state, volume and looping; one
// the output can't play is silent.
TEST(SoundOutput, SourcesPlayThroughTheOutputWithTheirStateVolumeAndLooping) {
    hosttest::CTempDir dir;
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir.path().c_str());
    CReportCapture reports;
    std::shared_ptr<CSoundMixer> const p_mixer = std::make_shared<CSoundMixer>(22050, 1);
    CSoundSystem sound;
    dir.write("loop.wav", wave16({400, -800, 1200}));
    dir.write("none.wav", wave({format_chunk(1, 16, 0, 22050), chunk("data", {1, 2, 3, 4})}));
    sound.set_output(p_mixer);
    std::unique_ptr<ISoundSource> p_source(sound.create_sound("loop.wav", SOUND_GROUP_UI_MUSIC, 0));
    std::vector<int16_t> out(4);
    p_mixer->mix(out.data(), 4);
    EXPECT_EQ((std::vector<int16_t>{0, 0, 0, 0}), out); // not started
    p_source->set_volume(0.5f);
    p_source->set_looping(true);
    p_source->set_state(SOUND_STATE_START, 0.0f);
    p_mixer->mix(out.data(), 4);
    EXPECT_EQ((std::vector<int16_t>{200, -400, 600, 200}), out);
    p_source->set_state(SOUND_STATE_STOP, 0.0f);
    EXPECT_EQ(0u, p_mixer->get_playing_count());
    EXPECT_TRUE(reports.reports().empty());

    std::unique_ptr<ISoundSource> p_none(sound.create_sound("none.wav", SOUND_GROUP_UI, 0));
    ASSERT_NE(nullptr, p_none);
    EXPECT_EQ(0u, static_cast<CSoundSource &>(*p_none).get_voice());
    EXPECT_EQ((std::vector<std::string>{"Cannot play sound 'none.wav'"}), reports.warnings());
    sound.set_output(nullptr); // made without an output: silent; the first keeps its output
    std::unique_ptr<ISoundSource> p_silent(sound.create_sound("loop.wav", SOUND_GROUP_UI_MUSIC, 0));
    EXPECT_EQ(0u, static_cast<CSoundSource &>(*p_silent).get_voice());
    EXPECT_EQ(1u, p_mixer->get_voices_count());
    p_source.reset();
    EXPECT_EQ(0u, p_mixer->get_voices_count());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, "");
}

#endif // QORHOST_WITH_SDL2
