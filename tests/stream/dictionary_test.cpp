#include "core/stream/script_player.h"
#include "core/stream/tags.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

#include <memory>

namespace {

// A movie whose tags have all run, without a display.
std::unique_ptr<ScriptPlayer> RunTags(MovieWriter& writer)
{
    auto movie = std::make_unique<ScriptPlayer>();
    writer.Show().End();
    Push(*movie, writer.Bytes());
    while (movie->DoTag() == kDrawn) {
    }
    EXPECT_TRUE(movie->atEnd);
    return movie;
}

std::vector<U8> Body(U16 id, const std::vector<U8>& rest)
{
    return ByteWriter().PutU16(id).PutBytes(rest).Bytes();
}

// The kept part of the body: its first byte, and its length.
void ExpectBody(const SCharacter* ch, U8 first, S32 length)
{
    ASSERT_NE(ch, nullptr);
    ASSERT_NE(ch->data, nullptr);
    EXPECT_EQ(ch->data[0], first);
    EXPECT_EQ(ch->DataLen(), length);
}

TEST(Dictionary, FirstDefinitionStays)
{
    ScriptPlayer movie;
    SCharacter* five = movie.CreateCharacter(5);
    EXPECT_EQ(five->type, kCharNone);
    EXPECT_TRUE(RectIsEmpty(&five->bounds));
    SCharacter* chained = movie.CreateCharacter(133);
    EXPECT_EQ(movie.CreateCharacter(5), nullptr);
    EXPECT_EQ(movie.FindCharacter(5), five);
    EXPECT_EQ(movie.FindCharacter(133), chained);
    EXPECT_EQ(movie.FindCharacter(261), nullptr);
    movie.FreeCharacter(133);
    EXPECT_EQ(movie.FindCharacter(5), five);
    movie.FreeCharacter(5);
    EXPECT_EQ(movie.FindCharacter(5), nullptr);
    EXPECT_NE(movie.CreateCharacter(5), nullptr);
}

TEST(Dictionary, RecordsOutliveTheirDefinitionWhileInUse)
{
    ScriptPlayer movie;
    SCharacter* old = movie.CreateCharacter(7);
    old->type = kCharShape;
    RetainCharacter(old);
    RetainCharacter(old);
    movie.FreeCharacter(7);
    EXPECT_EQ(movie.FindCharacter(7), nullptr);
    SCharacter* fresh = movie.CreateCharacter(7);
    EXPECT_NE(fresh, old);
    ReleaseCharacter(old);
    EXPECT_EQ(old->type, kCharShape);
    ReleaseCharacter(old);
    EXPECT_EQ(movie.FindCharacter(7), fresh);
    movie.FreeAll();
    movie.FreeCache();
    EXPECT_EQ(movie.charAlloc.BlockCount(), 0u) << "every record went back to the pool";
    ReleaseCharacter(nullptr);
    SCharacter* own = movie.NewPrivateCharacter();
    RetainCharacter(own);
    ReleaseCharacter(own);
}

TEST(Definitions, KeepTypeCodeBoundsAndBody)
{
    const Box box{-20, 400, 0, 1000};
    const std::vector<U8> rect = ByteWriter().PutRect(box).Bytes();
    const struct {
        int tag;
        U8 type;
        bool bounds;
    } cases[] = {{2, 0, true},   {22, 0, true},  {32, 0, true},  {46, 7, true}, {7, 2, false},
                 {10, 3, false}, {11, 4, true},  {33, 4, true},  {37, 9, true}, {6, 1, false},
                 {20, 1, false}, {21, 1, false}, {35, 1, false}, {36, 1, false}};
    MovieWriter writer;
    U16 id = 100;
    for (const auto& c : cases) {
        ByteWriter rest;
        if (c.bounds)
            rest.PutBytes(rect);
        if (c.tag == 46)
            rest.PutRect({1, 2, 3, 4});
        writer.Raw(c.tag, Body(id++, rest.PutBytes({0xAB, 0xCD, 0xEF}).Bytes()));
    }
    const auto movie = RunTags(writer);
    id = 100;
    for (const auto& c : cases) {
        SCOPED_TRACE(c.tag);
        const SCharacter* ch = movie->FindCharacter(id++);
        if (c.type == kCharBitmap)
            ExpectBody(ch, U8(c.tag << 6 | 5), 7); // the tag's own header
        else
            ExpectBody(ch, 0xAB, 3);
        EXPECT_EQ(ch->type, c.type);
        EXPECT_EQ(ch->tagCode, c.tag);
        EXPECT_EQ(RectIsEmpty(&ch->bounds), !c.bounds);
        if (c.bounds) {
            EXPECT_TRUE(Same(ch->bounds, SRECT{-20, 400, 0, 1000}));
        }
    }
    EXPECT_TRUE(Same(movie->FindCharacter(103)->endBounds, SRECT{1, 2, 3, 4}));
    EXPECT_EQ(movie->FindCharacter(104)->button.trackAsMenu, 0);
}

TEST(Definitions, ReadWhatTheirKindNeeds)
{
    MovieWriter writer, nested;
    nested.Show(2).End();
    writer.Raw(34, Body(1, {1, 0x77}));
    writer.Raw(48, ByteWriter()
                       .PutU16(2)
                       .PutU16(0x8081)
                       .PutU8(255)
                       .PutBytes(std::vector<U8>(255, 'n'))
                       .PutU16(300)
                       .PutU8(0x66)
                       .Bytes());
    writer.Raw(14, Body(3, {0x2F, 1, 2, 3, 4, 0xFE, 0xFF, 0x55, 0x56}));
    writer.Raw(14, Body(4, {0x1F, 1, 0, 0, 0, 0x44}));
    writer.Raw(14, Body(5, {0x4F, 1, 0, 0, 0, 0x44}));
    writer.DefineSprite(6, 9, nested);
    const auto movie = RunTags(writer);
    const SCharacter* button = movie->FindCharacter(1);
    ExpectBody(button, 0x77, 1);
    EXPECT_EQ(button->button.trackAsMenu, 1);
    const SCharacter* font = movie->FindCharacter(2);
    ExpectBody(font, 0x66, 1);
    EXPECT_EQ(font->font.flags, 0x8081);
    EXPECT_EQ(font->font.glyphCount, 300);
    EXPECT_EQ(font->font.distance, 258) << "a long name needs more than a byte";
    const SCharacter* mpeg = movie->FindCharacter(3);
    ExpectBody(mpeg, 0x55, 2);
    EXPECT_EQ(mpeg->sound.format, 0x2F);
    EXPECT_EQ(mpeg->sound.sampleCount, 0x04030201u);
    EXPECT_EQ(mpeg->sound.start, -2);
    EXPECT_EQ(mpeg->sound.dataLen, 2);
    ExpectBody(movie->FindCharacter(4), 0x44, 1);
    EXPECT_EQ(movie->FindCharacter(5), nullptr) << "an unknown compression";
    const SCharacter* sprite = movie->FindCharacter(6);
    ExpectBody(sprite, 0x40, 6);
    EXPECT_EQ(sprite->sprite.numFrames, 9);
    EXPECT_EQ(sprite->sprite.dataLen, 6);
    EXPECT_EQ(sprite->tagCode, 0);
}

TEST(Definitions, AttachmentsTakeTheFirstRecordOfTheRightType)
{
    MovieWriter writer;
    writer.Raw(10, Body(1, {0})).Raw(7, Body(2, {0})).Raw(2, Body(3, {0}));
    writer.Raw(13, Body(1, {0x11})).Raw(13, Body(1, {0x12})).Raw(13, Body(2, {0x13}));
    writer.Raw(17, Body(2, {0x21})).Raw(17, Body(2, {0x22})).Raw(23, Body(2, {0x31}));
    writer.Raw(17, Body(1, {0x23})).Raw(23, Body(3, {0x32})).Raw(13, Body(9, {0x14}));
    const auto movie = RunTags(writer);
    EXPECT_EQ(movie->FindCharacter(1)->font.info[0], 0x11);
    EXPECT_EQ(movie->FindCharacter(2)->button.sounds[0], 0x21);
    EXPECT_EQ(movie->FindCharacter(2)->button.cxform[0], 0x31);
    EXPECT_EQ(movie->FindCharacter(3)->button.cxform, nullptr) << "not a button";
}

TEST(Definitions, ReservedIdsAndFreeing)
{
    MovieWriter writer;
    for (U32 id = 0xFFFC; id <= 0xFFFF; id++)
        writer.Raw(2, Body(U16(id), {0}));
    writer.Raw(2, Body(0xFFFB, {0})).Raw(2, Body(8, {0})).Raw(7, Body(8, {0}));
    writer.Raw(2, Body(9, {0})).FreeCharacter(9).Raw(7, Body(9, {0})).FreeCharacter(4);
    const auto movie = RunTags(writer);
    for (U32 id = 0xFFFC; id <= 0xFFFF; id++)
        EXPECT_EQ(movie->FindCharacter(U16(id)), nullptr);
    EXPECT_NE(movie->FindCharacter(0xFFFB), nullptr);
    EXPECT_EQ(movie->FindCharacter(8)->type, kCharShape);
    EXPECT_EQ(movie->FindCharacter(9)->type, kCharButton) << "free for another definition";
}

TEST(Definitions, BodiesThatAreTooShortKeepNothing)
{
    // Each is cut everywhere; the tag behind it lends its bytes to the fixed fields, no more.
    const std::vector<U8> sound = Body(1, {0x2F, 1, 2, 3, 4, 5, 6});
    const std::vector<U8> font = Body(1, {0, 0, 200, 'x', 'y'});
    for (int tag : {2, 6, 7, 10, 11, 14, 34, 37, 39, 46, 48}) {
        const std::vector<U8>& body = tag == 48 ? font : sound;
        for (size_t cut = 0; cut <= body.size(); cut++) {
            MovieWriter writer;
            writer.Raw(tag, {body.begin(), body.begin() + static_cast<std::ptrdiff_t>(cut)});
            const auto movie = RunTags(writer);
            const SCharacter* ch = movie->FindCharacter(1);
            if (!ch)
                continue;
            EXPECT_GE(ch->DataLen(), 0);
            EXPECT_LE(ch->DataLen(), movie->BytesFrom(ch->data));
            if (tag == 48) {
                EXPECT_EQ(ch->font.glyphCount, 0);
            }
        }
    }
}

} // namespace
