// What a shell may watch of the scripts.
#pragma once

#include "core/geom/types.h"

class ScriptThread;
class ValueStack;
struct SActionRecord;

// Called with every record that is about to be executed; may look, not touch.
struct ScriptTracer {
    void (*record)(void* context, ScriptThread* thread, const SActionRecord& action,
                   ValueStack& stack) = nullptr;
    void* context = nullptr;
};
