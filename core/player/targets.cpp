// Targets: timelines by the paths that scripts write, and the paths of objects.
#include "core/player/player.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "core/player/limits.h"
#include "core/stream/str.h"

namespace {

constexpr int kMostName = 127; // characters; a longer name in a path names nothing
// The part of a run's work that one path may cost; a path that costs more names nothing.
constexpr U32 kShareOfRun = 16;
constexpr U32 kCharactersPerUnit = 16; // of paths, in a unit of work

// The names of a path, one after the other. Several slashes are one, and one at the end is none.
class PathNames {
public:
    PathNames(const char* path, const char* pathEnd) : at(path), end(pathEnd) {}

    bool AtSlash() const { return at < end && *at == '/'; }
    // The next name is in `name`; false at the end.
    bool Next()
    {
        while (AtSlash())
            at++;
        if (at == end)
            return false;
        const void* slash = std::memchr(at, '/', static_cast<size_t>(end - at));
        const char* stop = slash ? static_cast<const char*>(slash) : end;
        length = static_cast<int>(stop - at);
        const auto kept = static_cast<size_t>(std::min(length, kMostName));
        std::memcpy(name, at, kept);
        name[kept] = 0;
        at = stop;
        return true;
    }
    bool TooLong() const { return length > kMostName; }

    char name[kMostName + 1] = {};

private:
    const char* at;
    const char* end;
    int length = 0;
};

bool IsLevelRoot(const SObject* obj)
{
    return !obj->parent || !obj->parent->parent;
}

// The root object of the movie that holds `obj`; a movie shown in a sprite's place is one too.
SObject* MovieRoot(SObject* obj)
{
    while (!IsLevelRoot(obj) && !(obj->OwnsThread() && obj->thread->IsRoot()))
        obj = obj->parent;
    return obj;
}

// Only objects with a timeline of their own are found by name; of several the lowest.
SObject* FindNamed(const SObject* parent, const char* name, U64* work)
{
    const U32 hash = StrHash(name);
    SObject* child = parent->bottomChild;
    for (; child; child = child->above) {
        ++*work;
        if (child->nameHash == hash && child->OwnsThread() && StrEqual(child->name, name))
            return child;
    }
    return nullptr;
}

SObject* Step(SObject* from, const char* name, U64* work)
{
    if (std::strcmp(name, "..") == 0)
        return IsLevelRoot(from) ? nullptr : from->parent;
    return FindNamed(from, name, work);
}

bool HasPathName(const SObject* obj)
{
    return obj->OwnsThread() && obj->name && obj->name[0] != 0;
}

// The object itself, or the nearest above it to which names lead all the way.
const SObject* NearestNamed(const SObject* obj)
{
    const SObject* nearest = obj;
    for (; !IsLevelRoot(obj); obj = obj->parent) {
        if (!HasPathName(obj))
            nearest = obj->parent;
    }
    return nearest;
}

const SObject* LevelRoot(const SObject* obj)
{
    while (!IsLevelRoot(obj))
        obj = obj->parent;
    return obj;
}

// Writes "/name/name" so that it ends at `end`.
void WriteNames(const SObject* obj, char* end)
{
    for (; !IsLevelRoot(obj); obj = obj->parent) {
        const int length = StrLength(obj->name);
        end -= length;
        std::memcpy(end, obj->name, static_cast<size_t>(length));
        *--end = '/';
    }
}

// Counts no further than a string can be long.
size_t NamesLength(const SObject* obj)
{
    size_t length = 0;
    for (; length <= gLimits.stringBytes && !IsLevelRoot(obj); obj = obj->parent)
        length += static_cast<size_t>(StrLength(obj->name)) + 1;
    return length;
}

} // namespace

ScriptThread* SPlayer::FindTarget(SObject* from, const char* path)
{
    return path ? FindTarget(from, path, StrLength(path)) : nullptr;
}

// A level that has nothing to show yet is found nevertheless: its variables are there.
ScriptThread* SPlayer::FindTarget(SObject* from, const char* path, int length)
{
    PathNames names(path, path + length);
    SObject* at = from ? from : rootObject;
    if (from && names.AtSlash())
        at = MovieRoot(from);
    ScriptThread* found = at ? at->thread : this;
    const U64 before = scene.work;
    scene.work += static_cast<U64>(length) / kCharactersPerUnit;
    for (bool first = true; names.Next(); first = false) {
        const S32 level = first ? LayerNum(names.name) : -1;
        if (names.TooLong())
            return nullptr;
        if (level >= 0) {
            ScriptPlayer* movie = level == 0 ? this : FindLayer(layers, level);
            at = movie ? movie->rootObject : nullptr;
            found = movie;
            continue;
        }
        const bool affordable = scene.work - before <= gLimits.workPerRun / kShareOfRun;
        at = at && affordable ? Step(at, names.name, &scene.work) : nullptr;
        if (!at)
            return nullptr;
        found = at->thread;
    }
    return found;
}

char* SPlayer::GetTargetPath(SObject* obj)
{
    if (!obj)
        return nullptr;
    const SObject* named = NearestNamed(obj);
    const SObject* level = LevelRoot(named);
    char prefix[24] = "";
    if (named == level)
        std::strcpy(prefix, "/");
    const S32 number = level->thread ? level->thread->layerNum : level->depth;
    if (number != 0)
        std::snprintf(prefix, sizeof prefix, "_level%d", static_cast<int>(number));
    const size_t before = std::strlen(prefix);
    const size_t length = before + NamesLength(named);
    scene.work += obj->nesting + length / kCharactersPerUnit;
    GrowBuffer<char> path;
    if (length > gLimits.stringBytes || !path.Resize(length + 1))
        return nullptr;
    std::memcpy(path.data(), prefix, before);
    WriteNames(named, path.data() + length);
    return CreateStr(path.data());
}
