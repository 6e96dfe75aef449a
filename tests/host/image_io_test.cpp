// The host's pictures: TGA files of both origins, 24 and 32 bits, raw and run-length encoded; PNG
// files of one, three and four channels; PNG round trips; missing, truncated and broken files; and
// the comparison of two pictures with its difference picture.
#include "host_test_support.h"
#include "image_io.h"

#include <stb/stb_image_write.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorhost;
using hosttest::bytes_t;
using hosttest::CTempDir;
using hosttest::put_u16;

namespace {

// A 3 by 2 picture, rows from the top: A B C, then D E F.
std::vector<rgba_t> const k_abc_def = {rgba_t(10, 20, 30, 40),     rgba_t(50, 60, 70, 80),
                                       rgba_t(90, 100, 110, 120),  rgba_t(130, 140, 150, 160),
                                       rgba_t(170, 180, 190, 200), rgba_t(210, 220, 230, 240)};

enum { TGA_RAW = 2, TGA_RLE = 10 };

bytes_t tga_header(int _type, int _w, int _h, int _bits, bool _top_origin, std::string const &_id = "") {
    bytes_t out = {static_cast<uint8_t>(_id.size()), 0, static_cast<uint8_t>(_type), 0, 0, 0, 0, 0};
    put_u16(out, 0);
    put_u16(out, 0);
    put_u16(out, _w);
    put_u16(out, _h);
    out.push_back(static_cast<uint8_t>(_bits));
    out.push_back(static_cast<uint8_t>((_bits == 32 ? 8 : 0) | (_top_origin ? 0x20 : 0)));
    out.insert(out.end(), _id.begin(), _id.end());
    return out;
}

void put_tga_pixel(bytes_t &_out, rgba_t const &_c, int _bits) {
    _out.insert(_out.end(), {_c.b, _c.g, _c.r});
    if (_bits == 32) _out.push_back(_c.a);
}

// An uncompressed TGA of the 3 by 2 picture, rows in the file's order.
bytes_t raw_tga(int _bits, bool _top_origin) {
    bytes_t out = tga_header(TGA_RAW, 3, 2, _bits, _top_origin, "id!");
    int const first_row = _top_origin ? 0 : 1;
    for (int row : {first_row, 1 - first_row})
        for (int x = 0; x < 3; ++x)
            put_tga_pixel(out, k_abc_def[row * 3 + x], _bits);
    return out;
}

rgba_t pixel(SImage const &_image, int _x, int _y) {
    uint8_t const *p = _image.pixel(_x, _y);
    return rgba_t(p[0], p[1], p[2], p[3]);
}

// The picture is the 3 by 2 one, with every alpha _alpha if that's given.
void expect_abc_def(SImage const &_image, int _alpha = -1) {
    ASSERT_EQ(3, _image.m_w);
    ASSERT_EQ(2, _image.m_h);
    ASSERT_EQ(24u, _image.m_pixels.size());
    for (int y = 0; y < 2; ++y)
        for (int x = 0; x < 3; ++x) {
            rgba_t expected = k_abc_def[y * 3 + x];
            if (_alpha >= 0) expected.a = static_cast<uint8_t>(_alpha);
            EXPECT_EQ(expected, pixel(_image, x, y)) << x << ", " << y;
        }
}

SImage abc_def_image() {
    SImage image;
    image.m_w = 3;
    image.m_h = 2;
    for (rgba_t const &c : k_abc_def)
        image.m_pixels.insert(image.m_pixels.end(), {c.r, c.g, c.b, c.a});
    return image;
}

// An image that a failed load must leave as it is.
SImage marker_image() {
    SImage image;
    image.m_w = 1;
    image.m_h = 1;
    image.m_pixels = {1, 2, 3, 4};
    return image;
}

void expect_load_fails(std::string const &_path) {
    SImage image = marker_image();
    EXPECT_FALSE(load_image(_path, image)) << _path;
    EXPECT_EQ(1, image.m_w);
    EXPECT_EQ(1, image.m_h);
    EXPECT_EQ((std::vector<uint8_t>{1, 2, 3, 4}), image.m_pixels);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Loading
// ---------------------------------------------------------------------------------------------

TEST(ImageLoad, TgaOfEitherOriginAndDepthGivesRowsFromTheTop) {
    CTempDir dir;
    for (int bits : {24, 32})
        for (bool top : {false, true}) {
            SCOPED_TRACE(std::to_string(bits) + (top ? " bits, top origin" : " bits, bottom origin"));
            SImage image;
            ASSERT_TRUE(load_image(dir.write("picture.tga", raw_tga(bits, top)), image));
            expect_abc_def(image, bits == 24 ? 255 : -1);
        }
}

TEST(ImageLoad, RunLengthEncodedTgaExpandsItsRunsAndRawPackets) {
    // Top row one run of D, bottom row a raw packet of D E F.
    bytes_t file = tga_header(TGA_RLE, 3, 2, 32, true);
    file.push_back(0x82);
    put_tga_pixel(file, k_abc_def[3], 32);
    file.push_back(0x02);
    for (int i = 3; i < 6; ++i)
        put_tga_pixel(file, k_abc_def[i], 32);
    CTempDir dir;
    SImage image;
    ASSERT_TRUE(load_image(dir.write("rle.tga", file), image));
    ASSERT_EQ(3, image.m_w);
    ASSERT_EQ(2, image.m_h);
    for (int x = 0; x < 3; ++x) {
        EXPECT_EQ(k_abc_def[3], pixel(image, x, 0));
        EXPECT_EQ(k_abc_def[3 + x], pixel(image, x, 1));
    }
}

TEST(ImageLoad, PngOfOneThreeOrFourChannelsBecomesRgba) {
    CTempDir dir;
    uint8_t const grey[] = {0, 100, 200, 255, 7, 9};
    uint8_t rgb[18];
    for (int i = 0; i < 6; ++i)
        rgb[i * 3] = k_abc_def[i].r, rgb[i * 3 + 1] = k_abc_def[i].g, rgb[i * 3 + 2] = k_abc_def[i].b;
    ASSERT_NE(0, stbi_write_png(dir.file("grey.png").c_str(), 3, 2, 1, grey, 3));
    ASSERT_NE(0, stbi_write_png(dir.file("rgb.png").c_str(), 3, 2, 3, rgb, 9));
    ASSERT_NE(0, stbi_write_png(dir.file("rgba.png").c_str(), 3, 2, 4, abc_def_image().m_pixels.data(), 12));

    SImage image;
    ASSERT_TRUE(load_image(dir.file("grey.png"), image));
    ASSERT_EQ(3, image.m_w);
    ASSERT_EQ(2, image.m_h);
    for (int i = 0; i < 6; ++i)
        EXPECT_EQ(rgba_t(grey[i], grey[i], grey[i], 255), pixel(image, i % 3, i / 3));
    ASSERT_TRUE(load_image(dir.file("rgb.png"), image));
    expect_abc_def(image, 255);
    ASSERT_TRUE(load_image(dir.file("rgba.png"), image));
    expect_abc_def(image);
}

TEST(ImageLoad, MissingEmptyAndForeignFilesFailAndLeaveTheImage) {
    CTempDir dir;
    expect_load_fails(dir.file("nothere.png"));
    expect_load_fails(dir.write("empty.tga", {}));
    expect_load_fails(dir.write("text.png", {'h', 'e', 'l', 'l', 'o', '\n'}));
    expect_load_fails(dir.path()); // a folder
    // A TGA header of a zero-sized picture and one of an image type that doesn't exist.
    expect_load_fails(dir.write("zero.tga", tga_header(TGA_RAW, 0, 2, 32, true)));
    bytes_t unknown_type = raw_tga(32, true);
    unknown_type[2] = 7;
    expect_load_fails(dir.write("type7.tga", unknown_type));
}

TEST(ImageLoad, TruncatedFilesFailAndLeaveTheImage) {
    CTempDir dir;
    bytes_t const tga = raw_tga(32, true);
    expect_load_fails(dir.write("short.tga", bytes_t(tga.begin(), tga.end() - 4)));
    expect_load_fails(dir.write("header.tga", bytes_t(tga.begin(), tga.begin() + 12)));

    bytes_t rle = tga_header(TGA_RLE, 3, 2, 32, true);
    rle.push_back(0x82);
    put_tga_pixel(rle, k_abc_def[0], 32);
    expect_load_fails(dir.write("short_rle.tga", rle)); // the bottom row's packet is missing
    rle.push_back(0x02);
    put_tga_pixel(rle, k_abc_def[0], 32);
    expect_load_fails(dir.write("short_raw_packet.tga", rle)); // two of its three pixels are missing

    SImage big;
    big.m_w = big.m_h = 16;
    for (int i = 0; i < 16 * 16; ++i)
        big.m_pixels.insert(big.m_pixels.end(), {uint8_t(i), uint8_t(i * 7), 9, 255});
    ASSERT_TRUE(write_png(dir.file("whole.png"), big));
    bytes_t const png = hosttest::read_bytes(dir.file("whole.png"));
    expect_load_fails(dir.write("half.png", bytes_t(png.begin(), png.begin() + png.size() / 2)));
    expect_load_fails(dir.write("signature.png", bytes_t(png.begin(), png.begin() + 8)));
}

// ---------------------------------------------------------------------------------------------
// Writing
// ---------------------------------------------------------------------------------------------

TEST(ImageWrite, PngRoundTripKeepsEveryByte) {
    CTempDir dir;
    SImage image;
    image.m_w = 5, image.m_h = 3;
    for (int i = 0; i < 15 * 4; ++i)
        image.m_pixels.push_back(static_cast<uint8_t>(i * 17 + 3));
    ASSERT_TRUE(write_png(dir.file("out.png"), image));
    SImage read;
    ASSERT_TRUE(load_image(dir.file("out.png"), read));
    EXPECT_EQ(5, read.m_w);
    EXPECT_EQ(3, read.m_h);
    EXPECT_EQ(image.m_pixels, read.m_pixels);
}

TEST(ImageWrite, EmptyImageOrMissingFolderFails) {
    CTempDir dir;
    EXPECT_FALSE(write_png(dir.file("empty.png"), SImage()));
    EXPECT_FALSE(write_png(dir.file("no/such/folder/out.png"), abc_def_image()));
    expect_load_fails(dir.file("empty.png"));
}

// ---------------------------------------------------------------------------------------------
// Comparison
// ---------------------------------------------------------------------------------------------

TEST(ImageCompare, CountsPixelsBeyondTheTolerance) {
    SImage const expected = abc_def_image();
    SImage actual = expected;
    EXPECT_EQ(0, compare_images(actual, expected, 0));
    actual.pixel(1, 0)[2] += 3; // blue of B
    actual.pixel(2, 1)[3] -= 1; // alpha of F
    EXPECT_EQ(2, compare_images(actual, expected, 0));
    EXPECT_EQ(1, compare_images(actual, expected, 2));
    EXPECT_EQ(0, compare_images(actual, expected, 3));
}

TEST(ImageCompare, PicturesOfDifferentSizesDifferEverywhere) {
    SImage const expected = abc_def_image();
    SImage wider;
    wider.m_w = 4, wider.m_h = 2;
    wider.m_pixels.assign(32, 0);
    EXPECT_EQ(9, compare_images(wider, expected, 255));
    EXPECT_EQ(9, compare_images(expected, wider, 255));
    EXPECT_EQ(7, compare_images(SImage(), expected, 0));
}

TEST(ImageCompare, DifferencePictureShowsTheExpectedDimmedAndDifferencesRed) {
    CTempDir dir;
    SImage const expected = abc_def_image();
    EXPECT_EQ(0, compare_images(expected, expected, 0, dir.file("same.png")));
    expect_load_fails(dir.file("same.png")); // no difference, no picture

    SImage actual = expected;
    actual.pixel(0, 1)[0] = 0;
    EXPECT_EQ(1, compare_images(actual, expected, 0, dir.file("diff.png")));
    SImage diff;
    ASSERT_TRUE(load_image(dir.file("diff.png"), diff));
    ASSERT_EQ(3, diff.m_w);
    ASSERT_EQ(2, diff.m_h);
    EXPECT_EQ(rgba_t(255, 0, 0, 255), pixel(diff, 0, 1));
    EXPECT_EQ(rgba_t(3, 6, 10, 255), pixel(diff, 0, 0));
    EXPECT_EQ(rgba_t(70, 73, 76, 255), pixel(diff, 2, 1));
}
