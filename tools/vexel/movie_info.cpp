#include "tools/vexel/movie_info.h"

#include "core/stream/character.h"
#include "core/stream/tags.h"

#include <algorithm>

namespace {

constexpr int kDeepest = 16; // sprites inside sprites

// The type of character that a tag defines, or null.
const char* DefinedType(S32 code)
{
    switch (code) {
    case kTagDefineShape:
    case kTagDefineShape2:
    case kTagDefineShape3:
        return "shape";
    case kTagDefineMorphShape:
        return "morph";
    case kTagDefineBits:
    case kTagDefineBitsLossless:
    case kTagDefineBitsJPEG2:
    case kTagDefineBitsJPEG3:
    case kTagDefineBitsLossless2:
        return "bitmap";
    case kTagDefineButton:
    case kTagDefineButton2:
        return "button";
    case kTagDefineFont:
    case kTagDefineFont2:
        return "font";
    case kTagDefineText:
    case kTagDefineText2:
        return "text";
    case kTagDefineEditText:
        return "edit";
    case kTagDefineSound:
        return "sound";
    case kTagDefineSprite:
        return "sprite";
    default:
        return nullptr;
    }
}

bool BeginsWithBounds(S32 code)
{
    switch (code) {
    case kTagDefineShape:
    case kTagDefineShape2:
    case kTagDefineShape3:
    case kTagDefineMorphShape:
    case kTagDefineText:
    case kTagDefineText2:
    case kTagDefineEditText:
        return true;
    default:
        return false;
    }
}

} // namespace

const char* CompressionName(U8 format)
{
    switch (format & kSoundCompression) {
    case kSoundPlain:
        return "pcm";
    case kSoundAdpcm:
        return "adpcm";
    case kSoundMpeg:
        return "mpeg";
    case kSoundPlainLittle:
        return "pcm-le";
    default:
        return "unknown";
    }
}

int SoundBits(U8 format)
{
    return DecodedFormat(format) & kSound16Bit ? 16 : 8;
}

// The lowest rate is not a whole number of samples a second.
double SoundSeconds(U8 format, U32 samples)
{
    return samples / (44100.0 / (1 << SoundRateShift(format)));
}

void MovieInfo::Collect(TagReader reader, int depth, int sprite)
{
    size_t head = 0; // the place after the last stream of this timeline; 0: none
    while (reader.Next()) {
        tags[reader.tagCode]++;
        CollectTag(&reader, depth);
        CollectStream(&reader, sprite, &head);
        constexpr S32 kSpriteHead = 4; // id and frame count
        if (reader.tagCode == kTagDefineSprite && depth < kDeepest && reader.Length() > kSpriteHead)
            Collect(TagReader(reader.script, reader.bodyStart + kSpriteHead, reader.tagEnd),
                    depth + 1,
                    reader.script[reader.bodyStart] | reader.script[reader.bodyStart + 1] << 8);
    }
}

void MovieInfo::CollectTag(TagReader* reader, int depth)
{
    const char* type = DefinedType(reader->tagCode);
    if (type != nullptr)
        Define(reader, type);
    else if (reader->tagCode == kTagFreeCharacter)
        defined.reset(reader->GetWord());
    else if (reader->tagCode == kTagShowFrame && depth == 0)
        frames++;
    else if (reader->tagCode == kTagFrameLabel && depth == 0)
        labels.push_back({frames + 1, reader->Text()});
}

void MovieInfo::CollectStream(TagReader* reader, int sprite, size_t* head)
{
    const S32 code = reader->tagCode;
    if (code == kTagSoundStreamHead || code == kTagSoundStreamHead2) {
        reader->pos = reader->bodyStart + 1;
        const U8 format = reader->GetByte();
        streams.push_back({sprite, format, reader->GetWord()});
        *head = streams.size();
    } else if (code == kTagSoundStreamBlock && *head > 0) {
        streams[*head - 1].blocks++;
    }
}

// As in the player the first definition of an id stands until it is freed.
void MovieInfo::Define(TagReader* reader, const char* type)
{
    const U16 id = reader->GetWord();
    if (defined[id] || id >= kIdFirstReserved)
        return;
    defined.set(id);
    InfoCharacter character = {id, type, reader->tagCode};
    const S32 code = reader->tagCode;
    if (BeginsWithBounds(code)) {
        character.hasBounds = true;
        reader->GetRect(&character.bounds);
    } else if (code == kTagDefineBitsLossless || code == kTagDefineBitsLossless2) {
        character.hasSize = true;
        reader->GetByte(); // format
        character.width = reader->GetWord();
        character.height = reader->GetWord();
    } else if (code == kTagDefineSprite) {
        character.frames = reader->GetWord();
    } else if (code == kTagDefineSound) {
        character.hasSound = true;
        character.format = reader->GetByte();
        character.samples = reader->GetDWord();
    }
    characters.push_back(character);
}
