#include "tests/support/picture.h"

#include <png.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <sstream>

static U32 Channel(U32 pixel, int shift)
{
    return pixel >> shift & 0xFF;
}

static U32 MultiplyByAlpha(U32 pixel)
{
    U32 alpha = Channel(pixel, 24), result = alpha << 24;
    for (int shift = 0; shift < 24; shift += 8)
        result |= (Channel(pixel, shift) * alpha + 127) / 255 << shift;
    return result;
}

// Little-endian machines hold our pixels as bytes of blue, green, red and alpha.
static png_image Header(int width, int height)
{
    return {nullptr, PNG_IMAGE_VERSION, U32(width), U32(height), PNG_FORMAT_BGRA, 0, 0, 0, {}};
}

bool LoadPng(const std::string& path, Picture* picture)
{
    *picture = Picture();
    png_image image = Header(0, 0);
    if (!png_image_begin_read_from_file(&image, path.c_str()))
        return false;
    image.format = PNG_FORMAT_BGRA;
    Picture read(int(image.width), int(image.height));
    if (!png_image_finish_read(&image, nullptr, read.pixels.data(), 0, nullptr))
        return false;
    std::transform(read.pixels.begin(), read.pixels.end(), read.pixels.begin(), MultiplyByAlpha);
    *picture = read;
    return true;
}

// For eyes only: the colours stay multiplied.
static bool SavePng(const std::string& path, const Picture& picture)
{
    png_image image = Header(picture.width, picture.height);
    return png_image_write_to_file(&image, path.c_str(), 0, picture.pixels.data(), 0, nullptr);
}

static int Distance(U32 one, U32 other)
{
    int largest = 0;
    for (int shift = 0; shift < 32; shift += 8)
        largest = std::max(largest, std::abs(int(Channel(one, shift) - Channel(other, shift))));
    return largest;
}

PictureDiff Compare(const Picture& got, const Picture& want)
{
    if (got.width != want.width || got.height != want.height)
        return {int(std::max({got.pixels.size(), want.pixels.size(), size_t(1)})), 255};
    PictureDiff diff;
    for (size_t i = 0; i < got.pixels.size(); i++) {
        int distance = Distance(got.pixels[i], want.pixels[i]);
        if (distance != 0 && diff.count == 0)
            diff = {0, 0, int(i) % got.width, int(i) / got.width, got.pixels[i], want.pixels[i]};
        diff.count += distance != 0;
        diff.largest = std::max(diff.largest, distance);
    }
    return diff;
}

std::string ExpectSame(const Picture& got, const Picture& want, const std::string& name)
{
    PictureDiff diff = Compare(got, want);
    if (diff.count == 0)
        return "";
    const char* folder = std::getenv("VEXEL_TEST_OUT");
    const std::filesystem::path stem = std::filesystem::path(folder ? folder : "test-out") / name;
    std::error_code ignored;
    std::filesystem::create_directories(stem.parent_path(), ignored);
    bool saved = SavePng(stem.string() + "-got.png", got);
    saved &= SavePng(stem.string() + "-want.png", want);
    std::ostringstream text;
    text << stem.string() << "-*.png" << (saved ? "" : " (not saved)") << ": got " << got.width
         << "x" << got.height << ", want " << want.width << "x" << want.height << "; " << diff.count
         << " pixels differ, by up to " << diff.largest << ", the first at (" << diff.x << ", "
         << diff.y << "), got " << std::hex << diff.got << ", want " << diff.want;
    return text.str();
}
