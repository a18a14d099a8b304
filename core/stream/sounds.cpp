// The sound tags of a timeline: event sounds that it starts, and its streaming sound.
#include "core/stream/sounds.h"

#include <algorithm>
#include <new>

#include "core/display/display_list.h"
#include "core/player/player.h"
#include "core/sound/sound_info.h"
#include "core/sound/sound_mix.h"
#include "core/stream/movie_data.h"
#include "core/stream/stream_reader.h"

namespace {
// Frames heard that a channel can count; a stream that would start beyond is not played.
constexpr S64 kMostSamples = S64(1) << 36;
} // namespace

bool GetSoundBody(SParser* tag, CSound* sound)
{
    sound->format = tag->GetByte();
    sound->numSamples = static_cast<S32>(std::min(tag->GetDWord(), static_cast<U32>(kS32Max)));
    const U8 compression = sound->format & kSoundCompression;
    if (compression > kSoundPlainLittle)
        return false;
    if (compression == kSoundMpeg)
        sound->start = static_cast<S16>(tag->GetWord());
    sound->data = tag->script + tag->pos;
    sound->dataLen = std::max(tag->tagEnd - tag->pos, 0);
    return true;
}

bool SoundOf(const SCharacter* ch, CSound* sound)
{
    if (!ch || ch->type != kCharSound)
        return false;
    sound->format = ch->sound.format;
    sound->numSamples =
        static_cast<S32>(std::min(ch->sound.sampleCount, static_cast<U32>(kS32Max)));
    sound->data = ch->data;
    sound->dataLen = ch->sound.dataLen;
    sound->start = ch->sound.start;
    sound->movie = ch->player->soundTag;
    return true;
}

CSoundChannel* NewEventSound(const CSound& sound, MovieData* data, U64 tag, SParser* record)
{
    CSoundChannel* channel = new (std::nothrow) CSoundChannel;
    GetSoundInfo(record, channel);
    if (!channel)
        return nullptr;
    channel->sound = sound;
    channel->tag = tag;
    channel->SetHolder(data);
    return channel;
}

U32 StartEventSound(CSoundMix* mix, const SCharacter* ch, U64 tag, SParser* record)
{
    CSound sound;
    if (!mix || !SoundOf(ch, &sound)) {
        GetSoundInfo(record, nullptr);
        return 0;
    }
    CSoundChannel* channel = NewEventSound(sound, ch->player->sharedScript, tag, record);
    if (!channel)
        return 0;
    mix->AddSound(channel);
    const U32 cost = channel->StartCost();
    channel->Release();
    return cost;
}

CSoundMix* ScriptThread::Mixer() const
{
    return display ? display->soundMix : nullptr;
}

CSoundMix* ScriptThread::PlayingMixer() const
{
    return splayer && !splayer->soundOn ? nullptr : Mixer();
}

// While a stream plays its reader starts the event sounds of the timeline; one that was stopped
// from elsewhere starts nothing.
void ScriptThread::StartSound()
{
    if (seeking || !player || (streamChannel && !streamChannel->Removed()))
        return;
    const SCharacter* ch = player->FindCharacter(GetWord());
    ChargeTags(StartEventSound(PlayingMixer(), ch, soundTag, this));
}

void ScriptThread::SoundStreamHead()
{
    streamFormat = GetByte();
    streamSound.Init();
    streamSound.format = GetByte();
    streamSound.numSamples = GetWord();
    if ((streamSound.format & kSoundCompression) == kSoundMpeg)
        streamSound.start = GetWord();
}

// The first block starts the stream. When it cannot play it is not tried again until the timeline
// stops, seeks or loops: opening a device that is not there takes time.
void ScriptThread::SoundStreamBlock()
{
    CSoundMix* mix = PlayingMixer();
    const bool known = (streamSound.format & kSoundCompression) <= kSoundPlainLittle;
    if (seeking || streamChannel || !streamStart || !mix || !known || streamSound.numSamples == 0)
        return;
    streamStart = player && StartStream(mix);
}

bool ScriptThread::StartStream(CSoundMix* mix)
{
    const S64 heard = S64(std::max(curFrame, 0)) * streamSound.numSamples;
    const bool playable = heard < kMostSamples && mix->HasRoom();
    StreamReader* reader = playable ? NewReader(mix) : nullptr;
    CSoundChannel* channel = reader ? new (std::nothrow) CSoundChannel : nullptr;
    if (channel) {
        channel->tag = soundTag;
        channel->sound = streamSound;
        channel->doNotCount = !IsRoot();
        channel->refill = StreamReader::ScriptStreamProc;
        channel->refillContext = reader;
        channel->fadeIn = soundResync && heard > 0;
        channel->SetSamplesPlayed(heard);
        channel->SetHolder(reader);
        soundResync = false;
    }
    const bool plays = channel && mix->AddSound(channel);
    ChargeTags(channel ? channel->StartCost() : 0);
    if (plays) {
        streamChannel = channel;
        streamReader = reader;
    } else if (channel) {
        channel->Release();
    }
    if (reader)
        reader->Release();
    return plays;
}

StreamReader* ScriptThread::NewReader(CSoundMix* mix)
{
    StreamReader* reader =
        player->sharedScript ? new (std::nothrow) StreamReader(mix, *this) : nullptr;
    if (reader)
        ChargeTags(reader->Tend(*this));
    return reader;
}

void ScriptThread::TendStream()
{
    if (streamChannel && player)
        streamReader->Tend(*this);
}

void ScriptThread::StopStream()
{
    if (!streamChannel)
        return;
    if (CSoundMix* mix = Mixer())
        mix->RemoveSound(streamChannel);
    streamChannel->Release();
    streamChannel = nullptr;
    streamReader = nullptr;
}

// Every later block may start the stream anew; that of a sprite plays only the first time through.
void ScriptThread::StopSound()
{
    StopStream();
    streamStart = IsRoot();
}

void ScriptThread::Silence()
{
    StopSound();
    if (CSoundMix* mix = Mixer())
        mix->RemoveTagged(soundTag);
}

bool ScriptThread::StreamPlays() const
{
    CSoundMix* mix = Mixer();
    return streamChannel && !streamChannel->Removed() && !streamChannel->StreamEnded() &&
           !streamChannel->doNotCount && mix && mix->IsDeviceOpen();
}
