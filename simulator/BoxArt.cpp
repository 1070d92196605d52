#include <stddef.h>
#include <stdio.h>
// The JPEG library's header wants the two above before it.
#include <jpeglib.h>

#include <cstdlib>
#include <functional>
#include <memory>
#include <vector>

#include "PlainService.h"

namespace simulator {

std::string MakeBoxArt(const std::string& prefix, int width)
{
    const int height = width * 3 / 2;
    const size_t seed = std::hash<std::string>()(prefix);
    jpeg_compress_struct image;
    jpeg_error_mgr errors;
    image.err = jpeg_std_error(&errors);
    jpeg_create_compress(&image);
    unsigned char* bytes = nullptr;
    unsigned long size = 0;
    jpeg_mem_dest(&image, &bytes, &size);
    image.image_width = static_cast<JDIMENSION>(width);
    image.image_height = static_cast<JDIMENSION>(height);
    image.input_components = 3;
    image.in_color_space = JCS_RGB;
    jpeg_set_defaults(&image);
    jpeg_start_compress(&image, TRUE);
    std::vector<unsigned char> line(static_cast<size_t>(width) * 3);
    for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
            unsigned char* pixel = &line[static_cast<size_t>(x) * 3];
            const bool frame = x < 4 || y < 4 || x >= width - 4 || y >= height - 4;
            pixel[0] = static_cast<unsigned char>(frame ? 20 : (seed + static_cast<size_t>(x) * 2) & 255);
            pixel[1] = static_cast<unsigned char>(frame ? 20 : (seed / 256 + static_cast<size_t>(y)) & 255);
            pixel[2] = static_cast<unsigned char>(frame ? 20 : (seed / 65536 + static_cast<size_t>(x * y) / 64) & 255);
        }
        JSAMPROW row = line.data();
        jpeg_write_scanlines(&image, &row, 1);
    }
    jpeg_finish_compress(&image);
    jpeg_destroy_compress(&image);
    const std::unique_ptr<unsigned char, void (*)(void*)> owned(bytes, free);
    return std::string(reinterpret_cast<char*>(bytes), size);
}

}  // namespace simulator
