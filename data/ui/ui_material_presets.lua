-- Named materials that a layout refers to by "material_preset" instead of a table of its own.
-- Run before each layout is imported; each export of a layout writes this file anew.
ui_material_presets = {
    -- The dialogs' buttons.
    button_normal = { material_template = "ui_color", color = { r = 52, g = 52, b = 52, a = 100 } },
    button_highlighted = { material_template = "ui_color", color = { r = 125, g = 125, b = 125, a = 200 } },
    button_pushed = { material_template = "ui_color", color = { r = 125, g = 125, b = 125, a = 120 } },
    button_checked = { material_template = "ui_color", color = { r = 125, g = 125, b = 125, a = 120 } },
    -- Panels and the text fields on them, as the console's.
    panel = { material_template = "ui_color", color = { r = 100, g = 100, b = 100, a = 150 } },
    text_field = { material_template = "ui_color", color = { r = 15, g = 15, b = 15, a = 150 } },
}
