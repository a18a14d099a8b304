// ScriptPlayer: one loaded movie: its bytes as they arrive, its header, its character dictionary,
// and its root timeline.
#pragma once

#include "core/geom/chunk_alloc.h"
#include "core/geom/grow_buffer.h"
#include "core/geom/rect.h"
#include "core/stream/character.h"
#include "core/stream/script_thread.h"

class MovieData;
struct StreamData;

// Errors kept in scriptErr; final until ClearScript.
enum SScriptError : S32 { kErrNone = 0, kErrBadHeader = -1, kErrNoMemory = -2 };

// The movie buffer is allocated once at the declared length, zeroed, with one zero byte more, and
// never moves: names, labels and character bodies point into it. Blocks of any size are pushed as
// they arrive. How they were cut makes no difference, with one exception: the header is read when
// 21 bytes are there, and of a frame rectangle wider than 9 bytes what is then still missing reads
// as 0. Player thread only.
class ScriptPlayer : public ScriptThread {
public:
    // numFramesComplete of a movie that is all there.
    static constexpr S32 kAllFrames = 16000;
    static constexpr int kChains = 128;
    static constexpr int kIdsPerPage = 256;
    static constexpr int kIdPages = 65536 / kIdsPerPage;

    ScriptPlayer* nextLayer = nullptr; // link of the player's levels
    char* sourceName = nullptr;        // owned; where the movie came from
    S32 scriptLen = -1;                // declared length; -1 while the header has not arrived
    MovieData* sharedScript = nullptr; // the bytes, counted; null while there are none
    S32 headerBytes = 0;               // of the first 8 bytes, how many have arrived
    U8 header[8] = {};
    bool gotHeader = false;     // frame rectangle, rate and count are known
    S32 numFramesComplete = -1; // index of the last frame that is all there; kAllFrames at the end
    S32 scanPos = 0;            // first tag not yet counted
    SRECT frame = {0, 1440, 0, 1440}; // twips
    S32 frameRate = 0;                // frames a second, 16.16
    S32 frameDelay = 0;               // milliseconds
    U32 version = 0;
    const U8* jpegInfo = nullptr; // body of the tag with the shared JPEG tables; null: none yet
    S32 jpegInfoLen = 0;
    bool retryImage = false;      // the image tried last lacked room or tables: it may be had later
    StreamData* stream = nullptr; // the stream that feeds this movie
    bool varsMode = false;        // the stream carries variables, not a movie
    S32 varsLayer = -1;           // level that receives them
    char* varsTarget = nullptr;   // owned; path that receives them
    bool sharedCopy = false;      // a clone that plays another loader's buffer

    ScriptPlayer();
    ~ScriptPlayer() override;

    // Appends a block. After an error, and beyond the declared length, bytes are ignored.
    void PushDataBuf(const U8* data, S32 n);
    // For the player's own movie, after each block: shows the first frame once it is there.
    void PushDataComplete();
    // The stream has ended. A loader of variables delivers them and is gone.
    void SetDataComplete();
    // The text that a loader of variables has so far, valid until more arrives; null when memory is
    // exhausted.
    const char* VariablesText();

    // Drops the movie and all that came of it; ready for another. A movie shown in a sprite's place
    // belongs to its object, which goes: the caller has the movie from then on.
    void ClearScript();
    // Drops the root object and the dictionary, and rewinds; the bytes stay, so that the movie can
    // run again. Objects elsewhere that show characters of this movie (clones of its sprites, for
    // example) stay where they are, but empty; see DisplayList::ForgetMovie.
    void FreeAll();
    // Drops decoded pixels that nobody uses, and empty pool blocks; images that could not be
    // decoded are tried again when they are next wanted.
    void FreeCache();

    // Creates the pixels of a bitmap of this movie, all zero, for whoever decodes it; see
    // SBitmapCore::PICreate. False, and no pixels, when they fail, when the movie's budget does not
    // allow them even without the pixels that nobody uses, or when enough has been decoded for one
    // repaint.
    bool CreatePixels(SCharacter* ch, int format, S32 width, S32 height, const SColorTable* ctab);
    // Counts pixels that are decoded as work of whoever runs now.
    void ChargePixels(U64 pixels);
    // Frees a bitmap's pixels, if there are any.
    void DropPixels(SCharacter* ch);

    // A zeroed entry of type kCharNone, or null when the id is taken or memory is exhausted.
    SCharacter* CreateCharacter(U16 id);
    SCharacter* FindCharacter(U16 id);
    void FreeCharacter(U16 id);
    // Frees an entry of this movie that is out of the dictionary already, now or with its last
    // user.
    void FreeCharacter(SCharacter* ch);
    // A zeroed record of type kCharNone that is in no dictionary; its last ReleaseCharacter frees
    // it. Null when memory is exhausted.
    SCharacter* NewPrivateCharacter();

    // All bytes are there.
    bool Complete() const { return scriptLen >= 0 && len >= scriptLen; }
    // Every tag of that frame is there. A movie that is still loading may have counted its way to
    // the number that stands for all, so that number says nothing here.
    bool FrameAvailable(S32 n) const { return Complete() || n <= numFramesComplete; }
    // First byte after the movie's readable memory, as an index into `script`.
    S32 DataLimit() const { return scriptLen < 0 ? 0 : scriptLen; }
    // Bytes of `p`, a pointer into the buffer, up to its end; 0 for a foreign pointer.
    S32 BytesFrom(const U8* p) const;
    // Frames whose ShowFrame is there, counted by walking the tags.
    S32 CountFrames() const;

    SCharacter* charIndex[kChains] = {}; // by the low 7 bits of the id: for walks over all
    ChunkAlloc charAlloc;

private:
    friend void ReleaseCharacter(SCharacter* ch);

    bool CollectHeader(const U8*& data, S32& n);
    S32 StartMovie();
    void ParseHeader();
    void CountCompleteFrames();
    void ReleaseBuffer();
    void PushVariables(const U8* data, S32 n);
    void LeaveStream();
    bool IndexCharacter(U16 id, SCharacter* ch);
    void FreeIdPages();
    void StopPlaying(const SCharacter* ch);
    void DestroyCharacter(SCharacter* ch);
    bool HasRoomFor(U64 pixels) const;
    void DropUnusedPixels();
    void MakeRoom();
    void RemoveRootObject();

    // By the high byte of the id, then by the low one: a chain may grow to 512 records, too many to
    // walk for each tag. A page is made with its first character.
    SCharacter** idPages[kIdPages] = {};
    GrowBuffer<U8> varsData; // bytes of a variables stream
    U32 characterCount = 0;  // records of the pool in use
    U64 livePixels = 0;      // cost of the bitmaps that have some
};

// A user of a character's record: a pointer that must stay valid.
void RetainCharacter(SCharacter* ch);
// Lets go of it; an orphan's last release frees it. Null is allowed.
void ReleaseCharacter(SCharacter* ch);
