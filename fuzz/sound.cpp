// Sound data of every compression from any bytes: decoded whole, in blocks, and passed over.
#include <cstdlib>
#include <memory>
#include <vector>

#include "core/sound/decomp.h"
#include "core/sound/sound_channel.h"
#include "core/sound/sound_info.h"
#include "core/stream/parser.h"

constexpr S32 kMostFrames = 1 << 20; // of one input

// Decodes up to the end, or until the input has had its share. The block is exactly as large as
// what was asked for, so that a sanitizer sees more.
static S32 Drain(CSoundDecomp* decoder, U8 format, S32 piece, bool heard)
{
    std::vector<S16> samples(size_t(piece) * size_t(SoundFrameBytes(format)) / 2 + 1);
    S32 frames = 0;
    while (frames < kMostFrames) {
        const S32 got = decoder->Decompress(heard ? samples.data() : nullptr, piece);
        if (got < 0 || got > piece)
            std::abort();
        frames += got;
        if (got < piece)
            break;
    }
    return frames;
}

static void DecodeBlocks(CSoundDecomp* decoder, const CSound& whole, S32 blockLen, bool reset)
{
    CSound block = whole;
    for (S32 at = 0; at < whole.dataLen; at += blockLen) {
        block.data = whole.data + at;
        block.dataLen = blockLen < whole.dataLen - at ? blockLen : whole.dataLen - at;
        decoder->Setup(&block, reset);
        Drain(decoder, block.format, 1000, true);
    }
}

static void ReadInfo(const U8* data, S32 size)
{
    struct : SParser {
    } parser;
    parser.Attach(data, size);
    CSoundChannel* channel = new CSoundChannel;
    GetSoundInfo(&parser, channel);
    const S32 end = parser.pos;
    parser.pos = 0;
    GetSoundInfo(&parser, nullptr);
    if (parser.pos != end)
        std::abort();
    channel->Release();
}

// Format, lead-in and block length come first; the rest is data.
extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 5 || size > 1u << 20)
        return 0;
    CSound sound;
    sound.format = data[0];
    sound.start = static_cast<S16>(data[1] | data[2] << 8);
    const S32 blockLen = 1 + (data[3] | (data[4] & 7) << 8);
    const std::vector<U8> body(data + 5, data + size);
    sound.data = body.data();
    sound.dataLen = static_cast<S32>(body.size());
    ReadInfo(sound.data, sound.dataLen);
    const std::unique_ptr<CSoundDecomp> decoder(CreateDecompressor(sound.format));
    if (!decoder)
        return 0;
    decoder->Setup(&sound, true);
    const S32 heard = Drain(decoder.get(), sound.format, 577, true);
    decoder->Setup(&sound, true);
    const S32 passed = Drain(decoder.get(), sound.format, 5000, false);
    // A decoder that has failed stays silent, and only an MPEG one can fail.
    if (passed != heard && heard < kMostFrames && (passed != 0 || (sound.format & 0xF0) != 0x20))
        std::abort();
    DecodeBlocks(decoder.get(), sound, blockLen, (data[4] & 8) != 0);
    return 0;
}
