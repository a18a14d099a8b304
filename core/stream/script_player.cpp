// Loading: the bytes of a movie as they arrive, its header, and the frames that are all there.
#include "core/stream/script_player.h"

#include <cstdint>
#include <cstring>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/player/stream_data.h"
#include "core/stream/movie_data.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"

namespace {
constexpr S32 kHeaderBytes = 8;
// The frame rectangle, rate and count are read once more bytes than this are there, whatever the
// size of the rectangle; a wider one is completed from the zeros of the buffer.
constexpr S32 kHeaderThreshold = 20;
constexpr int kCharactersPerBlock = 32;
constexpr U32 kCharacterMark = 0x33333333;

S32 Min(S32 a, S32 b)
{
    return a < b ? a : b;
}
} // namespace

ScriptPlayer::ScriptPlayer() : charAlloc(sizeof(SCharacter), kCharactersPerBlock, 1, kCharacterMark)
{
    player = this;
    ClearScript();
}

ScriptPlayer::~ScriptPlayer()
{
    ClearScript();
    FreeStr(sourceName);
    FreeStr(varsTarget);
}

void ScriptPlayer::PushDataBuf(const U8* data, S32 n)
{
    if (scriptErr != kErrNone || !data || n <= 0)
        return;
    if (varsMode)
        return PushVariables(data, n);
    if (scriptLen < 0 && !CollectHeader(data, n))
        return;
    const S32 count = Min(n, scriptLen - len);
    std::memcpy(sharedScript->Bytes() + len, data, static_cast<size_t>(count));
    len += count;
    if (!gotHeader && len > kHeaderThreshold)
        ParseHeader();
    if (gotHeader)
        CountCompleteFrames();
    sharedScript->Publish(len, numFramesComplete);
}

// Takes the first bytes of the movie off the block, and makes the buffer when all 8 are there;
// false while they are not, or on an error.
bool ScriptPlayer::CollectHeader(const U8*& data, S32& n)
{
    const S32 count = Min(n, kHeaderBytes - headerBytes);
    std::memcpy(header + headerBytes, data, static_cast<size_t>(count));
    headerBytes += count;
    data += count;
    n -= count;
    if (headerBytes < kHeaderBytes)
        return false;
    scriptErr = StartMovie();
    return scriptErr == kErrNone;
}

// Checks the first 8 bytes and allocates the whole movie. The declared length is kept only when
// the buffer exists, so that no reader ever believes in bytes that are not there.
S32 ScriptPlayer::StartMovie()
{
    if (std::memcmp(header, "MVX", 3) != 0)
        return kErrBadHeader;
    version = header[3];
    const U32 declared = header[4] | static_cast<U32>(header[5]) << 8 |
                         static_cast<U32>(header[6]) << 16 | static_cast<U32>(header[7]) << 24;
    if (declared < kHeaderBytes || declared > static_cast<U32>(kS32Max))
        return kErrBadHeader;
    if (declared > gLimits.movieBytes)
        return kErrNoMemory;
    sharedScript = MovieData::Create(static_cast<S32>(declared));
    if (!sharedScript)
        return kErrNoMemory;
    std::memcpy(sharedScript->Bytes(), header, kHeaderBytes);
    scriptLen = static_cast<S32>(declared);
    Attach(sharedScript->Bytes(), scriptLen, kHeaderBytes);
    len = kHeaderBytes;
    return kErrNone;
}

void ScriptPlayer::ParseHeader()
{
    pos = kHeaderBytes; // a rewind while the header was arriving has moved it
    GetRect(&frame);
    const S32 rate = GetWord();
    frameRate = (rate ? rate : 1) * 256; // a rate of 0 counts as the smallest one
    frameDelay = 65536000 / frameRate;
    numFrames = GetWord();
    startPos = pos;
    scanPos = pos;
    curFrame = -1;
    label = nullptr;
    gotHeader = true;
}

void ScriptPlayer::CountCompleteFrames()
{
    if (len >= scriptLen) {
        numFramesComplete = kAllFrames;
        return;
    }
    STagWalker walker(*this, scanPos);
    for (S32 code; (code = walker.GetTag(len)) >= 0; walker.pos = walker.tagEnd) {
        scanPos = walker.tagEnd;
        if (code == kTagShowFrame)
            numFramesComplete++;
    }
}

S32 ScriptPlayer::CountFrames() const
{
    STagWalker walker(*this, startPos);
    S32 count = 0;
    if (!gotHeader)
        return 0;
    for (S32 code; (code = walker.GetTag(len)) >= 0; walker.pos = walker.tagEnd)
        count += code == kTagShowFrame;
    return count;
}

void ScriptPlayer::PushVariables(const U8* data, S32 n)
{
    const size_t held = varsData.size();
    const size_t room = gLimits.variablesBytes > held ? gLimits.variablesBytes - held : 0;
    const size_t count = static_cast<size_t>(n) < room ? static_cast<size_t>(n) : room;
    if (count > 0 && varsData.Resize(held + count))
        std::memcpy(varsData.data() + held, data, count);
}

// The zero byte at its end is not part of it.
const char* ScriptPlayer::VariablesText()
{
    const size_t held = varsData.size();
    if (!varsData.Push(0))
        return nullptr;
    varsData.Truncate(held);
    return reinterpret_cast<const char*>(varsData.data());
}

void ScriptPlayer::PushDataComplete()
{
    if (splayer != this || splayer->loaded)
        return;
    if (display)
        display->ResetBudget();
    if (DrawFrame(0, true) == kDrawn || Complete()) {
        splayer->loaded = 1;
        if (numFrames < 2 && splayer->autoQuality)
            splayer->highQuality = 1;
        splayer->StartTicks();
        splayer->DoActions();
    }
    splayer->SetCamera(2);
}

// What is missing stays missing; a streaming sound that waits for it must know.
void ScriptPlayer::SetDataComplete()
{
    if (varsMode && splayer) {
        splayer->DeliverVariables(this);
        return;
    }
    if (sharedScript)
        sharedScript->Close();
}

void ScriptPlayer::ClearScript()
{
    LeaveStream();
    Silence();
    FreeAll();
    ReleaseBuffer();
    ClearState();
    ClearVariables();
    gotHeader = false;
    headerBytes = 0;
    scriptLen = -1;
    numFramesComplete = -1;
    scanPos = 0;
    startPos = 0;
}

// The stream may be the one whose data is being delivered: it feeds nobody from here on.
void ScriptPlayer::LeaveStream()
{
    StreamData* feeding = stream;
    stream = nullptr;
    if (!feeding || !splayer)
        return;
    feeding->player = nullptr;
    splayer->CloseStream(feeding);
}

// Lets go of the bytes; the last of their holders frees them.
void ScriptPlayer::ReleaseBuffer()
{
    if (sharedScript)
        sharedScript->Release();
    sharedScript = nullptr;
    if (sharedCopy && display)
        display->clonedMovies--;
    sharedCopy = false;
    script = nullptr;
    varsData.Clear();
}

S32 ScriptPlayer::BytesFrom(const U8* p) const
{
    const auto start = reinterpret_cast<std::uintptr_t>(script);
    const auto at = reinterpret_cast<std::uintptr_t>(p);
    const auto size = static_cast<std::uintptr_t>(DataLimit());
    if (!script || at < start || at - start > size)
        return 0;
    return static_cast<S32>(size - (at - start));
}
