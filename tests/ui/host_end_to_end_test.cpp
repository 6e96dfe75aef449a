// qorhost on the default data, as the main job runs it: the plaque, the demo scene, input scripts,
// layouts exported and imported, bad arguments, the configuration and the shipped presets.
#include "image_io.h"
#include "test_world.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>

namespace {

struct SRun {
    qortest::SChildResult m_result;
    std::string m_out;
    // A picture that the run wrote, against tests/golden/<_golden>.png.
    void expect_golden(std::string const &_picture, std::string const &_golden) const {
        qorhost::SImage frame;
        ASSERT_TRUE(qorhost::load_image(m_out + "/" + _picture, frame)) << _picture;
        qortest::expect_golden(frame, _golden);
    }
};

// qorhost on a data folder, its output to a new folder unless one is given.
SRun run_host(std::vector<std::string> const &_arguments,
              std::string const &_data = qortest::source_dir() + "/data",
              std::string const &_out = qortest::make_temp_dir()) {
    SRun run;
    run.m_out = _out;
    std::vector<std::string> arguments = {"--data", _data, "--out", run.m_out};
    arguments.insert(arguments.end(), _arguments.begin(), _arguments.end());
    run.m_result = qortest::run_child("qorhost", {}, arguments);
    return run;
}

// A script file of the lines given.
std::string script(std::string const &_lines) {
    return qortest::write_file(qortest::make_temp_dir() + "/test.script", _lines);
}

// A copy of the data folder, for runs that write layouts into it; without the startup line when
// _startup is false, so the desktop starts empty.
std::string data_copy(bool _startup) {
    std::string const dir = qortest::make_temp_dir();
    EXPECT_EQ(0, std::system(("cp -r '" + qortest::source_dir() + "/data' '" + dir + "/data'").c_str()));
    if (!_startup) {
        std::string const gdf = qortest::read_file(dir + "/data/qor.gdf");
        qortest::write_file(dir + "/data/qor.gdf", gdf.substr(0, gdf.find("[host]")));
    }
    return dir + "/data";
}

} // namespace

// The first frame is the start-up picture itself, texel for texel; by the twelfth the demo scene
// that the startup line builds has faded in. Commands run after the library's init.
TEST(HostEndToEnd, TheFirstFrameIsThePlaqueTheDemoSceneFollowsAndCommandsRunAfterInit) {
    SRun const run = run_host({"--frames", "12", "+gameui_demo", "hello", "there", "+no_such_command"});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    run.expect_golden("frame_0000.png", "plaque_1024x768");
    run.expect_golden("frame_0012.png", "demo_scene_1024x768");
    qorhost::SImage frame, picture;
    ASSERT_TRUE(qorhost::load_image(run.m_out + "/frame_0000.png", frame));
    ASSERT_TRUE(qorhost::load_image(qortest::source_dir() + "/data/textures/ui_init_plaque.tga", picture));
    EXPECT_EQ(0, qorhost::compare_images(frame, picture, 0));
    EXPECT_FALSE(qorhost::load_image(run.m_out + "/frame_0013.png", frame));
    for (char const *line : {"GameUI: Demo game interface library attached", "Demo scene built",
                             "GameUI: gameui_demo hello there", "Unknown command 'no_such_command'"})
        EXPECT_NE(std::string::npos, run.m_result.m_output.find(line)) << line;
}

TEST(HostEndToEnd, AMissingPlaqueShowsTheMissingTextureAndBadInputStopsTheHost) {
    std::string const data = qortest::make_temp_dir();
    qortest::write_file(data + "/qor.gdf", "[ui]\ninit_plaque = nowhere.tga\n[ui_libraries]\n");
    SRun const run = run_host({"--frames", "1"}, data);
    EXPECT_EQ(0, run.m_result.m_exit_code);
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("Cannot load texture 'nowhere.tga'"));
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("GameUI library name is not specified."));
    qorhost::SImage frame;
    ASSERT_TRUE(qorhost::load_image(run.m_out + "/frame_0000.png", frame));
    EXPECT_EQ(0, std::memcmp(frame.pixel(0, 0), "\xFF\x00\xFF", 3)); // the missing texture's magenta

    SRun const bad_size = run_host({"--size", "wide"});
    EXPECT_EQ(2, bad_size.m_result.m_exit_code);
    EXPECT_NE(std::string::npos, bad_size.m_result.m_output.find("usage: qorhost"));
    SRun const bad_script =
        run_host({"--script", script("move 1 1\njump 3\n")}); // stops before anything starts
    EXPECT_EQ(2, bad_script.m_result.m_exit_code);
    EXPECT_NE(std::string::npos, bad_script.m_result.m_output.find("test.script:2: unknown step 'jump'"));
}

