// The MPEG decoder of a build without one.
#include "core/sound/mp3dec.h"

bool mp3decPresent()
{
    return false;
}

SMp3Decoder* mp3decOpen()
{
    return nullptr;
}

bool mp3decReset(SMp3Decoder*, S32, S32)
{
    return false;
}

U32 mp3decDecode(SMp3Decoder*, void*, S32, S32* got)
{
    *got = 0;
    return kMp3Failed;
}

S32 mp3decGetInputFree(const SMp3Decoder*)
{
    return 0;
}

S32 mp3decFill(SMp3Decoder*, const U8*, S32)
{
    return 0;
}

void mp3decSetInputEof(SMp3Decoder*) {}

void mp3decClose(SMp3Decoder*) {}
