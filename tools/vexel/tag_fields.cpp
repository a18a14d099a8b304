#include "tools/vexel/tag_fields.h"

#include "core/display/place_info.h"
#include "core/stream/character.h"
#include "core/stream/tags.h"
#include "core/text/field_record.h"
#include "tools/vexel/message.h"
#include "tools/vexel/shape_scan.h"
#include "tools/vexel/text_form.h"

#include <algorithm>

namespace {

std::string RectField(TagReader& tag, const char* name)
{
    SRECT r;
    tag.GetRect(&r);
    return Format(" %s=", name) + RectText(r);
}

std::string MatrixField(TagReader& tag)
{
    MATRIX m;
    tag.GetMatrix(&m);
    return " matrix=" + MatrixText(m);
}

std::string CxformField(TagReader& tag, int alpha)
{
    ColorTransform cx;
    tag.GetColorTransform(&cx, alpha);
    return " cxform=" + CxformText(cx);
}

std::string WordField(TagReader& tag, const char* name)
{
    return Format(" %s=%u", name, tag.GetWord());
}

std::string PlaceFields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += WordField(tag, "depth");
    text += MatrixField(tag);
    if (tag.pos < tag.tagEnd)
        text += CxformField(tag, 0);
    return text;
}

// The player does not move past the name: a clip depth beside it is the name's first two bytes.
std::string NameAndClip(TagReader& tag, U32 flags)
{
    std::string text;
    const S32 place = tag.pos;
    if (flags & PlaceInfo::kName)
        text += " name=" + Quote(tag.Text());
    tag.pos = place;
    if (flags & PlaceInfo::kClipDepth)
        text += WordField(tag, "clip");
    return text;
}

std::string Place2Fields(TagReader& tag)
{
    const U32 flags = tag.GetByte();
    std::string text = Format(" flags=0x%02x", flags);
    text += WordField(tag, "depth");
    if (flags & PlaceInfo::kMove)
        text += " move";
    if (flags & PlaceInfo::kCharacter)
        text += WordField(tag, "id");
    if (flags & PlaceInfo::kMatrix)
        text += MatrixField(tag);
    if (flags & PlaceInfo::kCxform)
        text += CxformField(tag, 1);
    if (flags & PlaceInfo::kRatio)
        text += WordField(tag, "ratio");
    return text + NameAndClip(tag, flags);
}

std::string RemoveFields(TagReader& tag)
{
    const std::string id = WordField(tag, "id");
    return id + WordField(tag, "depth");
}

std::string CountFields(TagReader& tag, ShapeKind kind)
{
    const ShapeCounts counts = ScanShape(&tag, kind);
    return Format(" fills=%u lines=%u edges=%u", counts.fills, counts.lines, counts.edges);
}

std::string ShapeFields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += RectField(tag, "bounds");
    const bool alpha = tag.tagCode == kTagDefineShape3;
    return text + CountFields(tag, alpha ? ShapeKind::kAlpha : ShapeKind::kPlain);
}

std::string MorphFields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += RectField(tag, "bounds");
    text += RectField(tag, "endBounds");
    text += Format(" endEdges=%u", tag.GetDWord());
    return text + CountFields(tag, ShapeKind::kMorph);
}

std::string BoundsFields(TagReader& tag)
{
    const std::string id = WordField(tag, "id");
    return id + RectField(tag, "bounds");
}

std::string LayoutFields(const SFieldRecord& field)
{
    constexpr const char* kAlign[] = {"left", "right", "center", "justify"};
    return Format(" align=%s margins=%d,%d indent=%d leading=%d", kAlign[field.align],
                  field.leftMargin, field.rightMargin, field.indent, field.leading);
}

// What the flags announce, in their order.
std::string EditTextFields(TagReader& tag)
{
    std::string text = BoundsFields(tag);
    SCharacter character = {};
    character.type = kCharEditText;
    character.data = tag.script + tag.pos;
    character.dataLen = std::max(tag.tagEnd - tag.pos, 0);
    const SFieldRecord field(&character);
    text += Format(" flags=0x%04x", field.flags);
    if (field.Has(kFieldFont))
        text += Format(" font=%u height=%d", field.fontId, field.height);
    if (field.Has(kFieldColor))
        text += " color=" + ColorText(field.color);
    if (field.Has(kFieldMaxLen))
        text += Format(" maxLen=%u", field.maxLen);
    if (field.Has(kFieldLayout))
        text += LayoutFields(field);
    text +=
        field.longPath ? " variable=(too long)" : " variable=" + Quote(std::string(field.variable));
    if (field.Has(kFieldText))
        text += " text=" + Quote(std::string(field.text));
    return text;
}

