#include "shell/gui/streaming_texture.h"

#include <SDL.h>

namespace ondrel {

StreamingTexture::StreamingTexture(SDL_Renderer* renderer, int width, int height)
    : renderer_(renderer), width_(width), height_(height) {}

StreamingTexture::~StreamingTexture() {
    if (texture_) SDL_DestroyTexture(texture_);
}

bool StreamingTexture::update(const uint32_t* pixels) {
    if (!texture_ && renderer_) {
        texture_ = SDL_CreateTexture(renderer_, SDL_PIXELFORMAT_RGB888, SDL_TEXTUREACCESS_STREAMING, width_,
                                     height_);
        if (texture_) SDL_SetTextureScaleMode(texture_, SDL_ScaleModeNearest);
    }
    return texture_ && SDL_UpdateTexture(texture_, nullptr, pixels, width_ * 4) == 0;
}

}  // namespace ondrel
