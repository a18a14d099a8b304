#include "core/sound/sound_mix.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "core/player/limits.h"

namespace {

// What restarting loops may cost in one buffer, in samples of the cheapest decoder: some 10 ms.
constexpr S32 kDecodeBudget = 1 << 20;
// A device that was refused is not asked for again for so many ms: asking can take long.
constexpr S32 kRefusalHolds = 2000;
constexpr S32 kClockMask = 0x7FFFFFF;

class CSoundLock {
public:
    explicit CSoundLock(CSoundMix* mix) : mixer(mix) { mixer->EnterCritical(); }
    ~CSoundLock() { mixer->LeaveCritical(); }
    CSoundLock(const CSoundLock&) = delete;
    CSoundLock& operator=(const CSoundLock&) = delete;

private:
    CSoundMix* mixer;
};

std::unique_ptr<S16[]> NewBlock(S32 bytes)
{
    return std::unique_ptr<S16[]>(new (std::nothrow) S16[size_t(bytes + 1) / 2]());
}

U8 Clip(S32 sum, U8)
{
    if (sum & 0xFFFF00)
        return sum < 0 ? 0 : 255;
    return U8(sum);
}

S16 Clip(S32 sum, S16)
{
    return S16(std::clamp(sum, -32768, 32767));
}

// The sum is clipped once, at the end. A piece at a time, so that the sums stay close by.
template <typename T>
void Mix(T* out, const std::unique_ptr<S16[]>* blocks, S32 numBlocks, S32 samples, S32 silence)
{
    constexpr S32 kPiece = 256;
    S32 sums[kPiece];
    for (S32 at = 0; at < samples; at += kPiece) {
        const S32 n = std::min(kPiece, samples - at);
        std::fill(sums, sums + n, -(numBlocks - 1) * silence);
        for (S32 b = 0; b < numBlocks; b++) {
            const T* block = reinterpret_cast<const T*>(blocks[b].get()) + at;
            for (S32 i = 0; i < n; i++)
                sums[i] += block[i];
        }
        for (S32 i = 0; i < n; i++)
            out[at + i] = Clip(sums[i], T());
    }
}

} // namespace

void CSoundMix::Construct()
{
    NativeConstruct();
}

void CSoundMix::Destruct()
{
    RemoveAll();
    CloseDevice();
    FreeBuffers();
    NativeDestruct();
}

bool CSoundMix::OpenDevice()
{
    if (IsDeviceOpen())
        return true;
    if (RefusedLately())
        return false;
    deviceRefused = !OpenNewDevice();
    refusedAt = Clock();
    return !deviceRefused;
}

bool CSoundMix::RefusedLately()
{
    return deviceRefused && ((Clock() - refusedAt) & kClockMask) < kRefusalHolds;
}

bool CSoundMix::OpenNewDevice()
{
    CSound device;
    GetNativeSoundCap(&device.format);
    if (!OpenNativeDevice(&device))
        return false;
    outputFormat = device.format & 0x0F;
    idleCount.store(0, std::memory_order_relaxed);
    if (!AllocBuffers()) {
        CloseNativeDevice();
        return false;
    }
    PreFill();
    BuffersReady();
    return true;
}

// A device that has never played is given a longer run-up of silence.
void CSoundMix::PreFill()
{
    const S32 silentOnes = firstOpen ? 4 : 2;
    firstOpen = false;
    CSoundLock lock(this);
    for (S32 i = 0; i < numBuffers; i++)
        BuildAndWrite(&headers[i], i < silentOnes);
}

void CSoundMix::CloseDevice()
{
    if (IsDeviceOpen())
        CloseNativeDevice();
}

