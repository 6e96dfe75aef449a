local w = { name = "cycle", class_name = "WindowVisual" }; w[1] = w
ui_windows_ini = { name = "desktop", class_name = "Desktop", w }
