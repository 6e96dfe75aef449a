-- Named materials that a layout refers to by "material_preset" instead of a table of its own.
-- Run before each layout is imported; each export of a layout writes this file anew with the
-- presets that the exported windows use (the demo scene uses them all).
-- The pictures of the controls are made by scripts/make_control_textures.py.
ui_material_presets = {
    -- Buttons, by state: nine-patches with corners of 4 pixels.
    button_normal = { material_template = "ui_image", diffuse_texture = "button.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25, border_bottom = 0.25 },
    button_highlighted = { material_template = "ui_image", diffuse_texture = "button_highlighted.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25, border_bottom = 0.25 },
    button_pushed = { material_template = "ui_image", diffuse_texture = "button_pushed.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25, border_bottom = 0.25 },
    button_checked = { material_template = "ui_image", diffuse_texture = "button_checked.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25, border_bottom = 0.25 },
    button_disabled = { material_template = "ui_image", diffuse_texture = "button_disabled.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25, border_bottom = 0.25 },
    -- Check boxes and radio buttons: on, off, both disabled, and the picture under the pointer.
    checker_on = { material_template = "ui_image", diffuse_texture = "checker_on.tga", tex_size = { 16, 16 } },
    checker_off = { material_template = "ui_image", diffuse_texture = "checker_off.tga", tex_size = { 16, 16 } },
    checker_on_disabled = { material_template = "ui_image", diffuse_texture = "checker_on_disabled.tga", tex_size = { 16, 16 } },
    checker_off_disabled = { material_template = "ui_image", diffuse_texture = "checker_off_disabled.tga", tex_size = { 16, 16 } },
    checker_highlighted = { material_template = "ui_image", diffuse_texture = "checker_highlighted.tga", tex_size = { 16, 16 } },
    radio_on = { material_template = "ui_image", diffuse_texture = "radio_on.tga", tex_size = { 16, 16 } },
    radio_off = { material_template = "ui_image", diffuse_texture = "radio_off.tga", tex_size = { 16, 16 } },
    radio_on_disabled = { material_template = "ui_image", diffuse_texture = "radio_on_disabled.tga", tex_size = { 16, 16 } },
    radio_off_disabled = { material_template = "ui_image", diffuse_texture = "radio_off_disabled.tga", tex_size = { 16, 16 } },
    radio_highlighted = { material_template = "ui_image", diffuse_texture = "radio_highlighted.tga", tex_size = { 16, 16 } },
    -- The step buttons and the scroller of scroll bars.
    arrow_up = { material_template = "ui_image", diffuse_texture = "arrow_up.tga", tex_size = { 16, 16 } },
    arrow_up_highlighted = { material_template = "ui_image", diffuse_texture = "arrow_up_highlighted.tga", tex_size = { 16, 16 } },
    arrow_up_pushed = { material_template = "ui_image", diffuse_texture = "arrow_up_pushed.tga", tex_size = { 16, 16 } },
    arrow_down = { material_template = "ui_image", diffuse_texture = "arrow_down.tga", tex_size = { 16, 16 } },
    arrow_down_highlighted = { material_template = "ui_image", diffuse_texture = "arrow_down_highlighted.tga", tex_size = { 16, 16 } },
    arrow_down_pushed = { material_template = "ui_image", diffuse_texture = "arrow_down_pushed.tga", tex_size = { 16, 16 } },
    arrow_left = { material_template = "ui_image", diffuse_texture = "arrow_left.tga", tex_size = { 16, 16 } },
    arrow_left_highlighted = { material_template = "ui_image", diffuse_texture = "arrow_left_highlighted.tga", tex_size = { 16, 16 } },
    arrow_left_pushed = { material_template = "ui_image", diffuse_texture = "arrow_left_pushed.tga", tex_size = { 16, 16 } },
    arrow_right = { material_template = "ui_image", diffuse_texture = "arrow_right.tga", tex_size = { 16, 16 } },
    arrow_right_highlighted = { material_template = "ui_image", diffuse_texture = "arrow_right_highlighted.tga", tex_size = { 16, 16 } },
    arrow_right_pushed = { material_template = "ui_image", diffuse_texture = "arrow_right_pushed.tga", tex_size = { 16, 16 } },
    scroller = { material_template = "ui_image", diffuse_texture = "scroller.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.375, border_bottom = 0.375 },
    scroller_highlighted = { material_template = "ui_image", diffuse_texture = "scroller_highlighted.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.375, border_bottom = 0.375 },
    scroller_pushed = { material_template = "ui_image", diffuse_texture = "scroller_pushed.tga", tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.375, border_bottom = 0.375 },
    -- Value bars: the track and the filled part of a progress bar.
    bar_track = { material_template = "ui_color", color = { r = 16, g = 20, b = 28, a = 220 } },
    progress = { material_template = "ui_color", color = { r = 110, g = 196, b = 132, a = 230 } },
    -- Lists: the row under the pointer and the chosen row.
    row_under_pointer = { material_template = "ui_color", color = { r = 78, g = 100, b = 140, a = 160 } },
    row_chosen = { material_template = "ui_color", color = { r = 236, g = 186, b = 84, a = 110 } },
    -- The bar along the desktop's top, the dialogs' bodies (opaque, and the framed dialog's slightly
    -- translucent) and their title bars and frames, the text fields on them and the caret of an
    -- edit box.
    top_bar = { material_template = "ui_color", color = { r = 40, g = 48, b = 66, a = 255 } },
    panel = { material_template = "ui_color", color = { r = 30, g = 36, b = 48, a = 255 } },
    framed_panel = { material_template = "ui_color", color = { r = 30, g = 36, b = 48, a = 235 } },
    title_bar = { material_template = "ui_color", color = { r = 90, g = 70, b = 150, a = 255 } },
    text_field = { material_template = "ui_color", color = { r = 15, g = 15, b = 15, a = 150 } },
    caret = { material_template = "ui_color", color = { r = 120, g = 120, b = 120, a = 150 } },
}