bool CSoundMix::AllocBuffers()
{
    const S32 samples = kSoundBufferFrames >> SoundRateShift(outputFormat);
    const S32 bytes = samples * SoundFrameBytes(outputFormat);
    if (buffers[0] && samples == samplesPerBuffer && bytes == bytesPerBuffer)
        return true;
    FreeBuffers();
    samplesPerBuffer = samples;
    bytesPerBuffer = bytes;
    bool ok = true;
    for (std::unique_ptr<S16[]>& block : scratch)
        ok = (block = NewBlock(kScratchSize)) && ok;
    for (S32 i = 0; i < numBuffers; i++)
        ok = (buffers[i] = NewBlock(bytesPerBuffer)) && ok;
    if (!ok)
        FreeBuffers();
    for (S32 i = 0; i < kMostSoundBuffers; i++)
        headers[i] = {buffers[i].get(), i};
    BuffersUpdated();
    return ok;
}

void CSoundMix::FreeBuffers()
{
    for (std::unique_ptr<S16[]>& block : scratch)
        block.reset();
    for (S32 i = 0; i < kMostSoundBuffers; i++) {
        buffers[i].reset();
        headers[i] = {nullptr, i};
    }
}

bool CSoundMix::EnlargeBuffers()
{
    if (numBuffers == kMostSoundBuffers || !buffers[0])
        return false;
    std::unique_ptr<S16[]> buffer = NewBlock(bytesPerBuffer);
    if (!buffer)
        return false;
    CSoundLock lock(this);
    buffers[numBuffers] = std::move(buffer);
    headers[numBuffers].data = buffers[numBuffers].get();
    SilenceBuffer(numBuffers);
    numBuffers++;
    BuffersUpdated();
    return true;
}

// Null when as many as are heard have been taken for this buffer.
S16* CSoundMix::GetScratch()
{
    return scratchTaken < kNumScratch ? scratch[scratchTaken++].get() : nullptr;
}

bool CSoundMix::AddSound(CSoundChannel* channel)
{
    if (channel->mixer)
        return false;
    if (channel->syncFlags & kSyncStop && !channel->refill) {
        FreeSound(&channel->sound);
        return false;
    }
    // What is cheap comes first: a movie may ask for thousands of sounds that will not play.
    const bool audible = channel->prepared || channel->Start();
    if (!audible || !MayStart(*channel) || !channel->Prepare() || !OpenDevice())
        return false;
    PurgeList();
    CSoundLock lock(this);
    return Append(channel);
}

bool CSoundMix::HasRoom()
{
    if (!IsDeviceOpen() && RefusedLately())
        return false;
    CSoundLock lock(this);
    return NumLive() < gLimits.soundChannels;
}

bool CSoundMix::MayStart(const CSoundChannel& channel)
{
    const bool single = channel.syncFlags & kSyncNoMultiple && !channel.refill;
    return HasRoom() && !(single && SoundPlaying(&channel.sound));
}

U32 CSoundMix::NumLive() const
{
    U32 live = 0;
    for (const CSoundChannel* c = channels; c; c = c->next)
        live += !c->Removed();
    return live;
}

bool CSoundMix::AddSoundLocked(CSoundChannel* channel)
{
    if (channel->mixer)
        return false;
    if (channel->syncFlags & kSyncStop && !channel->refill) {
        MarkPlaying(&channel->sound);
        return false;
    }
    return channel->prepared && Append(channel);
}

// At the end, so that a list being built from goes on to it.
bool CSoundMix::Append(CSoundChannel* channel)
{
    if (channel->syncFlags & kSyncNoMultiple && !channel->refill && Plays(&channel->sound))
        return false;
    if (NumLive() >= gLimits.soundChannels)
        return false;
    CSoundChannel** link = &channels;
    while (*link)
        link = &(*link)->next;
    if (channel->refill)
        channel->StartCounting(Clock());
    channel->AddRef();
    channel->mixer = this;
    channel->next = nullptr;
    *link = channel;
    return true;
}

bool CSoundMix::Plays(const CSound* sound) const
{
    for (const CSoundChannel* c = channels; c; c = c->next)
        if (!c->refill && SameSound(c->sound, *sound) && !c->Removed())
            return true;
    return false;
}

