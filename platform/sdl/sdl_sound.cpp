#include "platform/sdl/sdl_sound.h"

#include <SDL.h>

#include <algorithm>
#include <cstring>

NativeSoundMix::NativeSoundMix(S32 (*milliseconds)()) : clock(milliseconds)
{
    Construct();
}

NativeSoundMix::~NativeSoundMix()
{
    Destruct();
}

void NativeSoundMix::BuildAndWrite(CSoundHeader* header, bool silent)
{
    if (silent)
        SilenceBuffer(header->index);
    else
        BuildBuffer(header->index);
}

void NativeSoundMix::GetNativeSoundCap(U8* format)
{
    *format = 15;
}

// Said once, not at every further try.
bool NativeSoundMix::Refused() const
{
    if (!DeviceRefused())
        SDL_LogWarn(SDL_LOG_CATEGORY_AUDIO, "no sound: %s", SDL_GetError());
    return false;
}

bool NativeSoundMix::OpenNativeDevice(CSound* format)
{
    if (SDL_InitSubSystem(SDL_INIT_AUDIO) != 0)
        return Refused();
    SDL_AudioSpec wanted = {};
    wanted.freq = SoundRate(format->format);
    wanted.format = AUDIO_S16SYS;
    wanted.channels = static_cast<U8>(SoundChannels(format->format));
    wanted.samples = kSoundBufferFrames;
    wanted.callback = Callback;
    wanted.userdata = this;
    rest = nullptr;
    restLength = 0;
    device = SDL_OpenAudioDevice(nullptr, 0, &wanted, nullptr, 0);
    if (device != 0)
        return true;
    Refused();
    SDL_QuitSubSystem(SDL_INIT_AUDIO);
    return false;
}

void NativeSoundMix::BuffersReady()
{
    SDL_PauseAudioDevice(device, 0);
}

// Waits for a callback that runs, and that one for the lock: the lock must be free.
void NativeSoundMix::CloseNativeDevice()
{
    SDL_CloseAudioDevice(device);
    SDL_QuitSubSystem(SDL_INIT_AUDIO);
    device = 0;
}

void NativeSoundMix::Callback(void* mixer, U8* out, int length)
{
    static_cast<NativeSoundMix*>(mixer)->Write(out, length);
}

// SDL asks for a buffer at a time; a driver that asks for less gets the rest later.
void NativeSoundMix::Write(U8* out, S32 length)
{
    while (length > 0) {
        if (restLength == 0) {
            rest = reinterpret_cast<const U8*>(PlayBuffer(0));
            restLength = BytesPerBuffer();
        }
        const S32 n = std::min(length, restLength);
        std::memcpy(out, rest, static_cast<size_t>(n));
        out += n;
        rest += n;
        length -= n;
        restLength -= n;
    }
}
