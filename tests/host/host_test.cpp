// The reference engine without the UI library: its interfaces on the server, the screen size
// variables, the engine's log lines, the configuration read from the data and written back to
// the output folder, presented frames as files, and the withdrawal of every interface when it goes.
#include "host.h"
#include "host_test_support.h"
#include "qorbase.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

using namespace qorhost;
using hosttest::CTempDir;
using hosttest::quiet_options;

namespace {

class CWithdrawals : public IInterfaceServerListener {
public:
    void _isv_action(EInterfaceServerAction _action, IInterfaceBase *_p_interface) override {
        if (_action == ISA_WITHDRAWN) m_withdrawn.push_back(_p_interface);
    }
    std::vector<IInterfaceBase *> m_withdrawn;
};

class HostTest : public testing::Test {
protected:
    ~HostTest() override { hosttest::reset_category_roots(); }
    CTempDir m_dir;
};

} // namespace

// Every interface is on the server by its identifier (the recorder in front of the renderer when
// recording); the screen size is in the variables and the frame; the host withdraws every interface
// newest first when it goes.
TEST_F(HostTest, EveryInterfaceIsOnTheServerByItsIdentifierWhileTheHostLives) {
    CWithdrawals withdrawals;
    std::vector<IInterfaceBase *> registered;
    {
        CHost host(quiet_options(m_dir.path(), 320, 200));
        host.server().add_listener(&withdrawals);
        registered = {&host.renderer(), &host.sound(), &host.log(),  &host.level(),
                      &host.commands(), &host.vars(),  &host.input()};
        SInterfaceUID const uids[] = {
            qor_uid::RENDER,      qor_uid::SOUND_SYSTEM, qor_uid::LOG_MANAGER, qor_uid::LEVEL_DESCRIPTION,
            qor_uid::CMD_MANAGER, qor_uid::VAR_MANAGER,  qor_uid::INPUT_SYSTEM};
        for (size_t i = 0; i < registered.size(); ++i)
            EXPECT_EQ(registered[i], host.server().query_interface(uids[i], 1)) << i;
        EXPECT_EQ(7u, host.server().get_interfaces_count());
        EXPECT_EQ(nullptr, host.server().query_interface(qor_uid::USER_INTERFACE, 1));
        EXPECT_EQ(nullptr, host.ui());

        SVariable const *p_x = host.vars().find_var("scr_resx");
        ASSERT_NE(nullptr, p_x);
        EXPECT_STREQ("320", p_x->mp_value);
        EXPECT_EQ(200, host.vars().find_var("scr_resy")->m_int_value);
        EXPECT_EQ(320, host.renderer().get_frame().m_w);
        EXPECT_EQ(200, host.renderer().get_frame().m_h);
        EXPECT_TRUE(host.commands().run_line("set scr_resx 640")); // as the engine's console would
        EXPECT_EQ(640, p_x->m_int_value);
        host.frame(); // without the UI library a frame does nothing
        EXPECT_EQ(0u, host.renderer().get_presented());
    }
    EXPECT_EQ(registered, withdrawals.m_withdrawn);
    SHostOptions recording = quiet_options(m_dir.path());
    recording.m_record = true;
    CHost recorded(recording);
    EXPECT_EQ(&recorded.recorder(), recorded.server().query_interface(qor_uid::RENDER, 1));
}

TEST_F(HostTest, EngineLogLinesGoToTheEngineLoggerWhileTheHostLives) {
    {
        CHost host(quiet_options(m_dir.path()));
        unsigned const first = host.log().get_next_index();
        GetFileSystem()->log("Window registered: %s\n", "console");
        ASSERT_NE(nullptr, host.log().find_logger("Engine"));
        EXPECT_EQ(first + 1, host.log().get_next_index());
        EXPECT_EQ("Window registered: console", host.log().get_message_text(first));
    }
    // Afterwards the lines go to stdout again.
    testing::internal::CaptureStdout();
    GetFileSystem()->log("after %d", 1);
    EXPECT_EQ("after 1\n", testing::internal::GetCapturedStdout());
}

// The data folders are the category roots. Each host reads the data folder's configuration, so an
// edit there takes effect at the next start even when an earlier run wrote the configuration back
// into the output folder; presented frames land there as files.
TEST_F(HostTest, DataFoldersAndTheConfigurationReadFromTheDataWrittenBackToTheOutput) {
    m_dir.write("data/qor.gdf", hosttest::bytes_t{'[', 'a', ']', '\n', 'k', ' ', '=', ' ', '1', '\n'});
    SHostOptions options = quiet_options(m_dir.file("data"), 16, 8);
    options.m_out = m_dir.file("out");
    {
        CHost host(options);
        EXPECT_STREQ("1", qorbase::get_config_string("a", "k", ""));
        qorbase::find_config_section("a")->get_value("k", false)->set_vec2(5, 6);
        host.finish(); // without a service only the configuration is written back
    }
    EXPECT_EQ("[a]\nk = 5, 6\n", qortest::read_file(m_dir.file("out/qor.gdf")));
    EXPECT_EQ("[a]\nk = 1\n", qortest::read_file(m_dir.file("data/qor.gdf")));

    m_dir.write("data/qor.gdf", hosttest::bytes_t{'[', 'a', ']', '\n', 'k', ' ', '=', ' ', '2', '\n'});
    CHost host(options);
    EXPECT_STREQ("2", qorbase::get_config_string("a", "k", ""));
    EXPECT_EQ(m_dir.file("data/ui"), qorbase::get_category_root(qorbase::FILE_CATEGORY_UI));
    EXPECT_EQ(m_dir.file("data/fonts"), qorbase::get_category_root(qorbase::FILE_CATEGORY_FONTS));
    EXPECT_EQ(m_dir.file("data"), qorbase::get_category_root(qorbase::FILE_CATEGORY_CONFIG));
    EXPECT_EQ(m_dir.file("out"), qorbase::get_category_root(qorbase::FILE_CATEGORY_STATS));

    EXPECT_EQ(m_dir.file("out/frame_0012.png"), host.frame_path(12));
    host.renderer().begin_frame(rgba_t(1, 2, 3, 255));
    host.renderer().present();
    SImage frame;
    ASSERT_TRUE(load_image(m_dir.file("out/frame_0000.png"), frame));
    EXPECT_EQ(16, frame.m_w);
    EXPECT_EQ(8, frame.m_h);
    EXPECT_EQ(host.renderer().get_frame().m_pixels, frame.m_pixels);
}
