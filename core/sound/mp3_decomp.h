// CMp3Decomp: MPEG audio, through mp3dec.
#pragma once

#include "core/sound/decomp.h"
#include "core/sound/mp3dec.h"

// Takes the sound's channels from its format byte and its rate on trust. Its decoder is opened when
// it is made; without one, or once that fails, it gives nothing. What is not MPEG audio in the data
// is passed over in silence.
class CMp3Decomp : public CSoundDecomp {
public:
    // `format`: the bits of the sounds to come, for which memory is allocated.
    explicit CMp3Decomp(U8 format);
    ~CMp3Decomp() override;

    // Passes over the sound's lead-in. Without `reset` the decoder goes on with the new data, and
    // what is decoded already is still to come, before it; a change between mono and stereo resets.
    void Setup(const CSound* sound, bool reset) override;
    // What is missing at the end is filled with zeros; the result does not count them.
    S32 Decompress(void* out, S32 count) override;
    // The same from what is already decoded, without decoding: what an earlier block left.
    S32 GetBufferedData(void* out, S32 count);

private:
    void Reset(U8 format);
    S64 Serve(U8* out, S64 bytes);
    bool DecodeMore();
    bool Feed();

    static constexpr S32 kBufferSize = 8192;

    SMp3Decoder* decoder = nullptr;
    bool usable = false;       // there is a decoder that has not failed
    bool ended = false;        // nothing comes out any more
    const U8* input = nullptr; // first byte that was not handed to the decoder
    S32 inputLeft = 0;         // bytes from there on
    S32 frameBytes = 0;        // of the output
    S32 filled = 0;            // bytes of decoded data in the buffer
    S32 readAt = 0;            // those before it are served
    alignas(4) U8 buffer[kBufferSize];
};