// Input scripts on the demo scene, each picture against its golden: a dialog dragged, the controls
// and the lists worked, the build-version page shown and dumped, a dialog resized and answered.
TEST(HostEndToEnd, InputScriptsWorkTheDemoScene) {
    struct {
        char const *m_script;
        std::vector<std::pair<char const *, char const *>> m_pictures; // the screenshot, its golden
        char const *m_output;                                          // a line of the run's log
    } const runs[] = {
        {"move -212 -144   # onto the dialog's background\npress\nmove 1 0\nmove 99 50\nrelease\nwait 12\n"
         "screenshot dragged.png\ncommand gameui_demo scripted\n",
         {{"dragged.png", "demo_scene_dragged_1024x768"}},
         "gameui_demo scripted"},
        {"wait 12\nmove 52 -254  # from the centre onto the check box (564, 130)\npress\nrelease\n"
         "move 240 30   # the radio button 'Hard' (804, 160)\npress\nrelease\nwait 2\nscreenshot "
         "clicked.png\n"
         "move 26 34    # the volume bar's scroller (830, 194)\npress\nmove -1 0\nmove -99 0\nrelease\n"
         "wait 2\nscreenshot dragged.png\nmove -130 106 # into the edit box (700, 300)\npress\nrelease\n"
         "char 72\nchar 101\nchar 108\nchar 108\nchar 111\nchar 33\nkey_down 8\nkey_up 8 # backspace\n"
         "key_down 37\nkey_up 37 # the caret one to the left\nchar 76\nwait 2\nscreenshot typed.png\n",
         {{"clicked.png", "controls_clicked_1024x768"},
          {"dragged.png", "controls_dragged_1024x768"},
          {"typed.png", "controls_typed_1024x768"}},
         ""},
        {"wait 12\nmove 450 170  # from the centre onto the list's scroller (962, 554)\n"
         "press\nmove 0 1\nmove 0 59\nrelease\nmove -262 40  # a row (700, 654)\n"
         "press\nrelease\nwheel -2\nwait 2\nscreenshot list.png\n"
         "move -7 -177  # the tab 'Game' (693, 477)\npress\nrelease\nwait 12\n"
         "move 87 79    # the drop-down (780, 556)\npress\nrelease\nwait 12\nscreenshot opened.png\n"
         "move -60 90   # its row 'Hard' (720, 646)\npress\nrelease\nwait 12\nscreenshot chosen.png\n",
         {{"list.png", "lists_scrolled_1024x768"},
          {"opened.png", "lists_drop_down_opened_1024x768"},
          {"chosen.png", "lists_drop_down_chosen_1024x768"}},
         ""},
        {"wait 1\ncommand gameui_show_stats build_version\ncommand print_stats_page\nwait 12\n"
         "screenshot version.png\n",
         {{"version.png", "build_version_page_1024x768"}},
         "Out file: 'stats_build_version_demo_0000.txt'"},
        {"wait 12\nmove -44 231  # from the centre onto the bottom border (468, 615)\n"
         "press\nmove 1 0\nmove 80 60\nrelease\nwait 2\nscreenshot resized.png\n"
         "move -209 -30 # the button 'Ask' of the new layout (340, 645)\n"
         "press\nrelease\nwait 12\nscreenshot asked.png\n"
         "move 110 -217 # the message box's 'Yes' (450, 428)\n"
         "press\nrelease\nwait 12\nscreenshot answered.png\n",
         {{"resized.png", "dialog_resized_1024x768"},
          {"asked.png", "dialog_asked_1024x768"},
          {"answered.png", "dialog_answered_1024x768"}},
         "GameUI: answer Yes"},
        // The graph profiler's phases take fixed shares of the manual clock's 16 ms a frame.
        {"wait 12\ncommand graph_profiler\nwait 30\n"
         "move -262 303 # from the centre onto the band of 'renderer' (250, 687)\n"
         "press\nrelease\npress\nrelease\nwait 30\n"
         "move 0 -53    # the drop-down list of unused nodes (250, 634)\npress\nrelease\nwait 12\n"
         "screenshot profiler.png\ncommand graph_profiler\nmove 262 -250 # back to the centre\nwait 12\n"
         "screenshot hidden.png\n",
         {{"profiler.png", "graph_profiler_1024x768"}, {"hidden.png", "demo_scene_1024x768"}},
         ""},
    };
    for (auto const &run : runs) {
        SCOPED_TRACE(run.m_pictures[0].second);
        SRun const result = run_host({"--script", script(run.m_script)});
        ASSERT_EQ(0, result.m_result.m_exit_code) << result.m_result.m_output;
        EXPECT_NE(std::string::npos, result.m_result.m_output.find(run.m_output)) << result.m_result.m_output;
        for (auto const &picture : run.m_pictures)
            result.expect_golden(picture.first, picture.second);
    }
}

