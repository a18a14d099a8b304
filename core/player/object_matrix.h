// Scale and rotation of a placement, as scripts read and write them: by the columns of the matrix,
// which are the images of the two axes. On integers only, so that every machine moves an object to
// the same place.
#pragma once

#include "core/geom/matrix.h"

enum SAxis { kAxisX, kAxisY };

// The length of a column in percent.
double MatrixScalePercent(const MATRIX* m, SAxis axis);
// Gives a column the length, in its own direction, opposite to it when negative. One without length
// gets the direction that makes a right angle with the other. Nothing when that changes the length
// by 16/65536 or less.
void MatrixSetScalePercent(MATRIX* m, SAxis axis, double percent);

// The direction of the first column in degrees, from -180 to 180; 90 when it has no length.
double MatrixRotation(const MATRIX* m);
// Turns both columns so that the first gets the direction; lengths and the angle between them stay.
void MatrixSetRotation(MATRIX* m, double degrees);
