// Fonts on the test world: the "nehe" reader and its quiet stops, the factory's tables and
// messages, shared charsets, and the two fonts of the data folder.
#include "ui_font.h"

#include "engine_interfaces.h"
#include "qorbase.h"
#include "test_world.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <memory>

using namespace qorui;

namespace {

class FontTest : public ::testing::Test {
protected:
    void SetUp() override { qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, m_dir.c_str()); }

    // A charset "name" over the file "name.fnt" with that content, and a font "name" on it.
    std::unique_ptr<CFont> font_from(std::string const &_name, std::string const &_content,
                                     std::string const &_extra = "") {
        qortest::write_file(m_dir + "/" + _name + ".fnt", _content);
        lua_machine().DoString(("charsets['" + _name + "'] = { file_type = 'nehe', file_name = '" + _name +
                                ".fnt' }; fonts['" + _name + "'] = { charset_name = '" + _name +
                                "', material = { material_template = 'ui_color' } " + _extra + " }")
                                   .c_str());
        return std::unique_ptr<CFont>(get_fonts_factory().create(_name.c_str(), &m_world.desktop()));
    }
    // _count entries of width 0.5 from _first_code.
    static std::string entries(int _count, int _first_code = 32) {
        std::string text;
        for (int i = 0; i < _count; ++i)
            text += std::to_string(_first_code + i) + " = 0.5\n";
        return text;
    }

    qortest::CWorld m_world;
    std::string m_dir = qortest::make_temp_dir();
};

} // namespace

// Cells run row by row; a missing code gets the lowest code's cell. Reading stops quietly where
// the file ends or breaks.
TEST_F(FontTest, CellsRunRowByRowAndReadingStopsQuietlyWhereTheFileEndsOrBreaks) {
    qortest::CReportCapture capture;
    std::unique_ptr<CFont> font =
        font_from("grid", "[common]\nfont1 = x\ndimension = 4\nfont_h = 1\n[chars]\n" + entries(16, 40));
    CCharset::SChar const *p_char = font->get_char_description(46); // the 7th entry: row 1, column 2
    EXPECT_EQ((std::vector<float>{0.5f, 0.25f, 0.125f, 0.25f}),
              (std::vector<float>{p_char->x, p_char->y, p_char->w, font->get_height()}));
    EXPECT_EQ(font->get_char_description(40), font->get_char_description('z'));
    EXPECT_FLOAT_EQ(320.0f, font->get_size()); // no "size" in the table
    // 255 of 256 entries: all are kept, the end of the text ends the reading.
    std::unique_ptr<CFont> short_file = font_from("short", "[common] dimension = 16 [chars] " + entries(255));
    EXPECT_EQ(short_file->get_char_description(32 + 254)->w, 0.5f / 16);
    // An unknown key ("dimension=16" is one token): no characters, the default height by the dimension.
    std::unique_ptr<CFont> unknown = font_from("unknown", "[common] dimension = 8 size = 3 [chars] 32 = 1");
    EXPECT_EQ(nullptr, unknown->get_char_description(32));
    EXPECT_FLOAT_EQ(0.0625f / 8, unknown->get_height());
    // Text behind the last entry isn't read; a code given twice keeps its last place.
    std::unique_ptr<CFont> tail =
        font_from("tail", "[common] dimension = 2 [chars] 65 = 1 65 = 1 66 = 1 67 = 1 68 = 1 garbage");
    EXPECT_FLOAT_EQ(0.5f, tail->get_char_description(65)->x);
    EXPECT_EQ(tail->get_char_description(65), tail->get_char_description(68)); // 68 was never read
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(FontTest, TheFactoryExplainsWhatItCannotLoad) {
    qortest::CReportCapture capture;
    lua_machine().DoString(
        "charsets = { broken = 5, typeless = { file_name = 'x.fnt' },"
        " other = { file_type = 'bmfont', file_name = 'o.fnt' },"
        " absent = { file_type = 'NeHe', file_name = 'absent.fnt' } }"
        "fonts = { no_charset = { material = {} }, no_material = { charset_name = 'absent' },"
        " lost = { charset_name = 'missing', material = {} }, broken = { charset_name = 'broken', material = "
        "{} },"
        " typeless = { charset_name = 'typeless', material = {} }, other = { charset_name = 'other', "
        "material = {} } }");
    for (char const *p_name : {"nothing", "no_charset", "no_material", "lost", "broken"})
        EXPECT_EQ(nullptr, get_fonts_factory().create(p_name, &m_world.desktop())) << p_name;
    EXPECT_EQ(
        (std::vector<std::string>{
            "Cannot load the font 'nothing'", "Cannot load the font 'no_charset'\n'charset' record not found",
            "Cannot open 'absent.fnt'", "Cannot load the font 'no_material'\n'material' record not found",
            "Cannot load the charset 'missing'", "Cannot load the charset 'broken'"}),
        capture.warnings());
    // Bad charsets are errors, and the fonts on them still come, without characters.
    for (char const *p_name : {"typeless", "other"})
        delete get_fonts_factory().create(p_name, &m_world.desktop());
    EXPECT_EQ((std::vector<std::string>{"Cannot load the charset 'typeless'\nunknown 'file_type' record",
                                        "Cannot load the charset 'other'\nunknown 'file_type' "
                                        "record\nfile_type 'bmfont'\nfile_name 'o.fnt'"}),
              capture.errors());
}

// Fonts share their charset and scale it by size; the default fonts of the data folder have Latin
// and Cyrillic.
TEST_F(FontTest, FontsShareTheirCharsetAndScaleItBySize) {
    std::string const file = "[common] dimension = 2 font_h = 1 [chars] 65 = 1 66 = 0.5 67 = 1 68 = 1";
    std::unique_ptr<CFont> small = font_from("shared", file, ", size = 64");
    qortest::write_file(m_dir + "/shared.fnt", "[common] [chars]"); // read once per process: ignored
    std::unique_ptr<CFont> large(get_fonts_factory().create("shared", &m_world.desktop()));
    large->set_size(128);
    EXPECT_EQ(small->get_char_description('B'), large->get_char_description('B'));
    EXPECT_NE(small->get_char_material('B'), large->get_char_material('B'));
    EXPECT_EQ(16, m_world.desktop().get_canvas().get_char_width('B', small.get()));
    EXPECT_EQ(32, m_world.desktop().get_canvas().get_char_width('B', large.get()));
    for (HUID const *p_id : {&FNT_NAME_DEFAULT, &FNT_NAME_FIXED}) {
        CFont *p_font = m_world.desktop().get_font(*p_id);
        EXPECT_NE(p_font->get_char_description(0x416), p_font->get_char_description(0x20)) << p_id->GetName();
        EXPECT_GE(m_world.desktop().get_canvas().get_text_height(p_font), 14) << p_id->GetName();
    }
}
