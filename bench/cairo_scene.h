// The still picture of a player as cairo would draw it: the same outlines, fills and masks, kept as
// retained paths and patterns, drawn into an image surface with the default anti-aliasing.
#pragma once

#include <cairo.h>

#include <vector>

#include "core/display/sobject.h"
#include "platform/headless/native_player.h"

class STextRecords;

class CairoScene {
public:
    explicit CairoScene(NativePlayerWnd* player);
    ~CairoScene();
    CairoScene(const CairoScene&) = delete;
    CairoScene& operator=(const CairoScene&) = delete;

    void Draw();
    // Writes the surface as a PNG, to see that it shows the same picture.
    bool Save(const char* path);
    // What cairo says went wrong, or "no error has occurred".
    const char* Status() const { return cairo_status_to_string(cairo_status(cr)); }

private:
    struct Item {
        cairo_path_t* path;
        cairo_pattern_t* paint; // null: a clip that the following items lie under
        cairo_matrix_t matrix;
        bool endClip;     // no path: the clip ends here
        double width = 0; // above 0: a stroke, units of the path
        bool winding = false;
    };
    struct Contours;
    struct Painted;

    void AddTree(SObject* obj, STransform xform);
    void AddShape(SObject* obj, const STransform& xform, bool clip);
    void MakeStroke(Item* item, const Painted& painted);
    void AddText(SObject* obj, const STransform& xform);
    void AddGlyph(const STextRecords& text, Contours* letters);
    void AddItem(const Contours& outline, cairo_pattern_t* paint, const MATRIX& mat);
    cairo_matrix_t DeviceMatrix(const MATRIX& mat) const;
    cairo_pattern_t* PatternOf(const RColor* color) const;
    cairo_pattern_t* ImagePattern(const RColor* color) const;
    void Free(RColor* colors);

    NativePlayerWnd* player;
    cairo_surface_t* surface;
    cairo_t* cr;
    std::vector<Item> items;
};
