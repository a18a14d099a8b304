// The actions of tags, as a listing shows them.
#pragma once

#include "tools/vexel/tag_reader.h"

// Prints what lies inside the reader's current tag, a line each, behind `indent` blanks: the
// records of a DoAction; of a button its parts and, for each condition, the records. Nothing for
// other tags. The reader's place in the body is lost.
void PrintActions(TagReader* tag, int indent);
