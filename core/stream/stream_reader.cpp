#include "core/stream/stream_reader.h"

#include <algorithm>

#include "core/player/player.h"
#include "core/sound/sound_mix.h"
#include "core/stream/movie_data.h"
#include "core/stream/tags.h"

namespace {
constexpr S32 kMostBudget = 1 << 16;
constexpr S32 kBudgetPerSample = 4;

constexpr S32 kLeadSeconds = 5;
constexpr S32 kNoDelay = 100; // ms a frame for a movie that does not say

bool IsMpeg(const CSound& sound)
{
    return (sound.format & kSoundCompression) == kSoundMpeg;
}
} // namespace

StreamReader::StreamReader(CSoundMix* mix, const ScriptThread& timeline)
    : mixer(mix), data(timeline.player->sharedScript),
      spriteLen(timeline.IsRoot() ? -1 : timeline.len), leadIn(timeline.streamSound.start),
      ahead(timeline), tags(timeline, timeline.tagStart), frame(timeline.curFrame),
      budget(kMostBudget), toDrop(leadIn)
{
    data->AddRef();
}

StreamReader::~StreamReader()
{
    data->Release();
}

void StreamReader::Release()
{
    if (references.fetch_sub(1, std::memory_order_acq_rel) == 1)
        delete this;
}

U32 StreamReader::Tend(const ScriptThread& timeline)
{
    const SPlayer* player = timeline.splayer;
    const S64 seconds = player ? std::max(player->soundBufferTime, 0) : kLeadSeconds;
    const S32 delay = timeline.player->frameDelay;
    const S64 frames = seconds * 1000 / (delay > 0 ? delay : kNoDelay);
    lead.store(static_cast<S32>(std::min<S64>(frames, kS32Max)), std::memory_order_relaxed);
    const bool on = !player || player->soundOn;
    soundOn.store(on, std::memory_order_relaxed);
    return on ? ahead.Prepare(timeline) : 0;
}

bool StreamReader::ScriptStreamProc(CSoundChannel* channel, void* context)
{
    return static_cast<StreamReader*>(context)->DoSoundFrame(channel);
}

// All tags up to the frame's end, or the data's. What a frame brings is heard before anything else
// is told: that the data has ended comes with the next call.
bool StreamReader::DoSoundFrame(CSoundChannel* channel)
{
    if (waiting && !MayResume())
        return true;
    brought = false;
    Step step = kGoOn;
    while (step == kGoOn)
        step = NextTag(channel);
    waiting = step == kNoData && !brought;
    channel->SetWaiting(!brought && (step == kNoData || step == kNoBudget));
    EarnBudget(*channel);
    return brought || step != kStreamEnd;
}

bool StreamReader::MayResume() const
{
    return NothingMore() || data->HasFrame(S64(frame) + lead.load(std::memory_order_relaxed));
}

bool StreamReader::NothingMore() const
{
    return spriteLen >= 0 || data->NothingMore();
}

// Goes by the sound that was brought, so that streams of tiny blocks cost no more than others.
void StreamReader::EarnBudget(const CSoundChannel& channel)
{
    S64 samples = channel.sound.numSamples;
    if (brought)
        samples = channel.blockLeft > 0 ? channel.blockLeft : std::abs(channel.silenceCount);
    budget = static_cast<S32>(std::min<S64>(budget + samples * kBudgetPerSample, kMostBudget));
}

StreamReader::Step StreamReader::NextTag(CSoundChannel* channel)
{
    if (budget <= 0)
        return kNoBudget;
    const bool nothingMore = NothingMore();
    tags.limit = spriteLen >= 0 ? spriteLen : data->Arrived();
    if (tags.GetTag(tags.limit) < 0)
        return nothingMore ? kStreamEnd : kNoData;
    budget--;
    const S32 tag = tags.tagStart;
    const S32 end = tags.tagEnd;
    const Step step = ReadTag(channel);
    const bool again = step == kStreamEnd || (step == kFrameDone && tags.tagCode != kTagShowFrame);
    tags.pos = again ? tag : end;
    return step;
}

// Stream heads are the timeline's; a channel keeps the format that it began with.
StreamReader::Step StreamReader::ReadTag(CSoundChannel* channel)
{
    switch (tags.tagCode) {
    case kTagEnd:
        return kStreamEnd;
    case kTagShowFrame:
        return ShowFrame();
    case kTagStartSound:
        if (soundOn.load(std::memory_order_relaxed))
            ahead.StartAt(tags.tagStart, mixer);
        return kGoOn;
    case kTagSoundStreamBlock:
        return brought ? kFrameDone : ReadBlock(channel);
    default:
        return kGoOn;
    }
}

// A frame without a block is a frame of silence. One whose block came with an earlier call, when
// the rest of it was not there yet, is not.
StreamReader::Step StreamReader::ShowFrame()
{
    if (frame < kS32Max)
        frame++;
    const bool goOn = !brought && frameHadBlock;
    frameHadBlock = false;
    return goOn ? kGoOn : kFrameDone;
}

StreamReader::Step StreamReader::ReadBlock(CSoundChannel* channel)
{
    const bool mpeg = IsMpeg(channel->sound);
    const S32 count = mpeg ? tags.GetWord() : channel->sound.numSamples;
    const S16 seek = mpeg ? static_cast<S16>(tags.GetWord()) : S16(0);
    frameHadBlock = true;
    if (count == 0 && seek == 0)
        return kGoOn; // its sound came with the block before: not even silence
    channel->blockLeft = count;
    channel->silenceCount = seek;
    channel->block = channel->sound;
    channel->block.start = 0;
    channel->block.data = tags.script + tags.pos;
    channel->block.dataLen = std::max(tags.tagEnd - tags.pos, 0);
    channel->decomp->Setup(&channel->block, false);
    if (mpeg)
        AdjustMp3Streaming(channel);
    brought = channel->blockLeft > 0 || channel->silenceCount != 0;
    return kGoOn;
}

// A decoder that starts in the midst of a stream, or behind a gap, gives some samples that are not
// yet the sound's. Blocks count them, so what is dropped is not waited for; a block that holds
// nothing else is passed by.
void StreamReader::AdjustMp3Streaming(CSoundChannel* channel)
{
    const S32 most = std::min({toDrop, channel->blockLeft, budget});
    const S32 dropped = most > 0 ? channel->decomp->Decompress(nullptr, most) : 0;
    toDrop -= dropped;
    budget -= dropped;
    channel->blockLeft -= dropped;
    if (channel->silenceCount < 0)
        toDrop = leadIn;
}
