#include "core/sound/sound_info.h"

#include "core/sound/sound_channel.h"
#include "core/stream/parser.h"

enum SSoundInfoFlag : U8 {
    kInfoInPoint = 0x01,
    kInfoOutPoint = 0x02,
    kInfoLoops = 0x04,
    kInfoEnvelope = 0x08,
};

// The count is a byte, so every point has its place in a channel.
static void GetEnvelope(SParser* parser, CSoundChannel* channel)
{
    static_assert(kMostEnvelopePoints >= 255);
    const S32 count = parser->GetByte();
    if (!channel) {
        parser->Skip(count * 8);
        return;
    }
    channel->numPoints = count;
    for (S32 i = 0; i < count; ++i) {
        channel->points[i].position = parser->GetDWord();
        channel->points[i].left = parser->GetWord();
        channel->points[i].right = parser->GetWord();
    }
}

void GetSoundInfo(SParser* parser, CSoundChannel* channel)
{
    const U8 flags = parser->GetByte();
    const U32 inPoint = flags & kInfoInPoint ? parser->GetDWord() : 0;
    const U32 outPoint = flags & kInfoOutPoint ? parser->GetDWord() : 0;
    const S32 loops = flags & kInfoLoops ? parser->GetWord() : 0;
    if (channel) {
        channel->syncFlags = flags >> 4;
        channel->inPoint = flags & kInfoInPoint ? inPoint : channel->inPoint;
        channel->outPoint = flags & kInfoOutPoint ? outPoint : channel->outPoint;
        channel->loops = loops > 0 ? loops : channel->loops;
    }
    if (flags & kInfoEnvelope)
        GetEnvelope(parser, channel);
}
