// The record that says how a sound starts.
#pragma once

class CSoundChannel;
class SParser;

// Reads the record at the parser's position into the channel: sync flags, in and out points, loops,
// envelope. What the record leaves out stays as the channel has it. Null only passes over it.
void GetSoundInfo(SParser* parser, CSoundChannel* channel);
