// A player that has warmed up takes no memory from the system, whatever its movie does.
#include <cstdlib>
#include <fstream>
#include <iterator>

#include "core/text/field_record.h"
#include "tests/display/scene.h"
#include "tests/support/glyph_writer.h"

// The sanitizers bring their own allocator, which cannot be counted from here.
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define __SANITIZE_ADDRESS__ 1
#endif
#endif
#if defined(__GLIBC__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
static int gAllocations = 0;

// These stand before the C library's own; operator new comes here too.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* old, size_t size);

void* malloc(size_t size) noexcept
{
    gAllocations++;
    return __libc_malloc(size);
}

void* calloc(size_t count, size_t size) noexcept
{
    gAllocations++;
    return __libc_calloc(count, size);
}

void* realloc(void* old, size_t size) noexcept
{
    gAllocations++;
    return __libc_realloc(old, size);
}
}

static int AllocationsOf(const std::vector<U8>& movie, S32 ticks)
{
    NativePlayerWnd player(0, 0);
    player.Feed(movie.data(), movie.size());
    player.EndOfData();
    const auto play = [&player](S32 count) {
        for (; count > 0; count--)
            player.Tick();
    };
    play(player.numFrames + 1);
    EXPECT_EQ(player.curFrame, 1) << "one whole loop";
    const int before = gAllocations;
    play(ticks);
    return gAllocations - before;
}

TEST(Allocation, NoneOnceWarm)
{
    std::ifstream file(VEXEL_SOURCE_DIR "/samples/viaduct.vxm", std::ios::binary);
    const std::vector<char> movie(std::istreambuf_iterator<char>(file), {});
    EXPECT_EQ(AllocationsOf({movie.begin(), movie.end()}, 200), 0);
    MovieWriter fields(4000, 4000, Fps(10));
    fields.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 900, 0, 500},
                                                 .flags = kFieldText,
                                                 .variable = "v",
                                                 .text = "come and go"}));
    fields.Place(2, 1).Show(3).RemoveDepth(1).Show(2).End();
    EXPECT_EQ(AllocationsOf(fields.Bytes(), 40), 0);
}
#else
TEST(Allocation, NoneOnceWarm)
{
    GTEST_SKIP() << "allocations can be counted with glibc and without sanitizers only";
}
#endif
