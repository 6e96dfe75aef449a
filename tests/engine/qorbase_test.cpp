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

char const k_gdf[] = R"(; The engine's configuration.

[ui]
# The plaque.
init_plaque = "my plaque.tga"
cursor=kursor.tga
console_pos = 20, 30
console_size = 400 500
lines = 42
octal_looking = 010
words = many
empty =

[ui_libraries]
gameui_library = libgameui_demo.so
)";

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

// Strings, quoted strings and numbers; values without content or number give the default; missing
// sections and keys are null (names are case-sensitive), and only get_value(.., true) makes a value.
TEST_F(GdfRegistryTest, ValuesAreReadWithTheirDefaults) {
    struct {
        char const *mp_section, *mp_key, *mp_string;
        int m_int;
        float m_x, m_y;
    } const rows[] = {
        {"ui", "init_plaque", "my plaque.tga", 47, 1, 2},
        {"ui", "cursor", "kursor.tga", 47, 1, 2},
        {"ui_libraries", "gameui_library", "libgameui_demo.so", 47, 1, 2},
        {"ui", "lines", "42", 42, 1, 2}, // one number is no vec2
        {"ui", "octal_looking", "010", 10, 1, 2},
        {"ui", "console_pos", "20, 30", 20, 20, 30},
        {"ui", "console_size", "400 500", 400, 400, 500},
        {"ui", "words", "many", 47, 1, 2},
        {"ui", "empty", "default", 47, 1, 2},
        {"ui", "strings_filename", "default", 47, 1, 2}, // made by the reading
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_key);
        IConfigValue *p_value = value(row.mp_section, row.mp_key);
        ASSERT_NE(p_value, nullptr);
        EXPECT_EQ(p_value->has_content(), std::string(row.mp_string) != "default");
        EXPECT_STREQ(p_value->get_string("default"), row.mp_string);
        EXPECT_EQ(p_value->get_int(47), row.m_int);
        vec2_t const pair = p_value->get_vec2(1, 2);
        EXPECT_EQ(pair.x, row.m_x);
        EXPECT_EQ(pair.y, row.m_y);
        EXPECT_EQ(section(row.mp_section)->get_value(row.mp_key, false), p_value);
    }
    EXPECT_STREQ(qorbase::get_config_string("ui", "cursor", "x"), "kursor.tga");
    EXPECT_STREQ(qorbase::get_config_string("nowhere", "cursor", "x"), "x");
    EXPECT_TRUE(!section("UI") && !section("ui")->get_value("Cursor", false));
    EXPECT_TRUE(m_capture.reports().empty());

    std::string const missing = path("absent.gdf"); // a missing file: an empty registry and a warning
    qorbase::set_gdf_path(missing.c_str());
    EXPECT_EQ(section("ui"), nullptr);
    ASSERT_EQ(m_capture.warnings().size(), 1u);
    EXPECT_NE(m_capture.warnings()[0].find(missing), std::string::npos) << m_capture.warnings()[0];
}

// Changed values are written back by flush with the comments and the rest of the file kept; values
// made without content are not written; the floats read back the same.
TEST_F(GdfRegistryTest, ChangesAreWrittenBackByFlushWithCommentsKept) {
    value("ui", "console_pos")->set_vec2(0.1f, 1.0f / 3.0f);
    qorbase::set_gdf_path(m_gdf.c_str()); // writes back, and reads the file again
    vec2_t const pos = value("ui", "console_pos")->get_vec2(0, 0);
    EXPECT_EQ(pos.x, 0.1f);
    EXPECT_EQ(pos.y, 1.0f / 3.0f);

    value("ui", "console_pos")->set_vec2(1.5f, -2.0f);
    value("ui", "init_plaque")->set_string("other plaque.tga");
    value("ui", "new_size")->set_vec2(640.0f, 480.0f);
    value("ui", "never_set"); // made without content: not written
    qorbase::flush_gdf();
    std::string expected = k_gdf;
    expected.replace(expected.find("my plaque"), 2, "other");
    expected.replace(expected.find("20, 30"), 6, "1.5, -2");
    expected.replace(expected.find("\n[ui_libraries]"), 0, "new_size = 640, 480\n");
    EXPECT_EQ(qortest::read_file(m_gdf), expected);
    EXPECT_FALSE(exists(m_gdf + ".tmp"));
    EXPECT_TRUE(m_capture.reports().empty());

    // Pending changes are written before the path changes.
    value("ui", "console_pos")->set_vec2(3, 4);
    std::string const other = qortest::write_file(path("other.gdf"), "[ui]\n");
    qorbase::set_gdf_path(other.c_str());
    EXPECT_NE(qortest::read_file(m_gdf).find("console_pos = 3, 4\n"), std::string::npos);
    EXPECT_EQ(qortest::read_file(other), "[ui]\n");
}

