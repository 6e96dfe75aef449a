// qorbase: the GDF registry and its write-back, configuration files, and the file system's
// categories, loads, saves, readers and log.
#include "qorbase.h"

#include "qorMemoryManager.h"
#include "qordebug.h"
#include "test_common.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace {

bool exists(std::string const &_path) {
    struct stat info;
    return stat(_path.c_str(), &info) == 0;
}

int const k_categories[] = {qorbase::FILE_CATEGORY_STATS, qorbase::FILE_CATEGORY_CONFIG,
                            qorbase::FILE_CATEGORY_FONTS, qorbase::FILE_CATEGORY_UI};

// A temporary folder for the test's files, captured reports, and the module's global settings put
// back afterwards.
class BaseTest : public ::testing::Test {
protected:
    void SetUp() override { m_dir = qortest::make_temp_dir(); }

    void TearDown() override {
        qorbase::set_gdf_path(nullptr);
        for (int category : k_categories)
            qorbase::set_category_root(category, "");
    }

    std::string path(char const *_name) const { return m_dir + "/" + _name; }

    std::string m_dir;
    qortest::CReportCapture m_capture;
};

// ---------------------------------------------------------------------------------------------
// GDF registry
// ---------------------------------------------------------------------------------------------

char const k_gdf[] = "; The engine's configuration.\n"
                     "\n"
                     "[ui]\n"
                     "# The plaque.\n"
                     "init_plaque = \"my plaque.tga\"\n"
                     "cursor=kursor.tga\n"
                     "console_pos = 20, 30\n"
                     "console_size = 400 500\n"
                     "lines = 42\n"
                     "octal_looking = 010\n"
                     "words = many\n"
                     "empty =\n"
                     "\n"
                     "[ui_libraries]\n"
                     "gameui_library = libgameui_demo.so\n";

class GdfRegistryTest : public BaseTest {
protected:
    void SetUp() override {
        BaseTest::SetUp();
        m_gdf = path("qor.gdf");
        qortest::write_file(m_gdf, k_gdf);
        qorbase::set_gdf_path(m_gdf.c_str());
    }

    IConfigSection *section(char const *_name) { return GetGDFRegistry()->get_config()->get_section(_name); }
    IConfigValue *value(char const *_section, char const *_key) {
        return section(_section)->get_value(_key, true);
    }

    std::string m_gdf;
};

