#include "tests/support/sound_writer.h"

#include <sstream>

std::vector<U8> Pcm(const std::vector<S16>& samples)
{
    ByteWriter out;
    for (const S16 sample : samples)
        out.PutU16(U16(sample));
    return out.Bytes();
}

std::vector<U8> Adpcm(S16 first)
{
    return ByteWriter().UB(2, 0).SB(16, first).UB(6, 0).Bytes();
}

TagWriter& DefineSound(TagWriter& tags, U16 id, U8 format, U32 count, const std::vector<U8>& data)
{
    const ByteWriter body = ByteWriter().PutU16(id).PutU8(format).PutU32(count).PutBytes(data);
    return tags.Raw(kTagDefineSound, body);
}

TagWriter& StreamHead(TagWriter& tags, U8 format, U16 samplesPerFrame, U16 leadIn)
{
    const ByteWriter body = ByteWriter().PutU16(format * 0x101u).PutU16(samplesPerFrame);
    return tags.Raw(kTagSoundStreamHead, ByteWriter(body).PutU16(leadIn));
}

std::vector<U8> SoundMovie(const std::string& words, U16 samplesPerFrame, U8 format)
{
    MovieWriter movie(2000, 2000, Fps(10));
    StreamHead(movie, format, samplesPerFrame);
    std::istringstream in(words);
    for (char kind, comma; in >> kind;) {
        S32 a = 0, b = 0;
        if (isdigit(kind))
            in.unget();
        if (kind != '/' && kind != '.' && in >> a && kind != 'f' && !isdigit(kind))
            in >> comma >> b;
        const ByteWriter pair = ByteWriter().PutU16(U32(a)).PutU16(U32(b));
        if (kind == 'd')
            DefineSound(movie, U16(a), 14, 1, Pcm({S16(b)}));
        else if (isdigit(kind))
            movie.Raw(kTagSoundStreamBlock, format == 30 ? Adpcm(S16(a)) : Pcm({S16(a)}));
        else
            movie.Raw(kind == '/'   ? 1
                      : kind == '.' ? 0
                      : kind == 's' ? 15
                      : kind == 'f' ? 3
                                    : 19,
                      pair);
    }
    return movie.Bytes();
}