TEST_F(GdfRegistryTest, UnchangedRegistryIsNotWrittenAndLineEndsAreKept) {
    value("ui", "console_pos")->get_vec2(0, 0);
    value("ui", "made_only");
    value("ui", "cursor")->set_string("kursor.tga"); // the value it has
    ASSERT_EQ(unlink(m_gdf.c_str()), 0);
    qorbase::flush_gdf();
    EXPECT_FALSE(exists(m_gdf));

    qortest::write_file(m_gdf, "[ui]\r\n; note\r\nconsole_pos = 20, 30\r\ncursor = a.tga");
    qorbase::set_gdf_path(m_gdf.c_str());
    value("ui", "console_pos")->set_vec2(5, 6);
    qorbase::flush_gdf();
    EXPECT_EQ(qortest::read_file(m_gdf), "[ui]\r\n; note\r\nconsole_pos = 5, 6\r\ncursor = a.tga");
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
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    std::string const text = qortest::read_file(m_gdf);
    EXPECT_NE(text.find("\nconsole_pos = 7, 8\n"), std::string::npos) << text;
    EXPECT_NE(text.find("# The plaque.\n"), std::string::npos);
    EXPECT_FALSE(exists(m_gdf + ".tmp"));
}

// ---------------------------------------------------------------------------------------------
// Configuration files
// ---------------------------------------------------------------------------------------------

using ConfigFileTest = BaseTest;

// Read from its category's folder, changed in memory only; a missing or unreadable file is null
// without a report.
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
    p_common->get_value("line", true)->set_vec2(1, 2); // memory only
    EXPECT_EQ(p_common->get_value("line", true)->get_vec2(0, 0).y, 2.0f);
    p_file->close(true);
    EXPECT_EQ(qortest::read_file(path("build_version.cfg")), text);

    mkdir(path("folder.cfg").c_str(), 0755);
    for (char const *p_name : {"absent.cfg", "folder.cfg", static_cast<char const *>(nullptr)})
        EXPECT_EQ(ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, p_name, 0), nullptr);
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
    struct {
        int m_category;
        char const *mp_name, *mp_path;
    } const rows[] = {{qorbase::FILE_CATEGORY_STATS, "stats_a.txt", "/out/stats/stats_a.txt"},
                      {qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", "data/build_version.cfg"},
                      {qorbase::FILE_CATEGORY_FONTS, "fonts.lua", "data/fonts/fonts.lua"},
                      {qorbase::FILE_CATEGORY_UI, "layouts/main.lua", "layouts/main.lua"}, // root not set
                      {99, "x.txt", "x.txt"}};                                             // unknown category
    char out[64];
    for (auto const &row : rows) {
        qorbase::make_path(row.m_category, row.mp_name, out, sizeof(out));
        EXPECT_STREQ(out, row.mp_path);
    }
    EXPECT_STREQ(qorbase::get_category_root(99), "");
    char small[8];
    qorbase::make_path(qorbase::FILE_CATEGORY_CONFIG, "build_version.cfg", small, sizeof(small));
    EXPECT_STREQ(small, "data/bu"); // 7 characters and the terminator
}

