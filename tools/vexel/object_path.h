// Timelines by the names that scripts give them.
#pragma once

#include <string>

struct SObject;

// "/a/b" or "_level2/a" for the timeline that `obj` belongs to; parents without a name are left
// out. "?" for what has none.
std::string TimelinePath(const SObject* obj);
// The path of a level's root: "/" or "_level2".
std::string LevelPath(int level);
// The path of a timeline called `name` inside another.
std::string JoinPath(const std::string& parent, const char* name);
