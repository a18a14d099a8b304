// What the scripts of a movie do, record by record, on stderr.
#pragma once

class SPlayer;

// One line for each record, as it is about to be executed:
//   trace: 3 /hero 120 Push "abc" stack=1 top="x"
// the picture, the timeline, the record's offset in its movie, what it is, how many values are on
// the stack and the last of them.
class ActionTrace {
public:
    // From now on; the player must not outlive this.
    void Watch(SPlayer* player);
    void SetPicture(int number) { picture = number; }

private:
    int picture = 1;

    friend struct ActionTracer;
};
