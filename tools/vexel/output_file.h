// Files that appear whole or not at all.
#pragma once

#include "core/geom/types.h"

#include <span>
#include <string>
#include <vector>

// A name that may hold one %d or %0Nd for the number of a picture; %% stands for a percent sign.
class OutputName {
public:
    // False when the name holds more than one number.
    bool Parse(const std::string& text);

    bool Numbered() const { return numbered; }
    bool ToStdout() const { return !numbered && before == "-"; }
    std::string For(int number) const;
    // The extension in lower case with its dot; empty when there is none.
    std::string Extension() const;

private:
    std::string before;
    std::string after;
    int digits = 0;
    bool numbered = false;
};

// Everything to a descriptor, however many calls it takes. On failure errno says why.
bool WriteAll(int fd, std::span<const U8> bytes);

// The place of an output file. A regular file is made under another name, PATH.PID.part, and takes
// its place when it is all there; a device or pipe is written to as it is.
struct OutputPlace {
    std::string path; // what is to be replaced; links are followed, so that they stay links
    std::string part; // where the bytes go: `path` itself for what is written to as it is
    U32 mode = 0666;  // permissions that the part may have: no more than what it replaces has

    // Without a place; "-" is no path here.
    OutputPlace() = default;
    explicit OutputPlace(const std::string& name);

    bool Beside() const { return part != path; }
    // A descriptor for writing the part, made anew if it is another file than `path`; -1, with
    // errno set, and nothing left on failure.
    int Open() const;
    // Puts the part in its place. On failure it is gone, and errno says why.
    bool Keep() const;
    // Removes the part.
    void Drop() const;
};

// Bytes on their way into a file or, for "-", to standard output. False means failure with `error`
// set. What has not been committed when the object ends is removed.
class OutputFile {
public:
    OutputFile() = default;
    ~OutputFile();
    OutputFile(const OutputFile&) = delete;
    OutputFile& operator=(const OutputFile&) = delete;

    bool Open(const std::string& path);
    // Takes a descriptor instead, which stays open.
    void Borrow(int descriptor);
    bool Write(std::span<const U8> bytes);
    // Lets the other end of a pipe have all that was written.
    bool Flush();
    // Nothing follows; the file takes its place.
    bool Commit();

    std::string error;

private:
    bool Fail();
    bool Close();

    OutputPlace place;
    int fd = -1;
    bool borrowed = false;
    std::vector<U8> waiting; // not yet handed to the system
};

// The whole of a file at once. False with `error` set.
bool WriteWhole(const std::string& path, std::span<const U8> bytes, std::string* error);