void CSoundMix::MarkPlaying(const CSound* sound)
{
    for (CSoundChannel* c = channels; c; c = c->next)
        if (!c->refill && SameSound(c->sound, *sound))
            c->Stop();
}

bool CSoundMix::SoundPlaying(const CSound* sound)
{
    CSoundLock lock(this);
    return Plays(sound);
}

CSoundChannel* CSoundMix::UnlinkMarked()
{
    CSoundChannel* gone = nullptr;
    for (CSoundChannel** link = &channels; *link;) {
        CSoundChannel* channel = *link;
        if (!channel->Removed()) {
            link = &channel->next;
            continue;
        }
        *link = channel->next;
        channel->next = gone;
        gone = channel;
    }
    return gone;
}

void CSoundMix::ReleaseList(CSoundChannel* first)
{
    while (first) {
        CSoundChannel* channel = first;
        first = channel->next;
        channel->Release();
    }
}

// Destroying, which can take a decoder down, waits until the lock is free.
template <typename Match> void CSoundMix::RemoveIf(Match match)
{
    CSoundChannel* gone = nullptr;
    {
        CSoundLock lock(this);
        for (CSoundChannel* c = channels; c; c = c->next)
            if (match(*c))
                c->Stop();
        gone = UnlinkMarked();
    }
    ReleaseList(gone);
}

void CSoundMix::RemoveSound(CSoundChannel* channel)
{
    RemoveIf([=](const CSoundChannel& c) { return &c == channel; });
}

void CSoundMix::RemoveTagged(U64 tag)
{
    RemoveIf([=](const CSoundChannel& c) { return c.tag == tag; });
}

void CSoundMix::RemoveAll()
{
    RemoveIf([](const CSoundChannel&) { return true; });
}

void CSoundMix::FreeSound(const CSound* sound)
{
    RemoveIf([=](const CSoundChannel& c) { return !c.refill && SameSound(c.sound, *sound); });
}

void CSoundMix::PurgeList()
{
    RemoveIf([](const CSoundChannel&) { return false; });
}

// A channel that a refill adds meanwhile stands behind the one that is being rendered, and so comes
// into this very buffer.
void CSoundMix::BuildBuffer(S32 index)
{
    S32 budget = kDecodeBudget;
    bool live = false;
    for (CSoundChannel* c = channels; c; c = c->next) {
        if (c->Removed())
            continue;
        live = true;
        c->Render(GetScratch(), outputFormat, index, &budget);
    }
    idleCount.store(live ? 0 : IdleCount() + 1, std::memory_order_relaxed);
    MixBlocks(buffers[index].get());
    scratchTaken = 0;
}

void CSoundMix::MixBlocks(S16* out) const
{
    const S32 samples = samplesPerBuffer * SoundChannels(outputFormat);
    if (scratchTaken == 1)
        std::memcpy(out, scratch[0].get(), size_t(bytesPerBuffer));
    else if (outputFormat & kSound16Bit)
        Mix(out, scratch, scratchTaken, samples, 0);
    else
        Mix(reinterpret_cast<U8*>(out), scratch, scratchTaken, samples, 128);
}

void CSoundMix::SilenceBuffer(S32 index)
{
    const int value = outputFormat & kSound16Bit ? 0 : 128;
    std::memset(buffers[index].get(), value, size_t(bytesPerBuffer));
}

void CSoundMix::MarkBufferComplete(S32 index)
{
    const S32 now = Clock();
    for (CSoundChannel* c = channels; c; c = c->next)
        c->Complete(index, now);
}

const S16* CSoundMix::PlayBuffer(S32 index)
{
    CSoundLock lock(this);
    if (!headers[index].data)
        return nullptr;
    BuildAndWrite(&headers[index], false);
    MarkBufferComplete(index);
    return headers[index].data;
}