TEST_F(GdfRegistryTest, ReadsStringsQuotedStringsAndNumbers) {
    EXPECT_STREQ(value("ui", "init_plaque")->get_string("x"), "my plaque.tga");
    EXPECT_STREQ(value("ui", "cursor")->get_string("x"), "kursor.tga");
    EXPECT_STREQ(value("ui_libraries", "gameui_library")->get_string("no_lib"), "libgameui_demo.so");
    EXPECT_EQ(value("ui", "lines")->get_int(47), 42);
    EXPECT_EQ(value("ui", "octal_looking")->get_int(0), 10);
    vec2_t const pos = value("ui", "console_pos")->get_vec2(0, 0);
    EXPECT_EQ(pos.x, 20.0f);
    EXPECT_EQ(pos.y, 30.0f);
    vec2_t const size = value("ui", "console_size")->get_vec2(0, 0);
    EXPECT_EQ(size.x, 400.0f);
    EXPECT_EQ(size.y, 500.0f);
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(GdfRegistryTest, ValuesWithoutContentOrNumberGiveDefaults) {
    IConfigValue *p_empty = value("ui", "empty");
    EXPECT_FALSE(p_empty->has_content());
    EXPECT_STREQ(p_empty->get_string("fallback"), "fallback");
    EXPECT_EQ(p_empty->get_int(47), 47);
    EXPECT_EQ(value("ui", "words")->get_int(47), 47);
    vec2_t const words = value("ui", "words")->get_vec2(1, 2);
    EXPECT_EQ(words.x, 1.0f);
    EXPECT_EQ(words.y, 2.0f);
    vec2_t const half = value("ui", "lines")->get_vec2(1, 2); // one number is no vec2
    EXPECT_EQ(half.x, 1.0f);
    EXPECT_EQ(half.y, 2.0f);

    IConfigValue *p_made = value("ui", "strings_filename");
    ASSERT_NE(p_made, nullptr);
    EXPECT_FALSE(p_made->has_content());
    EXPECT_STREQ(p_made->get_string("russian.lang"), "russian.lang");
    EXPECT_EQ(section("ui")->get_value("strings_filename", false), p_made);
}

TEST_F(GdfRegistryTest, MissingSectionsAndKeysAreNull) {
    EXPECT_EQ(section("missing"), nullptr);
    EXPECT_EQ(section("UI"), nullptr); // names are case-sensitive
    EXPECT_EQ(section("ui")->get_value("missing", false), nullptr);
    EXPECT_EQ(section("ui")->get_value("Cursor", false), nullptr);
}

TEST_F(GdfRegistryTest, MissingFileGivesEmptyRegistryAndWarning) {
    std::string const missing = path("absent.gdf");
    qorbase::set_gdf_path(missing.c_str());
    EXPECT_EQ(section("ui"), nullptr);
    ASSERT_EQ(m_capture.reports().size(), 1u);
    EXPECT_EQ(m_capture.reports()[0].m_kind, qordebug::REPORT_WARNING);
    EXPECT_NE(m_capture.reports()[0].m_text.find(missing), std::string::npos)
        << m_capture.reports()[0].m_text;
}

TEST_F(GdfRegistryTest, SetVec2IsWrittenBackByFlushWithCommentsKept) {
    value("ui", "console_pos")->set_vec2(1.5f, -2.0f);
    value("ui", "init_plaque")->set_string("other plaque.tga");
    value("ui", "new_size")->set_vec2(640.0f, 480.0f);
    value("ui", "never_set"); // made without content: not written
    qorbase::flush_gdf();

    EXPECT_EQ(qortest::read_file(m_gdf), "; The engine's configuration.\n"
                                         "\n"
                                         "[ui]\n"
                                         "# The plaque.\n"
                                         "init_plaque = \"other plaque.tga\"\n"
                                         "cursor=kursor.tga\n"
                                         "console_pos = 1.5, -2\n"
                                         "console_size = 400 500\n"
                                         "lines = 42\n"
                                         "octal_looking = 010\n"
                                         "words = many\n"
                                         "empty =\n"
                                         "new_size = 640, 480\n"
                                         "\n"
                                         "[ui_libraries]\n"
                                         "gameui_library = libgameui_demo.so\n");
    EXPECT_FALSE(exists(m_gdf + ".tmp"));
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(GdfRegistryTest, SetVec2ReadsBackTheSameFloats) {
    value("ui", "console_pos")->set_vec2(0.1f, 1.0f / 3.0f);
    qorbase::set_gdf_path(m_gdf.c_str()); // writes back, and reads the file again
    vec2_t const pos = value("ui", "console_pos")->get_vec2(0, 0);
    EXPECT_EQ(pos.x, 0.1f);
    EXPECT_EQ(pos.y, 1.0f / 3.0f);
}

TEST_F(GdfRegistryTest, UnchangedRegistryIsNotWritten) {
    value("ui", "console_pos")->get_vec2(0, 0);
    value("ui", "made_only");
    value("ui", "cursor")->set_string("kursor.tga"); // the value it has
    ASSERT_EQ(unlink(m_gdf.c_str()), 0);
    qorbase::flush_gdf();
    EXPECT_FALSE(exists(m_gdf));
}

TEST_F(GdfRegistryTest, FileWithoutFinalLineBreakOrWithCrLfKeepsIt) {
    qortest::write_file(m_gdf, "[ui]\r\n; note\r\nconsole_pos = 20, 30\r\ncursor = a.tga");
    qorbase::set_gdf_path(m_gdf.c_str());
    value("ui", "console_pos")->set_vec2(5, 6);
    qorbase::flush_gdf();
    EXPECT_EQ(qortest::read_file(m_gdf), "[ui]\r\n; note\r\nconsole_pos = 5, 6\r\ncursor = a.tga");
}

TEST_F(GdfRegistryTest, PendingChangesAreWrittenBeforeThePathChanges) {
    value("ui", "console_pos")->set_vec2(3, 4);
    std::string const other = path("other.gdf");
    qortest::write_file(other, "[ui]\n");
    qorbase::set_gdf_path(other.c_str());
    EXPECT_NE(qortest::read_file(m_gdf).find("console_pos = 3, 4\n"), std::string::npos);
    EXPECT_EQ(qortest::read_file(other), "[ui]\n");
}

TEST_F(GdfRegistryTest, SetVec2IsWrittenBackAtProcessEnd) {
    qorbase::set_gdf_path(m_gdf.c_str()); // nothing loaded in this process before the fork
    fflush(stdout);
    fflush(stderr);
    pid_t const child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        GetGDFRegistry()->get_config()->get_section("ui")->get_value("console_pos", true)->set_vec2(7, 8);
        exit(0); // a normal exit: static destructors run
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0);
    std::string const text = qortest::read_file(m_gdf);
    EXPECT_NE(text.find("\nconsole_pos = 7, 8\n"), std::string::npos) << text;
    EXPECT_NE(text.find("# The plaque.\n"), std::string::npos);
    EXPECT_FALSE(exists(m_gdf + ".tmp"));
}

// ---------------------------------------------------------------------------------------------
// Configuration files
// ---------------------------------------------------------------------------------------------

using ConfigFileTest = BaseTest;

TEST_F(ConfigFileTest, BuildVersionIsReadFromCommonSection) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, m_dir.c_str());
    std::string const text =
        "; made by the build\n[$$common$$]\nbuild_version = \"1.2.3 (nightly)\"\nline = 12\n";
    qortest::write_file(path("build_version.cfg"), text);

    IConfigFile *p_file = ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", 0);
    ASSERT_NE(p_file, nullptr);
    IConfigSection *p_common = p_file->get_section("$$common$$");
    ASSERT_NE(p_common, nullptr);
    EXPECT_STREQ(p_common->get_value("build_version", true)->get_string(""), "1.2.3 (nightly)");
    EXPECT_EQ(p_common->get_value("line", true)->get_int(47), 12);
    EXPECT_EQ(p_common->get_value("missing", true)->get_int(47), 47);

    p_common->get_value("line", true)->set_vec2(1, 2); // memory only
    EXPECT_EQ(p_common->get_value("line", true)->get_vec2(0, 0).y, 2.0f);
    p_file->close(true);
    EXPECT_EQ(qortest::read_file(path("build_version.cfg")), text);
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(ConfigFileTest, UnreadableFileGivesNullWithoutReport) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, m_dir.c_str());
    mkdir(path("folder.cfg").c_str(), 0755);
    EXPECT_EQ(ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", 0), nullptr);
    EXPECT_EQ(ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, "folder.cfg", 0), nullptr);
    EXPECT_EQ(ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, nullptr, 0), nullptr);
    EXPECT_TRUE(m_capture.reports().empty());
}

