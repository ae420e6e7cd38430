#include "export/png_writer.h"

#include <png.h>

#include <csetjmp>

#include "export/output_file.h"

namespace ondrel {

namespace {

void put(png_structp png, png_bytep data, png_size_t bytes) {
    if (!static_cast<OutputFile*>(png_get_io_ptr(png))->write(data, bytes)) png_error(png, "write failed");
}
void no_flush(png_structp) {}

// libpng reports errors by jumping back here, so nothing in this function may need
// destroying: the rows come ready.
bool encode(OutputFile& file, int width, int height, const std::vector<png_bytep>& rows) {
    png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, nullptr, nullptr);
    if (!png) return false;
    png_infop info = png_create_info_struct(png);
    if (!info || setjmp(png_jmpbuf(png))) {
        png_destroy_write_struct(&png, &info);
        return false;
    }
    png_set_write_fn(png, &file, put, no_flush);
    png_set_IHDR(png, info, static_cast<png_uint_32>(width), static_cast<png_uint_32>(height), 8,
                 PNG_COLOR_TYPE_RGB, PNG_INTERLACE_NONE, PNG_COMPRESSION_TYPE_DEFAULT,
                 PNG_FILTER_TYPE_DEFAULT);
    png_write_info(png, info);
    for (int y = 0; y < height; ++y) png_write_row(png, rows[static_cast<size_t>(y)]);
    png_write_end(png, nullptr);
    png_destroy_write_struct(&png, &info);
    return true;
}

}  // namespace

bool write_png(const std::string& path, int width, int height, const std::vector<uint32_t>& pixels,
               std::string& why) {
    if (width <= 0 || height <= 0 ||
        pixels.size() < static_cast<size_t>(width) * static_cast<size_t>(height)) {
        why = "no picture to write";
        return false;
    }
    std::vector<uint8_t> rgb(static_cast<size_t>(width) * static_cast<size_t>(height) * 3);
    for (size_t i = 0; i < rgb.size() / 3; ++i) {
        rgb[3 * i] = static_cast<uint8_t>(pixels[i] >> 16);
        rgb[3 * i + 1] = static_cast<uint8_t>(pixels[i] >> 8);
        rgb[3 * i + 2] = static_cast<uint8_t>(pixels[i]);
    }
    std::vector<png_bytep> rows(static_cast<size_t>(height));
    for (int y = 0; y < height; ++y)
        rows[static_cast<size_t>(y)] = rgb.data() + static_cast<size_t>(y) * width * 3;
    OutputFile file;
    if (!file.open(path, why)) return false;
    if (!encode(file, width, height, rows)) {
        why = file.error().empty() ? "cannot write " + path + ": the PNG encoder failed" : file.error();
        return false;
    }
    return file.commit(why);
}

}  // namespace ondrel
