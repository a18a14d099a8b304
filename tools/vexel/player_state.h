// What a player holds, as a tree of nodes for those who show it.
#pragma once

#include "platform/headless/native_player.h"

#include <string>
#include <vector>

// A display object, or a level. It is read while the player stands still.
struct StateNode {
    const SObject* object;  // null: a level that shows nothing yet
    ScriptThread* timeline; // its own; null: none
    int level;              // -1: not a level
    std::string path;       // empty: none leads there

    const SCharacter* Character() const { return object ? object->character : nullptr; }
    bool IsButton() const;
    // "shape", "sprite", ...; null for what shows nothing any more.
    const char* Type() const;
    // The id in the movie, or -1: movies have none, and neither has the sprite that stands in for
    // an unloaded one.
    int CharacterId() const;
    // A button's: "none", "up", "over", "down" or "outside".
    const char* ButtonState() const;
    // The instance name, or null.
    const char* Name() const { return object ? object->name : nullptr; }
    // The pixels that the object and all inside it lie in, of `units` device units each; empty when
    // there is nothing.
    SRECT Bounds(int units) const;
    // From the lowest depth up.
    std::vector<StateNode> Children() const;
};

// By number.
std::vector<StateNode> LevelsOf(SPlayer* player);
// A level's movie's URL, or "".
const char* LevelUrl(const StateNode& level);
// The object that has the keyboard focus: its timeline's path, with its own name if it has one.
// Empty when there is none.
std::string FocusPath(const SPlayer& player);
// "low", "high" or "best".
const char* QualityName(const SPlayer& player);
// Device units in a pixel: 4 when anti-aliased.
int UnitsPerPixel(const SPlayer& player);

// The whole state at a picture, on one line or in lines for people.
std::string StateJson(NativePlayerWnd* player, int picture);
std::string StateText(NativePlayerWnd* player, int picture);
