// Event sounds: from the records of a movie to channels of the mixer. Player's thread.
#pragma once

#include "core/sound/sound_channel.h"

class CSoundMix;
class MovieData;
class SParser;
struct SCharacter;

// Reads the body of a sound definition at the parser's position, behind the id. False for a
// compression that nobody can play.
bool GetSoundBody(SParser* tag, CSound* sound);

// What a definition in the dictionary holds; false, and no sound, for any other character or null.
bool SoundOf(const SCharacter* ch, CSound* sound);

// A channel that will play the sound as the start record at the parser's position says, for whoever
// has that tag; `data` holds the sound's bytes. One reference, the caller's; null when there is no
// memory.
CSoundChannel* NewEventSound(const CSound& sound, MovieData* data, U64 tag, SParser* record);

// Starts the character's sound, or stops it, as the record says. Nothing happens when there is no
// mixer or the character is no sound (null is allowed); the record is passed over then. Returns
// what that was worth, in tags of the tick's budget.
U32 StartEventSound(CSoundMix* mix, const SCharacter* ch, U64 tag, SParser* record);
