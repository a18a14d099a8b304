// CSoundMix: the mixer. Every playing channel goes into buffers of 46 ms in one output format,
// which the shell's device plays.
#pragma once

#include "core/sound/sound_channel.h"

// One output buffer.
struct CSoundHeader {
    S16* data = nullptr; // null: not allocated
    S32 index = 0;
};

// A shell subclasses this as NativeSoundMix; its constructor calls Construct, its destructor
// Destruct, while its operations exist. One for all players of a process.
//
// Two threads: the player's calls everything but what says otherwise, and the audio thread calls
// PlayBuffer. All that they share is reached under the lock, which is held only to link, unlink and
// mark, and to build a buffer. The audio thread allocates, frees, unlinks, opens and closes
// nothing: a sound that ends is only marked, and the player's thread purges.
class CSoundMix {
public:
    CSoundMix() = default;
    virtual ~CSoundMix() = default;

    // --- what the shell supplies ---
    // Makes and unmakes the lock. Neither runs while a device is open.
    virtual void NativeConstruct() = 0;
    virtual void NativeDestruct() = 0;
    // The lock, not recursive.
    virtual void EnterCritical() = 0;
    virtual void LeaveCritical() = 0;
    // With the lock held: fills the buffer, by BuildBuffer or, when `silent`, with SilenceBuffer.
    virtual void BuildAndWrite(CSoundHeader* header, bool silent) = 0;
    // The format that the device wants.
    virtual void GetNativeSoundCap(U8* format) = 0;
    // Opens the device for that format, not yet playing. False when it cannot be had. Never with
    // the lock held, like the next and CloseNativeDevice.
    virtual bool OpenNativeDevice(CSound* format) = 0;
    // The buffers are there: starts playing.
    virtual void BuffersReady() = 0;
    // After this no callback runs.
    virtual void CloseNativeDevice() = 0;
    virtual bool IsDeviceOpen() = 0;
    // The buffers have moved.
    virtual void BuffersUpdated() = 0;
    // Milliseconds in 27 bits, from any thread.
    virtual S32 Clock() = 0;

    // --- device and buffers ---
    void Construct();
    // Removes all sounds, closes the device, frees the buffers.
    void Destruct();
    // True when the device is open, now or already. One that was refused is asked for again only
    // after 2 seconds.
    bool OpenDevice();
    // The device could not be had when it was last wanted: there is no sound, and the clock paces.
    // For the shell, to tell its user.
    bool DeviceRefused() const { return deviceRefused; }
    void CloseDevice();
    // Makes the buffers for the output format; while the device is closed.
    bool AllocBuffers();
    void FreeBuffers();
    // One buffer more, up to 32. False when there is none.
    bool EnlargeBuffers();
    // Buffers in a row without a channel. Any thread.
    S32 IdleCount() const { return idleCount.load(std::memory_order_relaxed); }
    U8 OutputFormat() const { return outputFormat; }
    S32 SamplesPerBuffer() const { return samplesPerBuffer; } // frames
    S32 BytesPerBuffer() const { return bytesPerBuffer; }
    CSoundHeader* Header(S32 index) { return &headers[index]; }

    // --- sounds ---
    // Starts the channel, opening the device when it is closed. False when it does not play: it
    // only stopped another, its format is unknown, nothing lies between its points, too many play,
    // or there is no device.
    bool AddSound(CSoundChannel* channel);
    // False: AddSound would refuse any sound now, since too many play or the device was refused.
    bool HasRoom();
    // AddSound with the lock held, for a refill: the channel is prepared, the device is open.
    bool AddSoundLocked(CSoundChannel* channel);
    // These three stop sounds; when they return, no callback uses those any more.
    void RemoveSound(CSoundChannel* channel);
    void RemoveTagged(U64 tag);
    void RemoveAll();
    // The same for every channel that plays this sound; see SameSound.
    void FreeSound(const CSound* sound);
    // Some channel plays this sound and is not marked.
    bool SoundPlaying(const CSound* sound);
    // Unlinks and releases what is marked.
    void PurgeList();

    // --- building; with the lock held ---
    void BuildBuffer(S32 index);
    void SilenceBuffer(S32 index);
    // The buffer has been heard, or as good as.
    void MarkBufferComplete(S32 index);

    // Takes the lock, builds the buffer and counts it: what a callback of a device does. Its data,
    // or null when there are no buffers.
    const S16* PlayBuffer(S32 index);

private:
    static constexpr S32 kNumScratch = 8;
    static constexpr S32 kScratchSize = 8192; // bytes

    CSoundMix(const CSoundMix&) = delete;
    CSoundMix& operator=(const CSoundMix&) = delete;

    bool OpenNewDevice();
    bool RefusedLately();
    bool MayStart(const CSoundChannel& channel);
    U32 NumLive() const;
    S16* GetScratch();
    void PreFill();
    bool Append(CSoundChannel* channel);
    bool Plays(const CSound* sound) const;
    void MarkPlaying(const CSound* sound);
    CSoundChannel* UnlinkMarked();
    static void ReleaseList(CSoundChannel* first);
    template <typename Match> void RemoveIf(Match match);
    void MixBlocks(S16* out) const;

    U8 outputFormat = 15;
    CSoundChannel* channels = nullptr; // oldest first
    std::atomic<S32> idleCount{0};
    S32 numBuffers = 2;
    bool firstOpen = true;
    bool deviceRefused = false;
    S32 refusedAt = 0;        // when the device was last asked for, ms
    S32 samplesPerBuffer = 0; // frames
    S32 bytesPerBuffer = 0;
    std::unique_ptr<S16[]> buffers[kMostSoundBuffers];
    CSoundHeader headers[kMostSoundBuffers];
    std::unique_ptr<S16[]> scratch[kNumScratch];
    S32 scratchTaken = 0; // of this buffer
};