// ---------------------------------------------------------------------------------------------
// File system
// ---------------------------------------------------------------------------------------------

using FileSystemTest = BaseTest;

TEST_F(FileSystemTest, MakePathJoinsTheCategoryRoot) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, "/out/stats");
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, "data");
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, "data/fonts/");
    char out[64];
    qorbase::make_path(qorbase::FILE_CATEGORY_STATS, "stats_a.txt", out, sizeof(out));
    EXPECT_STREQ(out, "/out/stats/stats_a.txt");
    qorbase::make_path(qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", out, sizeof(out));
    EXPECT_STREQ(out, "data/build_version.cfg");
    qorbase::make_path(qorbase::FILE_CATEGORY_FONTS, "fonts.lua", out, sizeof(out));
    EXPECT_STREQ(out, "data/fonts/fonts.lua");
    qorbase::make_path(qorbase::FILE_CATEGORY_UI, "layouts/main.lua", out, sizeof(out)); // root not set
    EXPECT_STREQ(out, "layouts/main.lua");
    qorbase::make_path(99, "x.txt", out, sizeof(out)); // unknown category
    EXPECT_STREQ(out, "x.txt");
    EXPECT_STREQ(qorbase::get_category_root(99), "");

    char small[8];
    qorbase::make_path(qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", small, sizeof(small));
    EXPECT_STREQ(small, "data/bu"); // 7 characters and the terminator
}

TEST_F(FileSystemTest, LoadFileGivesContentSizeAndTerminator) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    std::string const content("line 1\n\0binary\xff", 15);
    qortest::write_file(path("data.bin"), content);

    void *p_content = nullptr;
    unsigned const size =
        GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "data.bin", &p_content, false);
    ASSERT_EQ(size, content.size());
    ASSERT_NE(p_content, nullptr);
    EXPECT_EQ(std::string(static_cast<char *>(p_content), size), content);
    EXPECT_EQ(static_cast<char *>(p_content)[size], '\0');
    EXPECT_EQ(MMGetMemoryBlockStatus(p_content), 1); // the manager's block, as the caller frees it
    MMDeallocate(p_content);

    qortest::write_file(path("empty.txt"), "");
    p_content = nullptr;
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "empty.txt", &p_content, false), 0u);
    ASSERT_NE(p_content, nullptr); // read, with nothing in it
    EXPECT_EQ(static_cast<char *>(p_content)[0], '\0');
    MMDeallocate(p_content);
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(FileSystemTest, LoadFileWithoutContentTestsExistence) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, m_dir.c_str());
    qortest::write_file(path("font.nehe"), "12345");
    mkdir(path("folder").c_str(), 0755);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_FONTS, "font.nehe", nullptr, true), 5u);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_FONTS, "absent.nehe", nullptr, true), 0u);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_FONTS, "folder", nullptr, true), 0u);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_STATS, "font.nehe", nullptr, true), 0u);
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(FileSystemTest, MissingFileIsReportedUnlessQuiet) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    void *p_content = nullptr;
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "absent.lua", &p_content, true), 0u);
    EXPECT_EQ(p_content, nullptr);
    EXPECT_TRUE(m_capture.reports().empty());

    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "absent.lua", &p_content, false), 0u);
    EXPECT_EQ(p_content, nullptr);
    ASSERT_EQ(m_capture.reports().size(), 1u);
    EXPECT_EQ(m_capture.reports()[0].m_kind, qordebug::REPORT_WARNING);
    EXPECT_NE(m_capture.reports()[0].m_text.find(path("absent.lua")), std::string::npos)
        << m_capture.reports()[0].m_text;
}

