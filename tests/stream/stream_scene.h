#pragma once

#include "core/display/display_list.h"
#include "core/stream/script_player.h"
#include "tests/support/movie_writer.h"

#include <string>

inline bool Same(const SRECT& a, const SRECT& b)
{
    return RectEqual(&a, &b, 0);
}
inline bool Same(const MATRIX& a, const MATRIX& b)
{
    return MatrixEqual(&a, &b, 0);
}

inline void Push(ScriptPlayer& movie, const std::vector<U8>& bytes)
{
    movie.PushDataBuf(bytes.data(), static_cast<S32>(bytes.size()));
}

// A display list with one movie on it, as level 0 of a player would be.
struct StreamScene {
    DisplayList list;
    ScriptPlayer movie;

    StreamScene()
    {
        movie.display = &list;
        list.AddThread(&movie);
        list.ResetBudget();
    }
    explicit StreamScene(const MovieWriter& writer) : StreamScene() { Push(movie, writer.Bytes()); }

    // One tick for every timeline.
    void Tick()
    {
        list.threadCursor = list.threads;
        while (ScriptThread* thread = list.threadCursor) {
            list.threadCursor = thread->nextThread;
            thread->DoFrame(1, false);
        }
    }

    SObject* At(U16 depth)
    {
        return movie.rootObject ? list.FindChild(movie.rootObject, depth) : nullptr;
    }

    // What stands under the object, from the lowest depth up: "depth:id@x" each, the children of
    // sprites in brackets.
    std::string Tree(const SObject* parent) const
    {
        std::string text;
        for (const SObject* o = parent ? parent->bottomChild : nullptr; o; o = o->above) {
            text += (text.empty() ? "" : " ") + std::to_string(o->depth) + ":" +
                    std::to_string(o->character->tag);
            if (o->xform.mat.tx != 0)
                text += "@" + std::to_string(o->xform.mat.tx);
            if (o->bottomChild)
                text += "(" + Tree(o) + ")";
        }
        return text;
    }
    std::string Tree() const { return Tree(movie.rootObject); }
};
