// The MPEG decoder over libmpg123, fed by hand a frame at a time.
#include "core/sound/mp3dec.h"

#include <mpg123.h>
#include <new>

#include "core/sound/mp3_frames.h"

struct SMp3Decoder {
    mpg123_handle* handle = nullptr;
    S32 warmChannels = 0;  // what the library's memory fits: channels of the output,
    bool warmFull = false; // and frames of 1152 rather than 576 samples
    bool ended = false;
    CMp3Frames frames;
};

bool mp3decPresent()
{
    return true;
}

// What is the movie's business is switched off: gaps at the ends, levels, other rates. Every frame
// gives its samples, also one that holds a description of the file.
static bool Configure(mpg123_handle* handle)
{
    const int flags = MPG123_QUIET | MPG123_IGNORE_INFOFRAME | MPG123_NO_READAHEAD;
    return mpg123_param(handle, MPG123_FLAGS, flags, 0) == MPG123_OK &&
           mpg123_param(handle, MPG123_RVA, MPG123_RVA_OFF, 0) == MPG123_OK &&
           mpg123_param(handle, MPG123_INDEX_SIZE, 0, 0) == MPG123_OK;
}

SMp3Decoder* mp3decOpen()
{
    SMp3Decoder* decoder = new (std::nothrow) SMp3Decoder;
    if (!decoder)
        return nullptr;
    // By name: the one in plain C, whose samples do not depend on the processor.
    decoder->handle = mpg123_new("generic", nullptr);
    if (decoder->handle && Configure(decoder->handle))
        return decoder;
    mp3decClose(decoder);
    return nullptr;
}

static bool Begin(SMp3Decoder* decoder, S32 channels, bool full)
{
    mpg123_handle* handle = decoder->handle;
    mpg123_close(handle);
    decoder->frames.Reset(full);
    decoder->ended = false;
    const int form = channels == 2 ? MPG123_STEREO : MPG123_MONO;
    return mpg123_format_none(handle) == MPG123_OK &&
           mpg123_format2(handle, 0, form, MPG123_ENC_SIGNED_16) == MPG123_OK &&
           mpg123_open_feed(handle) == MPG123_OK;
}

// Decodes a frame of silence, made here: the library allocates for the size of the first frames
// that it meets, which must not happen later, while playing.
static bool WarmUp(SMp3Decoder* decoder, S32 channels, bool full)
{
    // 32 kbit/s at 44100 Hz and 22050 Hz, both of 104 bytes.
    const U8 silence[104] = {0xFF, U8(full ? 0xFB : 0xF3), U8(full ? 0x10 : 0x40)};
    S16 out[4096];
    S32 got = 0;
    mp3decFill(decoder, silence, sizeof silence);
    if (mp3decDecode(decoder, out, sizeof out, &got) == kMp3NewFormat)
        mp3decDecode(decoder, out, sizeof out, &got);
    decoder->warmChannels = channels;
    decoder->warmFull = full;
    return got > 0;
}

bool mp3decReset(SMp3Decoder* decoder, S32 channels, S32 rate)
{
    const bool full = rate > 24000;
    if (!Begin(decoder, channels, full))
        return false;
    if (decoder->warmChannels == channels && decoder->warmFull == full)
        return true;
    return WarmUp(decoder, channels, full) && Begin(decoder, channels, full);
}

// Hands the library the next frame. What it says is the same as if it had asked for that frame.
static int FeedFrame(SMp3Decoder* decoder)
{
    S32 size = 0;
    const U8* frame = decoder->frames.Next(&size);
    if (!frame)
        return decoder->frames.Spent() ? MPG123_ERR : MPG123_NEED_MORE;
    return mpg123_feed(decoder->handle, frame, static_cast<size_t>(size));
}

static U32 StatusOf(int result, bool ended)
{
    switch (result) {
    case MPG123_OK:
        return kMp3Ok;
    case MPG123_NEW_FORMAT:
        return kMp3NewFormat;
    case MPG123_NEED_MORE:
        return ended ? kMp3Ended : kMp3NeedInput;
    default:
        return kMp3Failed;
    }
}

U32 mp3decDecode(SMp3Decoder* decoder, void* out, S32 size, S32* got)
{
    const size_t room = static_cast<size_t>(size);
    size_t bytes = 0;
    int result = mpg123_read(decoder->handle, out, room, &bytes);
    if (bytes == 0 && result == MPG123_NEED_MORE) {
        result = FeedFrame(decoder);
        if (result == MPG123_OK)
            result = mpg123_read(decoder->handle, out, room, &bytes);
    }
    *got = static_cast<S32>(bytes);
    return bytes > 0 ? U32(kMp3Ok) : StatusOf(result, decoder->ended);
}

S32 mp3decGetInputFree(const SMp3Decoder* decoder)
{
    return decoder->frames.Room();
}

S32 mp3decFill(SMp3Decoder* decoder, const U8* data, S32 size)
{
    decoder->ended = false;
    return decoder->frames.Add(data, size);
}

void mp3decSetInputEof(SMp3Decoder* decoder)
{
    decoder->ended = true;
}

void mp3decClose(SMp3Decoder* decoder)
{
    if (!decoder)
        return;
    mpg123_delete(decoder->handle);
    delete decoder;
}
