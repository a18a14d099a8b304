#include "core/stream/jpeg_guard.h"

#include <string.h>

// Of a sound image there are none, of a broken one a few; an image of noise has one a block.
enum { kMaxWarnings = 10000 };

static void Leave(j_common_ptr decoder)
{
    longjmp(((struct JpegGuard*)decoder->err)->leave, 1);
}

static void Count(j_common_ptr decoder, int level)
{
    if (level < 0 && ++decoder->err->num_warnings > kMaxWarnings)
        Leave(decoder);
}

static void SayNothing(j_common_ptr decoder)
{
    (void)decoder;
}

static void FormatNothing(j_common_ptr decoder, char* buffer)
{
    (void)decoder;
    buffer[0] = 0;
}

struct jpeg_error_mgr* JpegGuardInit(struct JpegGuard* guard)
{
    memset(guard, 0, sizeof *guard);
    guard->errors.error_exit = Leave;
    guard->errors.emit_message = Count;
    guard->errors.output_message = SayNothing;
    guard->errors.format_message = FormatNothing;
    guard->errors.reset_error_mgr = SayNothing;
    return &guard->errors;
}

int JpegGuardRun(struct JpegGuard* guard, void (*work)(void* arg), void* arg)
{
    if (setjmp(guard->leave))
        return 0;
    work(arg);
    return 1;
}
