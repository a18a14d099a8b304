#include "core/player/values.h"

#include <cstring>

#include "core/player/limits.h"
#include "core/player/numbers.h"
#include "core/stream/str.h"

double ValueStack::PopNum()
{
    if (count == 0)
        return 0;
    ScriptValue& top = values[--count];
    const double number = top.Number();
    top.Clear();
    return number;
}
