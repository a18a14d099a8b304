// Sound through SDL 2, for shells with a real device.
#pragma once

#include <mutex>

#include "core/sound/sound_mix.h"

// SDL's audio thread asks for bytes; it gets buffers as they are mixed, in whatever portions it
// wants them. The device is opened with the first sound and closed by CSoundMix::CloseDevice; SDL
// itself starts and ends with it, unless the shell holds on to it. That there is none is logged.
// Which driver plays is SDL's choice (SDL_AUDIODRIVER).
class NativeSoundMix : public CSoundMix {
public:
    // `milliseconds`: the player's clock, any thread may ask it.
    explicit NativeSoundMix(S32 (*milliseconds)());
    ~NativeSoundMix() override;

    void NativeConstruct() override {}
    void NativeDestruct() override {}
    void EnterCritical() override { lock.lock(); }
    void LeaveCritical() override { lock.unlock(); }
    void BuildAndWrite(CSoundHeader* header, bool silent) override;
    void GetNativeSoundCap(U8* format) override;
    bool OpenNativeDevice(CSound* format) override;
    void BuffersReady() override;
    void CloseNativeDevice() override;
    bool IsDeviceOpen() override { return device != 0; }
    void BuffersUpdated() override {}
    S32 Clock() override { return clock(); }

private:
    bool Refused() const;
    static void Callback(void* mixer, U8* out, int length);
    void Write(U8* out, S32 length);

    std::mutex lock;
    S32 (*clock)();
    U32 device = 0; // SDL's number, 0: closed
    // The audio thread's, while the device is open:
    const U8* rest = nullptr; // of the buffer mixed last, not asked for yet
    S32 restLength = 0;       // bytes
};
