-- The interface's fonts: charsets[name] names a character description (font folder),
-- fonts[name] a charset, the material that shows its texture and the size in pixels per
-- texture unit. Made by scripts/make_fonts.sh.
charsets["arial_white"] = { file_type = "nehe", file_name = "arial_white.fnt" }
fonts["arial_white"] = {
    charset_name = "arial_white",
    size = 512,
    material = {
        material_template = "ui_image",
        diffuse_texture = "arial_white.tga",
        tex_size = { 512, 512 },
        color = { r = 255, g = 255, b = 255, a = 255 },
    },
}
charsets["courier"] = { file_type = "nehe", file_name = "courier.fnt" }
fonts["courier"] = {
    charset_name = "courier",
    size = 300,
    material = {
        material_template = "ui_image",
        diffuse_texture = "courier.tga",
        tex_size = { 300, 300 },
        color = { r = 255, g = 255, b = 255, a = 255 },
    },
}
