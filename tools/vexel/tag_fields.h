// The decoded fields of a tag, as a listing shows them.
#pragma once

#include "tools/vexel/tag_reader.h"

// " name=value" for each field of the reader's current tag; empty for a tag that has none or is
// not known. The reader's place in the body is lost.
std::string TagFields(TagReader* tag);
