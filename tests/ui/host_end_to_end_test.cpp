// qorhost on the default data, as the main job runs it: the first frame is the start-up plaque.
#include "image_io.h"
#include "test_support.h"
#include "test_world.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

namespace {

struct SRun {
    qortest::SChildResult m_result;
    std::string m_out;
};

// qorhost on a data folder, its output to a new folder.
SRun run_on(std::string const &_data, std::vector<std::string> _arguments) {
    SRun run;
    run.m_out = qortest::make_temp_dir();
    std::vector<std::string> arguments = {"--data", _data, "--out", run.m_out};
    arguments.insert(arguments.end(), _arguments.begin(), _arguments.end());
    run.m_result = qortest::run_child("qorhost", {}, arguments);
    return run;
}

SRun run_host(std::vector<std::string> _arguments) {
    return run_on(qortest::source_dir() + "/data", _arguments);
}

// A picture that the run wrote, against tests/golden/<golden>.png.
void expect_golden(std::string const &_dir, std::string const &_picture, std::string const &_golden) {
    qorhost::SImage frame;
    ASSERT_TRUE(qorhost::load_image(_dir + "/" + _picture, frame)) << _picture;
    qortest::expect_golden(frame, _golden);
}

} // namespace

TEST(HostEndToEnd, FirstFrameIsThePlaque) {
    SRun const run = run_host({"--frames", "2"});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;

    expect_golden(run.m_out, "frame_0000.png", "plaque_1024x768");

    // The plaque is the picture itself, texel for texel.
    qorhost::SImage frame, picture;
    ASSERT_TRUE(qorhost::load_image(run.m_out + "/frame_0000.png", frame));
    ASSERT_TRUE(qorhost::load_image(qortest::source_dir() + "/data/textures/ui_init_plaque.tga", picture));
    EXPECT_EQ(0, qorhost::compare_images(frame, picture, 0));

    // Two frames of the host follow the plaque.
    qorhost::SImage last;
    EXPECT_TRUE(qorhost::load_image(run.m_out + "/frame_0002.png", last));
    EXPECT_FALSE(qorhost::load_image(run.m_out + "/frame_0003.png", last));
}

TEST(HostEndToEnd, GameLibraryIsLoadedAndCommandsRun) {
    SRun const run = run_host({"--frames", "0", "+gameui_demo", "hello", "there", "+no_such_command"});
    EXPECT_EQ(0, run.m_result.m_exit_code);
    std::string const &output = run.m_result.m_output;
    EXPECT_NE(std::string::npos, output.find("GameUI: Demo game interface library attached")) << output;
    EXPECT_NE(std::string::npos, output.find("GameUI: gameui_demo hello there")) << output;
    EXPECT_NE(std::string::npos, output.find("Unknown command 'no_such_command'")) << output;
}

TEST(HostEndToEnd, BadArgumentsGiveUsage) {
    SRun const run = run_host({"--size", "wide"});
    EXPECT_EQ(2, run.m_result.m_exit_code);
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("usage: qorhost")) << run.m_result.m_output;
}

TEST(HostEndToEnd, MissingPlaqueShowsTheMissingTextureAndGoesOn) {
    std::string const data = qortest::make_temp_dir();
    qortest::write_file(data + "/qor.gdf", "[ui]\ninit_plaque = nowhere.tga\n[ui_libraries]\n");
    SRun run;
    run.m_out = qortest::make_temp_dir();
    run.m_result = qortest::run_child("qorhost", {}, {"--data", data, "--out", run.m_out, "--frames", "1"});
    EXPECT_EQ(0, run.m_result.m_exit_code);
    std::string const &output = run.m_result.m_output;
    EXPECT_NE(std::string::npos, output.find("Cannot load texture 'nowhere.tga'")) << output;
    EXPECT_NE(std::string::npos,
              output.find("GameUI library name is not specified.\nPlease, specify parameter "
                          "'gameui_library' in '[ui_libraries]' section of GDF file"))
        << output;
    qorhost::SImage frame;
    ASSERT_TRUE(qorhost::load_image(run.m_out + "/frame_0000.png", frame));
    uint8_t const *corner = frame.pixel(0, 0);
    EXPECT_EQ(255, corner[0]); // the missing texture's magenta
    EXPECT_EQ(0, corner[1]);
    EXPECT_EQ(255, corner[2]);
}

