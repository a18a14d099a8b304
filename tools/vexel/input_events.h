// The mouse and the keyboard, as a file tells them.
#pragma once

#include "core/geom/types.h"

#include <string>
#include <vector>

class SPlayer;

// The highest number of a picture.
constexpr int kLastPicture = 0x7FFFFFFE;

struct InputEvent {
    enum Kind : U8 { kMove, kDown, kUp, kKey };

    int picture; // while which one is due
    Kind kind;
    S32 x = 0; // pixels of the picture
    S32 y = 0;
    int key = 0; // its code
    int modifiers = 0;
};

// A file with an event a line; docs/cli.md has its form. Each character of a text is a key.
class InputEvents {
public:
    // Reads the file. The exit code, after complaining when it is not 0: about the first line that
    // is wrong, by its number.
    int Load(const std::string& file);
    // By picture; those of one picture as they were given.
    const std::vector<InputEvent>& All() const { return events; }

private:
    std::vector<InputEvent> events;
};

// Does to a player what the events say. One for each playing; the events must outlive it.
class InputHand {
public:
    explicit InputHand(const InputEvents& inputEvents) : events(inputEvents.All()) {}
    // All that belongs to pictures up to this one and has not been done.
    void Deliver(int picture, SPlayer* player);

private:
    void Press(const InputEvent& event, SPlayer* player);
    void Do(const InputEvent& event, SPlayer* player);

    const std::vector<InputEvent>& events;
    size_t next = 0;
    bool placed = false; // the pointer has been somewhere: at x, y
    S32 x = 0;
    S32 y = 0;
    int pressed = 0;
};
