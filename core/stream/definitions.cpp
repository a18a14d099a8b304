// Tags that enter characters into the dictionary, or hang a record on one that is there. Little is
// read now: the rest of a body is read when the character is shown.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/stream/script_player.h"
#include "core/stream/script_thread.h"
#include "core/stream/sounds.h"
#include "core/stream/tags.h"

namespace {
constexpr S32 kMaxTableBytes = 0x10000; // the tables of a JPEG stream need far less
constexpr U16 kEditOwnGlyphs = 0x0100;  // drawn with the movie's font, not with a device font
} // namespace

// Codes without a case are skipped: unknown ones, and those of sounds and actions.
void ScriptThread::DispatchDefinition()
{
    switch (tagCode) {
    case kTagDefineShape:
    case kTagDefineShape2:
    case kTagDefineShape3:
        return DefineShape();
    case kTagDefineMorphShape:
        return DefineMorphShape();
    case kTagDefineBits:
    case kTagDefineBitsJPEG2:
    case kTagDefineBitsJPEG3:
    case kTagDefineBitsLossless:
    case kTagDefineBitsLossless2:
        return DefineBits();
    case kTagDefineJPEGTables:
        return DefineJPEGTables();
    case kTagDefineButton:
    case kTagDefineButton2:
        return DefineButton();
    case kTagDefineFont:
        return DefineFont();
    case kTagDefineFont2:
        return DefineFont2();
    case kTagDefineText:
    case kTagDefineText2:
        return DefineText();
    case kTagDefineEditText:
        return DefineEditText();
    case kTagDefineSound:
        return DefineSound();
    case kTagDefineSprite:
        return DefineSprite();
    case kTagDefineFontInfo:
        return DefineFontInfo();
    case kTagDefineButtonSound:
    case kTagDefineButtonCxform:
        return DefineButtonExtra();
    case kTagFreeCharacter:
        return FreeCharacter();
    }
}

SCharacter* ScriptThread::NewCharacter(U8 type)
{
    const U16 id = GetWord();
    if (id >= kIdFirstReserved || !player)
        return nullptr;
    SCharacter* ch = player->CreateCharacter(id);
    if (!ch)
        return nullptr;
    ch->type = type;
    ch->tagCode = static_cast<U8>(tagCode);
    return ch;
}

void ScriptThread::KeepBody(SCharacter* ch)
{
    ch->data = script + pos;
    ch->dataLen = tagEnd > pos ? tagEnd - pos : 0;
}

void ScriptThread::DefineShape()
{
    SCharacter* ch = NewCharacter(kCharShape);
    if (!ch)
        return;
    GetRect(&ch->bounds);
    KeepBody(ch);
}

void ScriptThread::DefineMorphShape()
{
    SCharacter* ch = NewCharacter(kCharMorphShape);
    if (!ch)
        return;
    GetRect(&ch->bounds);
    GetRect(&ch->endBounds);
    KeepBody(ch);
}

// The body starts at the tag's own header, which is read again when the pixels are built.
void ScriptThread::DefineBits()
{
    SCharacter* ch = NewCharacter(kCharBitmap);
    if (!ch)
        return;
    ch->bitmap.PIInit();
    pos = tagStart;
    KeepBody(ch);
}

// Once a movie. The tables are read before each image that shares them, so that an image looks the
// same whatever tables others have brought along.
void ScriptThread::DefineJPEGTables()
{
    if (!player || player->jpegInfo)
        return;
    player->jpegInfo = script + pos;
    player->jpegInfoLen = std::min(tagEnd - pos, kMaxTableBytes);
}

void ScriptThread::DefineButton()
{
    SCharacter* ch = NewCharacter(kCharButton);
    if (!ch)
        return;
    if (tagCode == kTagDefineButton2)
        ch->button.trackAsMenu = GetByte();
    KeepBody(ch);
}

void ScriptThread::DefineFont()
{
    SCharacter* ch = NewCharacter(kCharFont);
    if (ch)
        KeepBody(ch);
}

void ScriptThread::DefineFont2()
{
    SCharacter* ch = NewCharacter(kCharFont);
    if (!ch)
        return;
    ch->font.flags = GetWord();
    const S32 start = pos;
    Skip(GetByte()); // the name
    ch->font.glyphCount = GetWord();
    ch->font.distance = static_cast<U16>(pos - start);
    if (pos > tagEnd) { // a name longer than the tag: no table can follow
        ch->font.glyphCount = 0;
        ch->font.distance = static_cast<U16>(tagEnd > start ? tagEnd - start : 0);
    }
    KeepBody(ch);
}

void ScriptThread::DefineText()
{
    SCharacter* ch = NewCharacter(kCharText);
    if (!ch)
        return;
    GetRect(&ch->bounds);
    KeepBody(ch);
}

void ScriptThread::DefineEditText()
{
    SCharacter* ch = NewCharacter(kCharEditText);
    if (!ch)
        return;
    GetRect(&ch->bounds);
    KeepBody(ch);
    const U16 flags = GetWord(); // part of the kept body: only looked at
    if (display && !(flags & kEditOwnGlyphs))
        display->editTextFlag = 1;
}

void ScriptThread::DefineSound()
{
    SCharacter* ch = NewCharacter(kCharSound);
    if (!ch)
        return;
    CSound sound;
    if (!GetSoundBody(this, &sound)) {
        player->FreeCharacter(ch->tag); // a compression that nobody can play: the id stays free
        return;
    }
    ch->sound.format = sound.format;
    ch->sound.sampleCount = static_cast<U32>(sound.numSamples);
    ch->sound.start = static_cast<S16>(sound.start);
    KeepBody(ch);
    ch->sound.dataLen = ch->dataLen;
}

void ScriptThread::DefineSprite()
{
    SCharacter* ch = NewCharacter(kCharSprite);
    if (!ch)
        return;
    ch->tagCode = 0;
    ch->sprite.numFrames = GetWord();
    KeepBody(ch);
    ch->sprite.dataLen = ch->dataLen;
}

// The record of a font or a button that was defined before; null for any other type.
SCharacter* ScriptThread::DefinedCharacter(U8 type)
{
    SCharacter* ch = PlacedCharacter(GetWord());
    return ch && ch->type == type ? ch : nullptr;
}

// In the two attachments the first record wins.
void ScriptThread::DefineFontInfo()
{
    SCharacter* ch = DefinedCharacter(kCharFont);
    if (!ch || ch->font.info)
        return;
    ch->font.info = script + pos;
    ch->font.infoLen = tagEnd > pos ? tagEnd - pos : 0;
}

void ScriptThread::DefineButtonExtra()
{
    const bool isSound = tagCode == kTagDefineButtonSound;
    SCharacter* ch = DefinedCharacter(kCharButton);
    if (!ch)
        return;
    const U8** record = isSound ? &ch->button.sounds : &ch->button.cxform;
    if (*record)
        return;
    *record = script + pos;
    (isSound ? ch->button.soundsLen : ch->button.cxformLen) = tagEnd > pos ? tagEnd - pos : 0;
}

void ScriptThread::FreeCharacter()
{
    const U16 id = GetWord();
    if (id < kIdFirstReserved && player)
        player->FreeCharacter(id);
}
