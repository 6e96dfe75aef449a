// The host's sound system: which files are PCM WAV, sources from the interface data counted as
// they start and go, and missing or broken files reported without a source.
#include "host_test_support.h"
#include "qorbase.h"
#include "sound_system.h"

#include <gtest/gtest.h>

#include <memory>

using namespace qorhost;
using hosttest::bytes_t;
using hosttest::chunk;
using hosttest::format_chunk;
using hosttest::wave;

namespace {

bytes_t const k_samples = {0, 1, 2, 3, 4, 5, 6, 7};

bool is_wave(bytes_t const &_file) {
    return is_pcm_wave(_file.data(), static_cast<unsigned>(_file.size()));
}

} // namespace

TEST(PcmWave, OnlyPcmOfEightOrSixteenBitsWithFormatAndSamplesIsAccepted) {
    bytes_t const riff = wave({format_chunk(1, 16), chunk("data", k_samples)});
    EXPECT_TRUE(is_wave(riff));
    EXPECT_TRUE(is_wave(wave({format_chunk(1, 8), chunk("data", k_samples)})));
    // Chunks of any order, other chunks between, odd sizes padded to even; the last pad may be missing.
    bytes_t unpadded = wave({chunk("LIST", {'a', 'b', 'c'}), chunk("data", {1, 2, 3}), format_chunk(1, 16)});
    EXPECT_TRUE(is_wave(unpadded));
    unpadded = wave({format_chunk(1, 8), chunk("data", {1, 2, 3})});
    unpadded.pop_back();
    EXPECT_TRUE(is_wave(unpadded));

    bytes_t not_wave = riff, not_riff = riff;
    not_wave[8] = 'A';
    not_riff[3] = 'X';
    for (bytes_t const &file :
         {wave({format_chunk(3, 16), chunk("data", k_samples)}),                              // float
          wave({format_chunk(1, 24), chunk("data", k_samples)}), wave({format_chunk(1, 16)}), // no samples
          wave({chunk("data", k_samples)}),                                                   // no format
          wave({chunk("fmt ", {1, 0, 1, 0}), chunk("data", k_samples)}), // format cut short
          not_wave, not_riff, bytes_t(riff.begin(), riff.end() - 1),     // the data claims more than there is
          bytes_t(riff.begin(), riff.begin() + 11)})
        EXPECT_FALSE(is_wave(file)) << file.size() << " bytes";
    EXPECT_FALSE(is_pcm_wave(nullptr, 100));
}

TEST(SoundSystem, SourcesComeFromWaveFilesOfTheInterfaceData) {
    hosttest::CTempDir dir;
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir.path().c_str());
    hosttest::CReportCapture reports;
    CSoundSystem sound;
    dir.write("sounds/click.wav", wave({format_chunk(1, 16), chunk("data", k_samples)}));
    std::unique_ptr<ISoundSource> p_source(sound.create_sound("sounds/click.wav", SOUND_GROUP_UI, 0));
    ASSERT_NE(nullptr, p_source);
    p_source->set_state(SOUND_STATE_START, 250.0f);
    p_source->set_state(SOUND_STATE_STOP, 100.0f);
    p_source->set_state(SOUND_STATE_START, 0.0f);
    EXPECT_EQ(2u, sound.get_started());
    EXPECT_EQ(1u, sound.get_live_sources());
    p_source.reset();
    EXPECT_EQ(0u, sound.get_live_sources());
    EXPECT_TRUE(reports.reports().empty());

    dir.write("text.wav", {'n', 'o', 't', ' ', 'a', ' ', 'w', 'a', 'v', 'e'});
    dir.write("float.wav", wave({format_chunk(3, 32), chunk("data", k_samples)}));
    for (char const *name : {"missing.wav", "text.wav", "float.wav"})
        EXPECT_EQ(nullptr, sound.create_sound(name, SOUND_GROUP_UI, 0)) << name;
    EXPECT_EQ(nullptr, sound.create_sound(nullptr, SOUND_GROUP_UI, 0));
    EXPECT_EQ((std::vector<std::string>{
                  "Cannot create sound from 'missing.wav'", "Cannot create sound from 'text.wav'",
                  "Cannot create sound from 'float.wav'", "Cannot create sound from ''"}),
              reports.warnings());
    EXPECT_EQ(0u, sound.get_live_sources());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, "");
}
