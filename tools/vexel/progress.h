// The count of pictures on stderr.
#pragma once

// On a terminal one line that counts up, elsewhere a line a picture.
class Progress {
public:
    // `wanted`: also where no terminal is; `several`: also without being asked on a terminal.
    Progress(bool wanted, bool several);
    ~Progress() { End(); }

    void Show(const char* what, int number);
    // Ends the line, so that a message can follow.
    void End();

private:
    bool terminal;
    bool shown;
    bool lineOpen = false;
};