std::string LosslessFields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += Format(" format=%u", tag.GetByte());
    text += WordField(tag, "width");
    return text + WordField(tag, "height");
}

std::string FontFields(TagReader& tag)
{
    const std::string text = WordField(tag, "id");
    return text + Format(" glyphs=%u", tag.GetWord() / 2u);
}

std::string CountedName(TagReader& tag)
{
    std::string name;
    for (S32 n = tag.GetByte(); n > 0 && tag.pos < tag.limit; n--)
        name += static_cast<char>(tag.GetByte());
    return " name=" + Quote(name);
}

std::string Font2Fields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += Format(" flags=0x%04x", tag.GetWord());
    text += CountedName(tag);
    return text + WordField(tag, "glyphs");
}

std::string FontInfoFields(TagReader& tag)
{
    const std::string text = WordField(tag, "id");
    return text + CountedName(tag);
}

std::string SoundFields(TagReader& tag)
{
    std::string text = WordField(tag, "id");
    text += Format(" format=0x%02x", tag.GetByte());
    return text + Format(" samples=%u", tag.GetDWord());
}

std::string StreamHeadFields(TagReader& tag)
{
    std::string text = Format(" playback=0x%02x", tag.GetByte());
    text += Format(" format=0x%02x", tag.GetByte());
    return text + WordField(tag, "samples");
}

std::string SpriteFields(TagReader& tag)
{
    const std::string id = WordField(tag, "id");
    return id + WordField(tag, "frames");
}

std::string Button2Fields(TagReader& tag)
{
    const std::string id = WordField(tag, "id");
    return tag.GetByte() != 0 ? id + " menu" : id;
}

std::string ButtonCxformFields(TagReader& tag)
{
    const std::string id = WordField(tag, "id");
    return id + CxformField(tag, 0);
}

std::string Decode(TagReader& tag)
{
    switch (tag.tagCode) {
    case kTagDefineShape:
    case kTagDefineShape2:
    case kTagDefineShape3:
        return ShapeFields(tag);
    case kTagDefineMorphShape:
        return MorphFields(tag);
    case kTagPlaceObject:
        return PlaceFields(tag);
    case kTagPlaceObject2:
        return Place2Fields(tag);
    case kTagRemoveObject:
        return RemoveFields(tag);
    case kTagRemoveObject2:
        return WordField(tag, "depth");
    case kTagSetBackgroundColor:
        return " color=" + ColorText(tag.GetColor(0));
    case kTagDefineBitsLossless:
    case kTagDefineBitsLossless2:
        return LosslessFields(tag);
    case kTagDefineText:
    case kTagDefineText2:
        return BoundsFields(tag);
    case kTagDefineEditText:
        return EditTextFields(tag);
    case kTagDefineFont:
        return FontFields(tag);
    case kTagDefineFont2:
        return Font2Fields(tag);
    case kTagDefineFontInfo:
        return FontInfoFields(tag);
    case kTagDefineSound:
        return SoundFields(tag);
    case kTagSoundStreamHead:
    case kTagSoundStreamHead2:
        return StreamHeadFields(tag);
    case kTagDefineSprite:
        return SpriteFields(tag);
    case kTagDefineButton2:
        return Button2Fields(tag);
    case kTagDefineButtonCxform:
        return ButtonCxformFields(tag);
    case kTagFrameLabel:
        return " label=" + Quote(tag.Text());
    case kTagFreeCharacter:
    case kTagDefineBits:
    case kTagDefineBitsJPEG2:
    case kTagDefineBitsJPEG3:
    case kTagDefineButton:
    case kTagDefineButtonSound:
    case kTagStartSound:
        return WordField(tag, "id");
    default:
        return "";
    }
}

} // namespace

std::string TagFields(TagReader* tag)
{
    tag->pos = tag->bodyStart;
    return Decode(*tag);
}