TEST_F(FileSystemTest, SaveFileCreatesFoldersAndReplacesWholeFile) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, m_dir.c_str());
    std::string const first = "a longer first content\n";
    GetFileSystem()->save_file(qorbase::FILE_CATEGORY_STATS, "dumps/2024/stats.txt", first.data(),
                               static_cast<unsigned>(first.size()), 0);
    EXPECT_EQ(qortest::read_file(path("dumps/2024/stats.txt")), first);
    GetFileSystem()->save_file(qorbase::FILE_CATEGORY_STATS, "dumps/2024/stats.txt", "short", 5, 0);
    EXPECT_EQ(qortest::read_file(path("dumps/2024/stats.txt")), "short");
    EXPECT_FALSE(exists(path("dumps/2024/stats.txt.tmp")));
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(FileSystemTest, SaveFileThatCannotBeWrittenIsReportedAndOldFileStays) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, m_dir.c_str());
    qortest::write_file(path("blocker"), "a file where a folder should be");
    GetFileSystem()->save_file(qorbase::FILE_CATEGORY_STATS, "blocker/stats.txt", "x", 1, 0);
    ASSERT_EQ(m_capture.reports().size(), 1u);
    EXPECT_EQ(m_capture.reports()[0].m_kind, qordebug::REPORT_WARNING);
    EXPECT_NE(m_capture.reports()[0].m_text.find(path("blocker/stats.txt")), std::string::npos)
        << m_capture.reports()[0].m_text;
    EXPECT_EQ(qortest::read_file(path("blocker")), "a file where a folder should be");
}

TEST_F(FileSystemTest, OpenFileReadsFromSeekPositionShortAtEnd) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    qortest::write_file(path("strings.lang"), "0123456789");
    IFileReader *p_reader = GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "strings.lang");
    ASSERT_NE(p_reader, nullptr);
    EXPECT_EQ(p_reader->m_size, 10u);
    char buffer[16] = {};
    EXPECT_EQ(p_reader->read(4, buffer), 4u);
    EXPECT_EQ(std::string(buffer, 4), "0123");
    p_reader->seek(7);
    EXPECT_EQ(p_reader->read(8, buffer), 3u);
    EXPECT_EQ(std::string(buffer, 3), "789");
    EXPECT_EQ(p_reader->read(8, buffer), 0u);
    delete p_reader;

    EXPECT_EQ(GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "absent.lang"), nullptr);
    EXPECT_TRUE(m_capture.reports().empty());
}

void capture_line(char const *_line, void *_user) {
    static_cast<std::vector<std::string> *>(_user)->push_back(_line);
}

TEST_F(FileSystemTest, LogSendsEachFormattedLineToTheSink) {
    std::vector<std::string> lines;
    qorbase::set_log_sink(capture_line, &lines);
    GetFileSystem()->log("Window registered: %s\n", "CButton");
    GetFileSystem()->log("%d items", 3);
    qorbase::set_log_sink(nullptr, nullptr);
    GetFileSystem()->log("to stdout"); // not captured any more
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[0], "Window registered: CButton");
    EXPECT_EQ(lines[1], "3 items");
}

// Kept for the sanitizer run: the whole buffer is writable and goes back without a leak.
TEST_F(FileSystemTest, CacheBufferIsUsableToItsSize) {
    void *p_buffer = nullptr;
    unsigned size = 0;
    ASSERT_TRUE(CCachedFileReader::cache_create(&p_buffer, &size));
    ASSERT_NE(p_buffer, nullptr);
    ASSERT_GT(size, 0u);
    memset(p_buffer, 0xab, size);
    CCachedFileReader::cache_release(p_buffer);
    EXPECT_FALSE(CCachedFileReader::cache_create(nullptr, &size));
}

} // namespace