// Content with its size and a terminator, in the manager's block as the caller frees it; without a
// content pointer only the size (0 for what is no file of the category); a missing file reported
// unless quiet.
TEST_F(FileSystemTest, LoadFileGivesContentSizeAndTerminator) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    for (std::string const &content : {std::string("line 1\n\0binary\xff", 15), std::string()}) {
        qortest::write_file(path("data.bin"), content);
        void *p_content = nullptr;
        unsigned const size =
            GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "data.bin", &p_content, false);
        ASSERT_EQ(size, content.size());
        ASSERT_NE(p_content, nullptr);
        EXPECT_EQ(std::string(static_cast<char *>(p_content), size + 1), content + '\0');
        EXPECT_EQ(MMGetMemoryBlockStatus(p_content), 1);
        MMDeallocate(p_content);
    }
    mkdir(path("folder").c_str(), 0755);
    qortest::write_file(path("font.nehe"), "12345");
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "font.nehe", nullptr, true), 5u);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "folder", nullptr, true), 0u);
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_STATS, "font.nehe", nullptr, true), 0u);
    void *p_content = nullptr;
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "absent.lua", &p_content, true), 0u);
    EXPECT_TRUE(m_capture.reports().empty());
    EXPECT_EQ(GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, "absent.lua", &p_content, false), 0u);
    EXPECT_EQ(p_content, nullptr);
    ASSERT_EQ(m_capture.warnings().size(), 1u);
    EXPECT_NE(m_capture.warnings()[0].find(path("absent.lua")), std::string::npos) << m_capture.warnings()[0];
}

// A save makes the folders and replaces the whole file; one that cannot be written is reported and
// leaves what is there.
TEST_F(FileSystemTest, SaveFileCreatesFoldersAndReplacesWholeFile) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, m_dir.c_str());
    for (std::string const content : {"a longer first content\n", "short"}) {
        GetFileSystem()->save_file(qorbase::FILE_CATEGORY_STATS, "dumps/2024/stats.txt", content.data(),
                                   static_cast<unsigned>(content.size()), 0);
        EXPECT_EQ(qortest::read_file(path("dumps/2024/stats.txt")), content);
    }
    EXPECT_FALSE(exists(path("dumps/2024/stats.txt.tmp")));
    EXPECT_TRUE(m_capture.reports().empty());
    qortest::write_file(path("blocker"), "a file where a folder should be");
    GetFileSystem()->save_file(qorbase::FILE_CATEGORY_STATS, "blocker/stats.txt", "x", 1, 0);
    ASSERT_EQ(m_capture.warnings().size(), 1u);
    EXPECT_NE(m_capture.warnings()[0].find(path("blocker/stats.txt")), std::string::npos);
    EXPECT_EQ(qortest::read_file(path("blocker")), "a file where a folder should be");
}

// A reader reads from its seek position, short at the end; the cache buffer is writable to its
// size and goes back without a leak (for the sanitizer run).
TEST_F(FileSystemTest, ReadersAndTheCache) {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    qortest::write_file(path("strings.lang"), "0123456789");
    IFileReader *p_reader = GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "strings.lang");
    ASSERT_NE(p_reader, nullptr);
    EXPECT_EQ(p_reader->m_size, 10u);
    char buffer[16] = {};
    EXPECT_EQ(p_reader->read(4, buffer), 4u);
    p_reader->seek(7);
    EXPECT_EQ(p_reader->read(8, buffer + 4), 3u);
    EXPECT_EQ(std::string(buffer), "0123789");
    EXPECT_EQ(p_reader->read(8, buffer), 0u);
    delete p_reader;
    EXPECT_EQ(GetFileSystem()->open_file(qorbase::FILE_CATEGORY_UI, "absent.lang"), nullptr);
    EXPECT_TRUE(m_capture.reports().empty());

    void *p_buffer = nullptr;
    unsigned size = 0;
    ASSERT_TRUE(CCachedFileReader::cache_create(&p_buffer, &size));
    ASSERT_TRUE(p_buffer && size > 0);
    memset(p_buffer, 0xab, size);
    CCachedFileReader::cache_release(p_buffer);
    EXPECT_FALSE(CCachedFileReader::cache_create(nullptr, &size));
}

} // namespace
