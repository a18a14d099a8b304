// The variables of a timeline: a list in order of creation, with an index once it has grown.
#include <cstdlib>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/stream/script_thread.h"
#include "core/stream/str.h"

namespace {
// A list up to this length is searched from its head; beyond it the index is worth its memory.
constexpr U32 kPlainList = 16;
// What a variable counts for beside its strings, its share of the index included: the same on every
// machine, so that the limit strikes at the same variable.
constexpr size_t kRecordBytes = 104;
constexpr int kCharactersPerUnit = 16; // of names compared, in a unit of work

SVariable* NewRecord()
{
    if (!ReserveStrBytes(kRecordBytes))
        return nullptr;
    auto* var = static_cast<SVariable*>(std::calloc(1, sizeof(SVariable)));
    if (!var)
        ReturnStrBytes(kRecordBytes);
    return var;
}

// Names are seldom that much alike unless they were made to be: looking them up must stay cheap.
bool IsCrowded(const SVariable* var)
{
    U32 n = 0;
    for (; var; var = var->nextInBucket)
        n++;
    return n >= gLimits.variablesAlike;
}

// Many names of one hash are easily made, and they may be long.
bool IsNamed(const SVariable* var, const char* name, U32 hash, U64* work)
{
    ++*work;
    if (var->hash != hash)
        return false;
    const int common = StrCommon(var->name, name);
    *work += static_cast<U64>(common / kCharactersPerUnit);
    return var->name[common] == 0 && name[common] == 0;
}

void FreeRecord(SVariable* var)
{
    FreeStr(var->name);
    FreeStr(var->value);
    std::free(var);
    ReturnStrBytes(kRecordBytes);
}
} // namespace

SVariable* ScriptThread::FindVariable(const char* name)
{
    if (!name)
        return nullptr;
    const U32 hash = StrHash(name);
    U64 work = 0;
    SVariable* var = buckets ? buckets[hash & (bucketCount - 1)] : vars;
    while (var && !IsNamed(var, name, hash, &work))
        var = buckets ? var->nextInBucket : var->next;
    if (display)
        display->work += work;
    return var;
}

void ScriptThread::SetVariable(const char* name, const char* value, int flag)
{
    SVariable* var = FindVariable(name);
    if (!var)
        var = NewVariable(name);
    if (!var)
        return;
    // The value may be the variable's own string: copied before the old one goes.
    char* copy = CreateStr(value);
    FreeStr(var->value);
    var->value = copy;
    if (display)
        display->root.UpdateEditText(this, var->name, copy, flag);
}

// Appended to the list; null when a limit or memory forbids it.
SVariable* ScriptThread::NewVariable(const char* name)
{
    if (!name || variableCount >= gLimits.variables)
        return nullptr;
    const int nameLen = StrLength(name);
    if (name[nameLen] != 0)
        return nullptr; // cut, it would be the name of another variable
    const U32 hash = StrHash(name);
    if (buckets && IsCrowded(buckets[hash & (bucketCount - 1)]))
        return nullptr;
    char* copy = CreateStr(name, nameLen);
    SVariable* var = copy ? NewRecord() : nullptr;
    if (!var) {
        FreeStr(copy);
        return nullptr;
    }
    var->name = copy;
    var->hash = hash;
    (varsTail ? varsTail->next : vars) = var;
    varsTail = var;
    variableCount++;
    IndexVariable(var);
    return var;
}

void ScriptThread::IndexVariable(SVariable* var)
{
    const bool full = buckets ? variableCount > bucketCount : variableCount > kPlainList;
    if (full && GrowIndex())
        return;
    if (buckets)
        AddToBucket(var);
}

void ScriptThread::AddToBucket(SVariable* var)
{
    SVariable** bucket = &buckets[var->hash & (bucketCount - 1)];
    var->nextInBucket = *bucket;
    *bucket = var;
}

// Makes the index four times the size and enters every variable; false, and the old index stays,
// when the heap is exhausted.
bool ScriptThread::GrowIndex()
{
    const U32 count = (bucketCount ? bucketCount : kPlainList) * 4;
    auto** grown = static_cast<SVariable**>(std::calloc(count, sizeof(SVariable*)));
    if (!grown)
        return false;
    std::free(buckets);
    buckets = grown;
    bucketCount = count;
    for (SVariable* var = vars; var; var = var->next)
        AddToBucket(var);
    return true;
}

void ScriptThread::ClearVariables()
{
    while (vars) {
        SVariable* var = vars;
        vars = var->next;
        FreeRecord(var);
    }
    varsTail = nullptr;
    variableCount = 0;
    std::free(buckets);
    buckets = nullptr;
    bucketCount = 0;
}
