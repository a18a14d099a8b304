// The parts of a URL, for those who resolve and compare them.
#pragma once

#include <string_view>

// scheme ":" "//" authority path "?" query "#" fragment, each without its punctuation, into the
// text that was split. A plain path is a URL without a scheme.
struct URLParts {
    std::string_view scheme; // empty: none. One letter is none either: it may be that of a drive
    std::string_view authority;
    std::string_view path;
    std::string_view query;
    std::string_view fragment;
    bool hasAuthority = false;
    bool hasQuery = false;
    bool hasFragment = false;
};

// Null is the empty URL. Nothing is decoded.
URLParts SplitURL(const char* url);
// Both URLs lead to the same machine in the same way: scheme, host and port are equal, where a
// scheme's usual port may be left out, and names of users do not count.
bool MachineEqual(const char* a, const char* b);
