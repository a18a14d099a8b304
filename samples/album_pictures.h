#pragma once

#include "tests/support/image_writer.h"

// The pictures of the album, painted by program: noise for mountains, clouds and wood, geometry for
// the rest. Colours of pictures with alpha are already multiplied by it, as the player wants them.

// Smooth ones, for JPEG.
ImageSource PaintLake();   // at dawn, with its reflection
ImageSource PaintNebula(); // gas and stars
ImageSource PaintDunes();
ImageSource PaintPlanet(); // a ball with alpha round it

ImageSource PaintWoodcut();    // 1 bit: the lake in black and white
ImageSource PaintHandheld();   // 2 bits: the dunes in four greens
ImageSource PaintAzulejo();    // 4 bits: a tile that repeats
ImageSource PaintWood();       // 8 bits: a table, repeating too
ImageSource PaintSunset();     // 16 bits: 5-5-5
ImageSource PaintFlower();     // 32 bits
ImageSource PaintStripes();    // 1 bit with alpha: a translucent tape
ImageSource PaintDots();       // 2 bits with alpha: another
ImageSource PaintLocomotive(); // 4 bits with alpha: 20 by 15 large pixels
ImageSource PaintCoffee();     // 8 bits with alpha: the ring that a cup left
ImageSource PaintBubble();     // 32 bits with alpha
