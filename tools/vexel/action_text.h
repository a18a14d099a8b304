// Action records in the form that listings and traces show.
#pragma once

#include "core/player/opcodes.h"

#include <string>

// The record's name and operands, where a jump leads as an offset from `base`, which is the start
// of the block of memory that it lies in; without a base, the distance. Of strings up to `most`
// bytes.
std::string ActionText(const SActionRecord& record, const U8* base, size_t most = 65535);
// Where a jump leads, as an offset from `base`; -1 for what is none or leads before it.
S64 JumpTarget(const SActionRecord& record, const U8* base);
// As Quote, with dots behind what is cut off.
std::string QuoteUpTo(const char* bytes, size_t size, size_t most);
