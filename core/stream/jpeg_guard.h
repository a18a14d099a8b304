// JpegGuard: keeps libjpeg from running on after a fatal error. The library expects that its error
// handler never returns; this one leaves the work that was going on. It is the only place that
// jumps, and written in C, because what lies between (frames of libjpeg and of the work) is left
// without destructors.
#pragma once

#include <setjmp.h>
#include <stddef.h>
#include <stdio.h>

#include <jpeglib.h>

#ifdef __cplusplus
extern "C" {
#endif

struct JpegGuard {
    struct jpeg_error_mgr errors; // first: libjpeg hands back its address
    jmp_buf leave;
};

// Sets up the silent error manager and returns it, for a decoder's `err`. Warnings are only
// counted, over the decoder's whole life; too many of them are a fatal error.
struct jpeg_error_mgr* JpegGuardInit(struct JpegGuard* guard);

// Runs work(arg), which uses the decoder: 1 when it came to its end, 0 when a fatal error ended it.
// Nothing on the stack of the work may need a destructor. Not for work inside work.
int JpegGuardRun(struct JpegGuard* guard, void (*work)(void* arg), void* arg);

#ifdef __cplusplus
}
#endif
