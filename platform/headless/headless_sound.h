// Sound of the headless shell: a device without hardware, pulled by the hand-cranked clock.
#pragma once

#include <mutex>

#include "core/geom/grow_buffer.h"
#include "core/sound/sound_mix.h"

// Time is cut into buffers of 2048 frames, 46.44 ms, from the moment of construction or Listen on.
// A buffer is mixed when the clock passes its end, so a sound starts with the buffer in which it
// was added, and what a stream has played is known to the millisecond. While no device is open, or
// no sound, the buffers are silence: what comes out lasts as long as the clock has run, and the
// same calls bring the same samples. Output is 44100 Hz, 16-bit, stereo.
class NativeSoundMix : public CSoundMix {
public:
    // Gets each buffer as it is mixed: `frames` frames of two samples.
    using Writer = void (*)(void* context, const S16* samples, S32 frames);

    NativeSoundMix();
    ~NativeSoundMix() override;

    // From the clock's present moment on buffers go to the writer; null: nowhere.
    void Listen(Writer writer, void* context);
    // The same into memory, emptied first.
    void Record();
    const GrowBuffer<S16>& Recording() const { return recording; }
    // Mixes every buffer whose end the clock has passed; to be called when it has moved, before the
    // player's tick. After a jump backwards, or by more than an hour, the time starts anew.
    void Pump();

    void NativeConstruct() override {}
    void NativeDestruct() override {}
    void EnterCritical() override { lock.lock(); }
    void LeaveCritical() override { lock.unlock(); }
    void BuildAndWrite(CSoundHeader* header, bool silent) override;
    void GetNativeSoundCap(U8* format) override;
    bool OpenNativeDevice(CSound* format) override;
    void BuffersReady() override {}
    void CloseNativeDevice() override { open = false; }
    bool IsDeviceOpen() override { return open; }
    void BuffersUpdated() override {}
    // The clock, or while a buffer is mixed the time of its end.
    S32 Clock() override;

    bool refuseDevice = false; // as if the machine had none

private:
    void Anchor();
    S64 EndOf(S64 buffer) const;
    void Play(S64 buffer);

    std::mutex lock;
    bool open = false;
    Writer write = nullptr;
    void* writeContext = nullptr;
    GrowBuffer<S16> recording;
    S64 origin = 0;    // microseconds, the beginning of buffer 0
    S64 played = 0;    // buffers mixed since then
    S64 pumpTime = -1; // microseconds, the end of the buffer being mixed; -1: none
};
