// Values in the form that listings show.
#pragma once

#include "core/geom/matrix.h"
#include "core/raster/color.h"

#include <string>

// Bytes in quotes: what is not plain ASCII as \xNN, quotes and backslashes with a backslash.
std::string Quote(const std::string& bytes);
// "xmin,xmax,ymin,ymax".
std::string RectText(const SRECT& r);
// "a,b,c,d,tx,ty" with a to d as decimal fractions; "identity".
std::string MatrixText(const MATRIX& m);
// "r*256+0,g*256+0,b*256+0,a*256+0".
std::string CxformText(const ColorTransform& cx);
// "#rrggbb", with two more digits when it is not opaque.
std::string ColorText(SRGB c);
