#include "tests/support/picture.h"

#include <png.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

static U32 Channel(U32 pixel, int shift)
{
    return pixel >> shift & 0xFF;
}

static U32 Premultiply(U32 pixel)
{
    U32 alpha = Channel(pixel, 24), result = alpha << 24;
    for (int shift = 0; shift < 24; shift += 8)
        result |= (Channel(pixel, shift) * alpha + 127) / 255 << shift;
    return result;
}

// Rounded so that Premultiply gives back the same pixel.
static U32 Unpremultiply(U32 pixel)
{
    U32 alpha = Channel(pixel, 24), result = alpha << 24;
    for (int shift = 0; alpha != 0 && shift < 24; shift += 8)
        result |= std::min(255u, (Channel(pixel, shift) * 255 + alpha / 2) / alpha) << shift;
    return result;
}

bool LoadPng(const std::string& path, Picture* picture)
{
    *picture = Picture();
    png_image image{};
    image.version = PNG_IMAGE_VERSION;
    if (!png_image_begin_read_from_file(&image, path.c_str()))
        return false;
    image.format = PNG_FORMAT_BGRA;
    std::vector<U8> bytes(PNG_IMAGE_SIZE(image));
    if (!png_image_finish_read(&image, nullptr, bytes.data(), 0, nullptr))
        return false;
    *picture = Picture(int(image.width), int(image.height));
    for (size_t i = 0; i < picture->pixels.size(); i++) {
        const U8* p = &bytes[i * 4];
        picture->pixels[i] =
            Premultiply(U32(p[3]) << 24 | U32(p[2]) << 16 | U32(p[1]) << 8 | U32(p[0]));
    }
    return true;
}

bool SavePng(const std::string& path, const Picture& picture)
{
    png_image image{};
    image.version = PNG_IMAGE_VERSION;
    image.width = png_uint_32(picture.width);
    image.height = png_uint_32(picture.height);
    image.format = PNG_FORMAT_BGRA;
    std::vector<U8> bytes;
    for (U32 premultiplied : picture.pixels) {
        U32 pixel = Unpremultiply(premultiplied);
        for (int shift = 0; shift < 32; shift += 8)
            bytes.push_back(U8(pixel >> shift));
    }
    return png_image_write_to_file(&image, path.c_str(), 0, bytes.data(), 0, nullptr) != 0;
}

static int Distance(U32 one, U32 other)
{
    int largest = 0;
    for (int shift = 0; shift < 32; shift += 8)
        largest =
            std::max(largest, std::abs(int(Channel(one, shift)) - int(Channel(other, shift))));
    return largest;
}

PictureDiff Compare(const Picture& got, const Picture& want, int tolerance)
{
    if (got.width != want.width || got.height != want.height)
        return {std::max({int(got.pixels.size()), int(want.pixels.size()), 1}), 255, 0, 0};
    PictureDiff diff;
    for (size_t i = 0; i < got.pixels.size(); i++) {
        int distance = Distance(got.pixels[i], want.pixels[i]);
        diff.largest = std::max(diff.largest, distance);
        if (distance <= tolerance)
            continue;
        if (diff.count++ == 0) {
            diff.firstX = int(i % size_t(got.width));
            diff.firstY = int(i / size_t(got.width));
        }
    }
    return diff;
}

static std::string OutputFolder()
{
    const char* named = std::getenv("VEXEL_TEST_OUT");
    std::string folder = named && *named ? named : "test-out";
    std::error_code ignored;
    std::filesystem::create_directories(folder, ignored);
    return folder;
}

// The wanted picture in dim greys, with every pixel that differs in red.
static Picture DifferencePicture(const Picture& got, const Picture& want, int tolerance)
{
    Picture result(want.width, want.height);
    bool sameSize = got.width == want.width && got.height == want.height;
    for (size_t i = 0; i < want.pixels.size(); i++) {
        U32 pixel = want.pixels[i];
        U32 grey = 160 + (Channel(pixel, 16) + Channel(pixel, 8) + Channel(pixel, 0)) / 9;
        bool same = sameSize && Distance(got.pixels[i], pixel) <= tolerance;
        result.pixels[i] = same ? 0xFF000000 | grey * 0x010101 : 0xFFFF0000;
    }
    return result;
}

static std::string Hex(U32 pixel)
{
    char text[16];
    std::snprintf(text, sizeof text, "%08X", unsigned(pixel));
    return text;
}

static std::string Describe(const Picture& got, const Picture& want, const PictureDiff& diff)
{
    auto size = [](const Picture& p) {
        return std::to_string(p.width) + "x" + std::to_string(p.height);
    };
    if (got.width != want.width || got.height != want.height)
        return "got " + size(got) + " pixels, want " + size(want);
    return std::to_string(diff.count) + " of " + std::to_string(got.pixels.size()) +
           " pixels differ, by up to " + std::to_string(diff.largest) + "; the first at (" +
           std::to_string(diff.firstX) + ", " + std::to_string(diff.firstY) + "): got " +
           Hex(got.At(diff.firstX, diff.firstY)) + ", want " +
           Hex(want.At(diff.firstX, diff.firstY));
}

std::string ExpectSame(const Picture& got, const Picture& want, const std::string& name,
                       int tolerance, int allowed)
{
    PictureDiff diff = Compare(got, want, tolerance);
    bool sameSize = got.width == want.width && got.height == want.height;
    if (sameSize && diff.count <= allowed)
        return "";
    std::string stem = OutputFolder() + "/" + name;
    bool written = SavePng(stem + "-got.png", got);
    written &= SavePng(stem + "-want.png", want);
    written &= SavePng(stem + "-diff.png", DifferencePicture(got, want, tolerance));
    return name + ": " + Describe(got, want, diff) +
           (written ? " (see " + stem + "-*.png)" : " (pictures not written to " + stem + ")");
}

std::string ExpectSamePng(const Picture& got, const std::string& wantPath, const std::string& name,
                          int tolerance, int allowed)
{
    Picture want;
    if (!LoadPng(wantPath, &want))
        return name + ": cannot read " + wantPath;
    return ExpectSame(got, want, name, tolerance, allowed);
}
