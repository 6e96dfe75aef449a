// The host's sound system: sources from PCM WAV files of the interface data, their state, volume
// and looping, and missing or broken files reported without a source.
#include "host_test_support.h"
#include "qorbase.h"
#include "sound_system.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

using namespace qorhost;
using hosttest::bytes_t;
using hosttest::chunk;
using hosttest::CReportCapture;
using hosttest::CTempDir;
using hosttest::format_chunk;
using hosttest::wave;

namespace {

bytes_t const k_samples = {0, 1, 2, 3, 4, 5, 6, 7};

bool is_wave(bytes_t const &_file) {
    return is_pcm_wave(_file.data(), static_cast<unsigned>(_file.size()));
}

// Interface data in a folder of the test's own.
class SoundSystemTest : public testing::Test {
protected:
    SoundSystemTest() { qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.path().c_str()); }
    ~SoundSystemTest() override { qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, ""); }

    CTempDir m_dir;
    CReportCapture m_reports;
    CSoundSystem m_sound;
};

} // namespace

TEST(PcmWave, PcmOfEightOrSixteenBitsWithSamplesIsAccepted) {
    EXPECT_TRUE(is_wave(wave({format_chunk(1, 16), chunk("data", k_samples)})));
    EXPECT_TRUE(is_wave(wave({format_chunk(1, 8), chunk("data", k_samples)})));
    // Chunks of any order, other chunks between, odd sizes padded to even.
    EXPECT_TRUE(
        is_wave(wave({chunk("LIST", {'a', 'b', 'c'}), chunk("data", {1, 2, 3}), format_chunk(1, 16)})));
    // The last chunk's pad byte may be missing.
    bytes_t unpadded = wave({format_chunk(1, 8), chunk("data", {1, 2, 3})});
    unpadded.pop_back();
    EXPECT_TRUE(is_wave(unpadded));
}

TEST(PcmWave, OtherFormatsAndBrokenFilesAreRefused) {
    EXPECT_FALSE(is_wave(wave({format_chunk(3, 16), chunk("data", k_samples)}))); // float
    EXPECT_FALSE(is_wave(wave({format_chunk(1, 24), chunk("data", k_samples)})));
    EXPECT_FALSE(is_wave(wave({format_chunk(1, 16)})));                                   // no samples
    EXPECT_FALSE(is_wave(wave({chunk("data", k_samples)})));                              // no format
    EXPECT_FALSE(is_wave(wave({chunk("fmt ", {1, 0, 1, 0}), chunk("data", k_samples)}))); // format cut short

    bytes_t riff = wave({format_chunk(1, 16), chunk("data", k_samples)});
    bytes_t not_wave = riff;
    not_wave[8] = 'A';
    EXPECT_FALSE(is_wave(not_wave));
    bytes_t not_riff = riff;
    not_riff[3] = 'X';
    EXPECT_FALSE(is_wave(not_riff));
    // The data chunk claims more than the file has.
    EXPECT_FALSE(is_wave(bytes_t(riff.begin(), riff.end() - 1)));
    EXPECT_FALSE(is_wave(bytes_t(riff.begin(), riff.begin() + 11)));
    EXPECT_FALSE(is_pcm_wave(nullptr, 100));
}

TEST_F(SoundSystemTest, SourceFromAWaveFileKeepsItsStateVolumeAndLooping) {
    m_dir.write("sounds/click.wav", wave({format_chunk(1, 16), chunk("data", k_samples)}));
    std::unique_ptr<ISoundSource> p_source(m_sound.create_sound("sounds/click.wav", 2, 0));
    ASSERT_NE(nullptr, p_source);
    EXPECT_TRUE(m_reports.reports().empty());
    EXPECT_EQ(1u, m_sound.get_live_sources());

    CSoundSource &source = static_cast<CSoundSource &>(*p_source);
    EXPECT_EQ("sounds/click.wav", source.get_file());
    EXPECT_EQ(2, source.get_group());
    EXPECT_EQ(0, source.get_state());
    EXPECT_FLOAT_EQ(1.0f, source.get_volume(0));
    EXPECT_FALSE(source.is_looping());

    source.set_state(1, 250.0f);
    EXPECT_EQ(1, source.get_state());
    EXPECT_FLOAT_EQ(250.0f, source.get_state_time());
    source.set_state(3, 100.0f);
    EXPECT_EQ(3, source.get_state());
    source.set_state(1, 0.0f);
    EXPECT_EQ(2u, m_sound.get_started());
    source.set_volume(0.25f);
    source.set_looping(true);
    source.set_option(4);
    EXPECT_FLOAT_EQ(0.25f, source.get_volume(0));
    EXPECT_TRUE(source.is_looping());
    EXPECT_EQ(4, source.get_option());

    std::unique_ptr<ISoundSource> p_second(m_sound.create_sound("sounds/click.wav", 0, 0));
    EXPECT_EQ(2u, m_sound.get_live_sources());
    p_source.reset();
    p_second.reset();
    EXPECT_EQ(0u, m_sound.get_live_sources());
}

TEST_F(SoundSystemTest, MissingOrBrokenFileIsReportedWithoutASource) {
    m_dir.write("text.wav", {'n', 'o', 't', ' ', 'a', ' ', 'w', 'a', 'v', 'e'});
    m_dir.write("empty.wav", {});
    m_dir.write("float.wav", wave({format_chunk(3, 32), chunk("data", k_samples)}));
    for (char const *name : {"missing.wav", "text.wav", "empty.wav", "float.wav"})
        EXPECT_EQ(nullptr, m_sound.create_sound(name, 2, 0)) << name;
    EXPECT_EQ(nullptr, m_sound.create_sound(nullptr, 2, 0));
    EXPECT_EQ((std::vector<std::string>{
                  "Cannot create sound from 'missing.wav'", "Cannot create sound from 'text.wav'",
                  "Cannot create sound from 'empty.wav'", "Cannot create sound from 'float.wav'",
                  "Cannot create sound from ''"}),
              m_reports.warnings());
    EXPECT_EQ(0u, m_sound.get_live_sources());
}
