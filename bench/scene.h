// A movie on the bench: loaded into the headless player and brought to its still frame.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/headless/native_player.h"

struct BenchMovie {
    std::string name;
    std::string path;
    int stillFrame;                      // ticks before measuring
    std::vector<U8> (*make)() = nullptr; // in place of a file
    bool inCairo = true;                 // cairo draws it too
};

// The art and the samples, heaviest classes first.
const std::vector<BenchMovie>& BenchMovies();

class BenchScene {
public:
    BenchScene(const BenchMovie& movie, S32 width, S32 height, int quality);
    ~BenchScene();

    // Repaints every pixel from the cached edges.
    void Repaint();
    // Drops all edges and colours, then recalculates and repaints everything.
    void Rebuild();
    // Puts a small object on top of everything, or moves it on, and repaints what that changes.
    void MoveSmallObject();

    NativePlayerWnd player;

private:
    SObject* small = nullptr;
    int step = 0;
    std::vector<U8> smallShape; // the small object's shape record
    SCharacter* smallCharacter = nullptr;
};