// The demo's layout imported into an empty desktop makes the demo's scene, and over that scene
// changes no window's place; exported, imported and exported again, the files are the same.
TEST(HostEndToEnd, TheDemoLayoutImportsAndExportsBackUnchanged) {
    std::string const data = data_copy(false);
    SRun const imported = run_host({"+ui_import", "demo_layout.lua", "+ui_export", "second.lua"}, data);
    ASSERT_EQ(0, imported.m_result.m_exit_code) << imported.m_result.m_output;
    imported.expect_golden("frame_0012.png", "demo_layout_imported_1024x768");
    // Over the scene that the code builds, what layouts don't keep (the bars' positions, the radio
    // button that is on) stays as the code set it.
    run_host({"+ui_import", "demo_layout.lua"}, data_copy(true))
        .expect_golden("frame_0012.png", "demo_layout_over_scene_1024x768");
    SRun const again = run_host({"+ui_import", "second.lua", "+ui_export", "third.lua"}, data);
    ASSERT_EQ(0, again.m_result.m_exit_code) << again.m_result.m_output;
    EXPECT_EQ(qortest::read_file(data + "/ui/second.lua"), qortest::read_file(data + "/ui/third.lua"));
}

// The console key opens the console (its character goes nowhere), a line run exports the layout,
// tab completes a command's name, and the key closes it onto the scene as it was.
TEST(HostEndToEnd, TheConsoleOpensRunsACommandCompletesANameAndCloses) {
    std::string const data = data_copy(true);
    SRun const run = run_host({"--script", script("wait 12\n"
                                                  "key_down 0xC0\nchar 0x60\nkey_up 0xC0\nwait 12\n"
                                                  "screenshot opened.png\n"
                                                  "type ui_export console_layout.lua\n"
                                                  "key_down 13\nkey_up 13\nwait 2\nscreenshot exported.png\n"
                                                  "type print_st\nkey_down 9\nchar 9\nkey_up 9\nwait 2\n"
                                                  "screenshot completed.png\n"
                                                  "key_down 0xC0\nchar 0x60\nkey_up 0xC0\nwait 12\n"
                                                  "screenshot closed.png\n")},
                              data);
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    std::string const layout = qortest::read_file(data + "/ui/console_layout.lua");
    EXPECT_NE(std::string::npos, layout.find("ui_windows_ini")) << layout;
    run.expect_golden("opened.png", "console_opened_1024x768");
    run.expect_golden("exported.png", "console_exported_1024x768");
    run.expect_golden("completed.png", "console_completed_1024x768");
    run.expect_golden("closed.png", "demo_scene_1024x768");
}

// The demo's export writes every shipped preset back: built again from them the scene looks and
// exports the same, and its layout imported into an empty desktop gives the shipped layout's scene.
TEST(HostEndToEnd, AnExportOfTheDemoKeepsEveryPresetAndTheLook) {
    std::string const data = data_copy(true), presets = data + "/ui/ui_material_presets.lua";
    std::string const shipped = qortest::read_file(presets);
    SRun const exported = run_host({"+ui_export", "exported.lua"}, data);
    ASSERT_EQ(0, exported.m_result.m_exit_code) << exported.m_result.m_output;
    std::string const written = qortest::read_file(presets);
    size_t count = 0;
    for (size_t at = shipped.find("\n    "); at != std::string::npos; at = shipped.find("\n    ", at + 1)) {
        std::string const name = shipped.substr(at + 5, shipped.find(' ', at + 5) - at - 5);
        if (name == "--") continue; // a comment
        ++count;
        EXPECT_NE(std::string::npos, written.find("\n    " + name + " = {")) << name;
    }
    EXPECT_EQ(40u, count);

    SRun const again = run_host({"+ui_export", "again.lua"}, data);
    ASSERT_EQ(0, again.m_result.m_exit_code) << again.m_result.m_output;
    EXPECT_EQ(std::string::npos, again.m_result.m_output.find("Preset")) << again.m_result.m_output;
    again.expect_golden("frame_0012.png", "demo_scene_1024x768");
    EXPECT_EQ(qortest::read_file(data + "/ui/exported.lua"), qortest::read_file(data + "/ui/again.lua"));
    EXPECT_EQ(written, qortest::read_file(presets));

    std::string const gdf = qortest::read_file(data + "/qor.gdf");
    qortest::write_file(data + "/qor.gdf", gdf.substr(0, gdf.find("[host]")));
    run_host({"+ui_import", "exported.lua"}, data)
        .expect_golden("frame_0012.png", "demo_layout_imported_1024x768");
}

// The thread strip replays a recorded session (the same picture on every machine), a row for each
// named thread and the rest of the system last; a recording that can't be read is reported.
TEST(HostEndToEnd, TheThreadStripReplaysARecordingOverTheScene) {
    std::string const recording = qortest::source_dir() + "/tests/host/thread_rings.txt";
    SRun const run = run_host({"--script", script("command gameui_threads " + recording +
                                                  "\nwait 12\nscreenshot threads.png\n"
                                                  "command gameui_threads /no/such/rings.txt\n")});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    run.expect_golden("threads.png", "thread_strip_replayed_1024x768");
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("Cannot open '/no/such/rings.txt'"))
        << run.m_result.m_output;
}
