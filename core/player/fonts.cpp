// The built-in fonts: a small movie that the shell supplies.
#include "core/player/player.h"

#include <cstdlib>

bool SPlayer::LoadBuiltInFonts()
{
    if (fontState != kFontsUntried || painting)
        return fontState == kFontsLoaded;
    U8* data = nullptr;
    S32 size = 0;
    GetUnixFontData(&data, &size);
    fontState = data != nullptr && size > 0 ? kFontsLoaded : kFontsUnavailable;
    if (fontState == kFontsLoaded)
        RunFontMovie(data, size);
    std::free(data);
    return fontState == kFontsLoaded;
}

// Its tags define the fonts, once, whatever is left of the tick's budget; nothing of it is seen or
// heard, the background stays, and it stands still from then on.
void SPlayer::RunFontMovie(const U8* data, S32 size)
{
    const U32 tagsLeft = scene.tagsLeft;
    const int priority = scene.backgroundPriority, sound = soundOn;
    scene.backgroundPriority = kS32Max;
    soundOn = 0;
    fontPlayer.splayer = this;
    fontPlayer.display = &scene;
    fontPlayer.layerNum = kFontLayer;
    scene.AddThread(&fontPlayer);
    fontPlayer.PushDataBuf(data, size);
    fontPlayer.SetDataComplete();
    scene.ResetBudget();
    fontPlayer.DrawFrame(kS32Max, false);
    fontPlayer.StopPlay();
    scene.RemoveThisObject(fontPlayer.rootObject);
    scene.tagsLeft = tagsLeft;
    scene.backgroundPriority = priority;
    soundOn = sound;
}
