#pragma once
#include <cstdint>

struct SDL_Renderer;
struct SDL_Texture;

namespace ondrel {

// A texture of the window's renderer that a window fills with its own pixels (0x00RRGGBB,
// row by row) and draws scaled, pixel for pixel without smoothing.
class StreamingTexture {
public:
    StreamingTexture(SDL_Renderer* renderer, int width, int height);
    ~StreamingTexture();
    StreamingTexture(const StreamingTexture&) = delete;
    StreamingTexture& operator=(const StreamingTexture&) = delete;

    // Copies width x height pixels in; false when there is no texture (no renderer, or the
    // renderer refused it).
    bool update(const uint32_t* pixels);
    // For ImGui::Image; null before the first update.
    void* id() const { return texture_; }

private:
    SDL_Renderer* renderer_;
    int width_, height_;
    SDL_Texture* texture_ = nullptr;
};

}  // namespace ondrel
