// The scenes of scenes.h built with Dear ImGui, without a backend: each frame's draw lists are
// copied into vertex and index buffers reserved once, as an engine's backend fills its buffers.
// There is no layout file in ImGui (S3), and a pointer move is only looked at in a frame (S2 is
// measured with the frame).
#include "scenes.h"

#include <imgui.h>

#include <cstring>
#include <string>
#include <vector>

namespace {

// What a backend does with a frame: its vertices and indices into buffers that never grow.
class CDrawCopy {
public:
    CDrawCopy() {
        m_vertices.resize(1 << 20);
        m_indices.resize(1 << 21);
    }

    void take(ImDrawData const *_p_data) {
        size_t vertices = 0, indices = 0;
        for (int i = 0; i < _p_data->CmdListsCount; ++i) {
            ImDrawList const *p_list = _p_data->CmdLists[i];
            size_t const nv = static_cast<size_t>(p_list->VtxBuffer.Size);
            size_t const ni = static_cast<size_t>(p_list->IdxBuffer.Size);
            if (vertices + nv > m_vertices.size() || indices + ni > m_indices.size()) break;
            std::memcpy(&m_vertices[vertices], p_list->VtxBuffer.Data, nv * sizeof(ImDrawVert));
            std::memcpy(&m_indices[indices], p_list->IdxBuffer.Data, ni * sizeof(ImDrawIdx));
            vertices += nv;
            indices += ni;
        }
        m_last_vertices = vertices;
    }
    size_t quads() const { return m_last_vertices / 4; }

private:
    std::vector<ImDrawVert> m_vertices;
    std::vector<ImDrawIdx> m_indices;
    size_t m_last_vertices = 0;
};

std::vector<std::string> g_captions;
std::vector<std::string> g_lines;
CDrawCopy g_copy;

void begin_frame() {
    ImGui::GetIO().DeltaTime = 1.0f / 60.0f;
    ImGui::NewFrame();
}

void end_frame() {
    ImGui::Render();
    g_copy.take(ImGui::GetDrawData());
}

ImGuiWindowFlags const k_plain = ImGuiWindowFlags_NoDecoration | ImGuiWindowFlags_NoSavedSettings |
                                 ImGuiWindowFlags_NoMove | ImGuiWindowFlags_NoBringToFrontOnFocus;

void buttons_frame(int _count) {
    begin_frame();
    ImGui::PushStyleVar(ImGuiStyleVar_WindowPadding, ImVec2(0, 0));
    ImGui::PushStyleVar(ImGuiStyleVar_ItemSpacing, ImVec2(0, 0));
    ImGui::SetNextWindowPos(ImVec2(0, 0));
    ImGui::SetNextWindowSize(ImVec2(scenes::k_screen_w, scenes::k_screen_h));
    ImGui::Begin("scene", nullptr, k_plain | ImGuiWindowFlags_NoBackground);
    for (int i = 0; i < _count; ++i) {
        scenes::SRect const r = scenes::button_rect(i);
        ImGui::SetCursorPos(ImVec2(static_cast<float>(r.x), static_cast<float>(r.y)));
        ImGui::Button(g_captions[i].c_str(), ImVec2(static_cast<float>(r.w), static_cast<float>(r.h)));
    }
    ImGui::End();
    ImGui::PopStyleVar(2);
    end_frame();
}

void text_frame() {
    begin_frame();
    scenes::SRect const r = scenes::k_text_window;
    ImGui::SetNextWindowPos(ImVec2(static_cast<float>(r.x), static_cast<float>(r.y)));
    ImGui::SetNextWindowSize(ImVec2(static_cast<float>(r.w), static_cast<float>(r.h)));
    ImGui::Begin("text window", nullptr, k_plain);
    for (std::string const &line : g_lines)
        ImGui::TextUnformatted(line.c_str(), line.c_str() + line.size());
    ImGui::End();
    end_frame();
}

} // namespace

int main() {
    for (int i = 0; i < scenes::k_buttons; ++i)
        g_captions.push_back(scenes::button_caption(i));
    for (int i = 0; i < scenes::k_text_lines; ++i)
        g_lines.push_back(scenes::text_line(i));

    ImGui::CreateContext();
    ImGuiIO &io = ImGui::GetIO();
    io.DisplaySize = ImVec2(scenes::k_screen_w, scenes::k_screen_h);
    io.IniFilename = nullptr;
    io.LogFilename = nullptr;
    unsigned char *p_pixels = nullptr;
    int tex_w = 0, tex_h = 0;
    io.Fonts->GetTexDataAsRGBA32(&p_pixels, &tex_w, &tex_h); // the default font, built once
    io.Fonts->SetTexID(reinterpret_cast<ImTextureID>(1));

    // Immediate mode keeps no window per button: the memory of a button is what its drawing adds
    // to the frame's buffers and to the ID storage.
    for (int i = 0; i < 3; ++i)
        buttons_frame(0);
    scenes::SHeapCount const before = scenes::heap_count();
    for (int i = 0; i < 3; ++i)
        buttons_frame(scenes::k_buttons);
    scenes::SHeapCount const after = scenes::heap_count();
    scenes::print_value("imgui", "MEM_bytes/btn",
                        static_cast<double>(after.m_live_bytes - before.m_live_bytes) / scenes::k_buttons);
    scenes::print_value("imgui", "MEM_allocs/btn",
                        static_cast<double>(after.m_allocations - before.m_allocations) / scenes::k_buttons);

    scenes::SSummary const s1 = scenes::measure([] { buttons_frame(scenes::k_buttons); }, 300);
    scenes::print("imgui", "S1_frame", s1);
    scenes::print_value("imgui", "MEM_allocs/frm", s1.m_allocations);
    scenes::print_value("imgui", "S1_quads", static_cast<double>(g_copy.quads()));

    uint64_t k = 0;
    scenes::print("imgui", "S2_move+frame",
                  scenes::measure(
                      [&k] {
                          int x, y;
                          scenes::button_centre(scenes::move_target(++k), x, y);
                          ImGui::GetIO().MousePos = ImVec2(static_cast<float>(x), static_cast<float>(y));
                          buttons_frame(scenes::k_buttons);
                      },
                      300));

    scenes::print("imgui", "S4_frame", scenes::measure(text_frame, 300));
    scenes::print_value("imgui", "S4_quads", static_cast<double>(g_copy.quads()));
    ImGui::DestroyContext();
    return 0;
}
