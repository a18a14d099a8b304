#include "samples/scene.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <map>
#include <set>

namespace {

std::vector<U8> ReadFile(const std::string& path)
{
    std::vector<U8> bytes;
    FILE* file = std::fopen(path.c_str(), "rb");
    if (!file)
        return bytes;
    U8 block[4096];
    while (size_t got = std::fread(block, 1, sizeof block, file))
        bytes.insert(bytes.end(), block, block + got);
    std::fclose(file);
    return bytes;
}

struct Sample {
    const char* name;
    std::vector<U8> (*make)();
    int frames;
};

const Sample kSamples[] = {
    {"viaduct", MakeViaduct, 120}, {"clockwork", MakeClockwork, 96}, {"shapes", MakeShapes, 1}};

U32 Number(const std::vector<U8>& bytes, size_t at, int size)
{
    U32 value = 0;
    for (int i = 0; i < size; i++)
        value |= U32(bytes.at(at + size_t(i))) << 8 * i;
    return value;
}

// Walks a timeline's tags the way a reader would and keeps account of what a sound movie owes:
// characters known before use, a depth free before it is taken and taken before it moves.
class Auditor {
public:
    explicit Auditor(const std::vector<U8>& movie) : bytes(movie) {}

    void Walk(size_t from, size_t to)
    {
        std::set<U32> depths;
        bool ended = false;
        frames = 0;
        while (from < to) {
            ASSERT_FALSE(ended) << "a tag after the end, at " << from;
            U32 word = Number(bytes, from, 2), length = word & 63;
            from += 2;
            if (length == 63) {
                length = Number(bytes, from, 4);
                from += 4;
            }
            ASSERT_LE(from + length, to);
            ended = word >> 6 == 0;
            Judge(word >> 6, from, length, &depths);
            from += length;
        }
        EXPECT_TRUE(ended);
    }

    int frames = 0;

private:
    void Judge(U32 code, size_t body, U32 length, std::set<U32>* depths)
    {
        if (code == 1)
            frames++;
        if (code == 2 || code == 22 || code == 32 || code == 39)
            Define(code, body, length);
        if (code == 4)
            Place(Number(bytes, body, 2), Number(bytes, body + 2, 2), depths);
        if (code == 26 && (bytes[body] & 1) == 0)
            Place(Number(bytes, body + 3, 2), Number(bytes, body + 1, 2), depths);
        if (code == 26)
            Expect(depths->count(Number(bytes, body + 1, 2)), "a move of nothing at ", body);
        if (code == 5 || code == 28)
            Expect(depths->erase(Number(bytes, body + (code == 5 ? 2 : 0), 2)),
                   "a removal of nothing at ", body);
    }

    static void Expect(size_t found, const char* fault, size_t where)
    {
        EXPECT_EQ(1u, found) << fault << where;
    }

    void Define(U32 code, size_t body, U32 length)
    {
        U32 id = Number(bytes, body, 2);
        EXPECT_TRUE(known.insert(id).second) << "character " << id << " is defined twice";
        if (code != 39)
            return;
        int outer = frames;
        Walk(body + 4, body + length);
        EXPECT_EQ(U32(frames), Number(bytes, body + 2, 2)) << "frames of sprite " << id;
        frames = outer;
    }

    void Place(U32 id, U32 depth, std::set<U32>* depths)
    {
        EXPECT_TRUE(known.count(id)) << "character " << id << " is placed before its definition";
        EXPECT_TRUE(depths->insert(depth).second) << "depth " << depth << " is taken";
    }

    const std::vector<U8>& bytes;
    std::set<U32> known;
};

} // namespace

// Also catches a machine or compiler on which the pictures would come out otherwise.
TEST(Samples, RegenerateToTheCommittedBytes)
{
    for (const Sample& sample : kSamples) {
        std::string path = std::string(VEXEL_SOURCE_DIR "/samples/") + sample.name + ".vxm";
        std::vector<U8> committed = ReadFile(path), made = sample.make();
        EXPECT_LT(made.size(), 60000u) << sample.name;
        EXPECT_TRUE(committed == made) << sample.name << ": run make_samples samples";
    }
}

TEST(Samples, KeepTheRulesOfATimeline)
{
    for (const Sample& sample : kSamples) {
        SCOPED_TRACE(sample.name);
        std::vector<U8> movie = sample.make();
        ASSERT_EQ(movie.size(), Number(movie, 4, 4));
        size_t rectBytes = (5 + 4 * (movie[8] >> 3) + 7) / 8;
        EXPECT_EQ(U32(sample.frames), Number(movie, 10 + rectBytes, 2));
        Auditor auditor(movie);
        auditor.Walk(12 + rectBytes, movie.size());
        EXPECT_EQ(sample.frames, auditor.frames);
    }
}