// With no arguments but the folders, the startup line of the configuration builds the demo scene:
// after twelve frames the desktop has faded in, and the picture matches the checked-in one.
TEST(HostEndToEnd, TheDemoSceneIsDrawnByTheDesktop) {
    SRun const run = run_host({});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("Demo scene built"));
    expect_golden(run.m_out, "frame_0012.png", "demo_scene_1024x768");
}

// An input script drags the first dialog by its background: it moves by the second movement behind
// the press and comes to the front; the screenshot matches the checked-in picture.
TEST(HostEndToEnd, AnInputScriptDragsADialog) {
    std::string const script = qortest::make_temp_dir() + "/drag.script";
    qortest::write_file(script, "move -212 -144   # from the centre onto the dialog's background\n"
                                "press\nmove 1 0\nmove 99 50\nrelease\nwait 12\nscreenshot dragged.png\n"
                                "command gameui_demo scripted\n");
    SRun const run = run_host({"--script", script});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("gameui_demo scripted"));
    expect_golden(run.m_out, "dragged.png", "demo_scene_dragged_1024x768");

    // A bad script stops the host before anything starts, naming the line.
    qortest::write_file(script, "move 1 1\njump 3\n");
    SRun const bad = run_host({"--script", script});
    EXPECT_EQ(2, bad.m_result.m_exit_code);
    EXPECT_NE(std::string::npos, bad.m_result.m_output.find("drag.script:2: unknown step 'jump'"));
}

// The controls of the demo scene, driven by an input script: a check box and a radio button
// clicked, the volume bar's scroller dragged, a line typed into the edit box with a backspace and
// a caret move; a screenshot after each step matches its checked-in picture.
TEST(HostEndToEnd, AnInputScriptWorksTheControls) {
    std::string const script = qortest::make_temp_dir() + "/controls.script";
    qortest::write_file(script,
                        "wait 12\n"
                        "move 52 -254        # from the centre (512, 384) onto the check box (564, 130)\n"
                        "press\nrelease\n"
                        "move 240 30         # the radio button 'Hard' (804, 160)\n"
                        "press\nrelease\nwait 2\nscreenshot clicked.png\n"
                        "move 26 34          # onto the volume bar's scroller (830, 194)\n"
                        "press\nmove -1 0\nmove -99 0\nrelease\nwait 2\nscreenshot dragged.png\n"
                        "move -130 106       # into the edit box (700, 300)\n"
                        "press\nrelease\n"
                        "char 72\nchar 101\nchar 108\nchar 108\nchar 111\nchar 33\n"
                        "key_down 8\nkey_up 8   # backspace takes the '!'\n"
                        "key_down 37\nkey_up 37 # the caret one to the left\n"
                        "char 76\nwait 2\nscreenshot typed.png\n");
    SRun const run = run_host({"--script", script});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    expect_golden(run.m_out, "clicked.png", "controls_clicked_1024x768");
    expect_golden(run.m_out, "dragged.png", "controls_dragged_1024x768");
    expect_golden(run.m_out, "typed.png", "controls_typed_1024x768");
}

