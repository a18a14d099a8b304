// What a movie may reach: files around it, and the network.
#pragma once

#include <string>
#include <vector>

// What is said to a request.
struct Access {
    const char* refusal = nullptr; // why it is refused; null: it is granted
    bool isFile = false;
    std::string path; // real, of the file
};

// A movie opened from a file reads files in its own folder and below, by their real paths, and
// nothing from the network; one from the network reads its own origin and no file. AllowDir opens a
// folder to either, AllowNet the network to the former. Nobody tells which of several movies asks:
// once one from the network plays, the folder of the first is closed to all, and so is the network
// but for the origins of those that play.
class AccessPolicy {
public:
    // Every origin on the network, for movies from files; what the user opens.
    void AllowNet() { netAllowed = true; }
    bool NetAllowed() const { return netAllowed; }
    // The files in a folder and below; false when it is none.
    bool AllowDir(const std::string& dir);
    // The first movie was opened from that URL; an empty one stands for nowhere.
    void SetOrigin(const std::string& url);
    // A movie from that URL plays beside the first.
    void NoteMovie(const std::string& url);

    // May a movie read from an absolute URL, or send something there?
    Access Check(const std::string& url) const;
    // The same for where a server sends a request on to, a movie's or the user's: never a file.
    Access CheckRedirect(const std::string& url, bool byUser) const;
    // May the user open a movie there? Any file, and the network only if it is allowed.
    Access CheckOpen(const std::string& url) const;

private:
    Access Split(const std::string& url) const;
    Access CheckFile(Access access) const;
    bool IsNamedWell(const std::string& path) const;
    bool MayReadFile(const std::string& path) const;
    bool IsOrigin(const std::string& url) const;

    bool netAllowed = false;
    bool netMovie = false;              // one from the network plays
    std::vector<std::string> origins;   // URLs of movies from the network, one for each origin
    std::string folder;                 // of the first movie, real; empty: none
    std::string namedFolder;            // the same as it was named
    std::vector<std::string> dirs;      // allowed ones, real
    std::vector<std::string> namedDirs; // the same, and as they were named
};

// The URL of a file: its folder's real path, and its name. Empty when there is no such folder.
std::string FileURL(const std::string& path);
// Opens a regular file of at most so many bytes for reading; -1 and a reason otherwise.
int OpenRegular(const std::string& path, unsigned long long mostBytes, const char** refusal);