// The options dialog of the demo scene, driven by an input script: the list of display modes
// scrolled by its scroll bar and the wheel with a row clicked, the second tab chosen, the
// drop-down opened and a row of it chosen.
TEST(HostEndToEnd, AnInputScriptWorksTheLists) {
    std::string const script = qortest::make_temp_dir() + "/lists.script";
    qortest::write_file(script, "wait 12\n"
                                "move 450 170        # from the centre onto the list's scroller (962, 554)\n"
                                "press\nmove 0 1\nmove 0 59\nrelease\n"
                                "move -262 40        # a row (700, 654)\n"
                                "press\nrelease\nwheel -2\nwait 2\nscreenshot list.png\n"
                                "move -7 -177        # the tab 'Game' (693, 477)\n"
                                "press\nrelease\nwait 12\n"
                                "move 87 79          # the drop-down (780, 556)\n"
                                "press\nrelease\nwait 12\nscreenshot opened.png\n"
                                "move -60 90         # its row 'Hard' (720, 646)\n"
                                "press\nrelease\nwait 12\nscreenshot chosen.png\n");
    SRun const run = run_host({"--script", script});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    expect_golden(run.m_out, "list.png", "lists_scrolled_1024x768");
    expect_golden(run.m_out, "opened.png", "lists_drop_down_opened_1024x768");
    expect_golden(run.m_out, "chosen.png", "lists_drop_down_chosen_1024x768");
}

namespace {

// A copy of the data folder, for runs that write layouts into it; without the startup line when
// _startup is false, so the desktop starts empty.
std::string data_copy(bool _startup) {
    std::string const dir = qortest::make_temp_dir();
    std::string const command = "cp -r '" + qortest::source_dir() + "/data' '" + dir + "/data'";
    EXPECT_EQ(0, std::system(command.c_str()));
    if (!_startup) {
        std::string gdf = qortest::read_file(dir + "/data/qor.gdf");
        gdf = gdf.substr(0, gdf.find("[host]"));
        qortest::write_file(dir + "/data/qor.gdf", gdf);
    }
    return dir + "/data";
}

} // namespace

// The demo's layout imported into an empty desktop makes the scene of the demo library, with the
// configured background; exported, imported and exported again, the two files are the same.
TEST(HostEndToEnd, TheDemoLayoutImportsAndExportsBackUnchanged) {
    std::string const data = data_copy(false);
    SRun const imported = run_on(data, {"+ui_import", "demo_layout.lua", "+ui_export", "second.lua"});
    ASSERT_EQ(0, imported.m_result.m_exit_code) << imported.m_result.m_output;
    expect_golden(imported.m_out, "frame_0012.png", "demo_layout_imported_1024x768");

    // Over the scene that the code builds, the same layout changes no window's place, while what
    // layouts don't keep (the bars' positions, the radio button that is on) stays as the code set it.
    SRun const over = run_on(data_copy(true), {"+ui_import", "demo_layout.lua"});
    expect_golden(over.m_out, "frame_0012.png", "demo_layout_over_scene_1024x768");

    SRun const again = run_on(data, {"+ui_import", "second.lua", "+ui_export", "third.lua"});
    ASSERT_EQ(0, again.m_result.m_exit_code) << again.m_result.m_output;
    EXPECT_EQ(qortest::read_file(data + "/ui/second.lua"), qortest::read_file(data + "/ui/third.lua"));
}

// The build-version page, shown, is drawn over the scene and dumped by "print_stats_page" to the
// first numbered file of the output folder.
TEST(HostEndToEnd, TheBuildVersionPageIsShownAndDumped) {
    std::string const script = qortest::make_temp_dir() + "/stats.script";
    qortest::write_file(script, "wait 1\ncommand gameui_show_stats build_version\ncommand print_stats_page\n"
                                "wait 12\nscreenshot version.png\n");
    SRun const run = run_host({"--script", script});
    ASSERT_EQ(0, run.m_result.m_exit_code) << run.m_result.m_output;
    std::string const dump = qortest::read_file(run.m_out + "/stats_build_version_demo_0000.txt");
    EXPECT_NE(std::string::npos, dump.find("qorui 1.0 (demo build)\n203\n")) << dump;
    EXPECT_NE(std::string::npos, run.m_result.m_output.find("Out file: 'stats_build_version_demo_0000.txt'"));
    expect_golden(run.m_out, "version.png", "build_version_page_1024x768");
}
