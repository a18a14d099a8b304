// MovieData: the bytes of one movie, for all who read them, on either thread.
#pragma once

#include "core/sound/sound_channel.h"

// The block of a movie's bytes with how much of it has come, counted: the loaders that play it, the
// channels whose sounds lie in it and the readers of its streams hold it. The loader writes bytes
// beyond the published length only; what lies below stays as it is, so that the audio thread reads
// there while more arrives. References are dropped on the player's thread, and so it dies there.
class MovieData final : public CSoundHolder {
public:
    // Room for `size` bytes, all zero, and one zero byte more, with one reference; null when there
    // is no memory, or the limit on the bytes of all movies is exhausted.
    static MovieData* Create(S32 size);

    // --- the player's thread ---
    U8* Bytes() { return bytes; }
    // Bytes below `count` are there, and frames up to that index.
    void Publish(S32 count, S32 lastFrame);
    // Nothing more arrives, complete or not.
    void Close() { closed.store(true, std::memory_order_release); }

    // --- any thread ---
    void AddRef() override { references.fetch_add(1, std::memory_order_relaxed); }
    // The player's thread only.
    void Release() override;
    // How many bytes are there. To be asked after NothingMore, which is about the time before.
    S32 Arrived() const { return arrived.load(std::memory_order_acquire); }
    bool NothingMore() const { return closed.load(std::memory_order_acquire) || Arrived() >= size; }
    bool HasFrame(S64 frame) const { return frames.load(std::memory_order_acquire) >= frame; }

private:
    MovieData() = default;
    ~MovieData();
    MovieData(const MovieData&) = delete;
    MovieData& operator=(const MovieData&) = delete;

    U8* bytes = nullptr; // owned
    S32 size = 0;        // when complete
    std::atomic<S32> references{1};
    std::atomic<S32> arrived{0};
    std::atomic<S32> frames{-1}; // index of the last frame that is all there
    std::atomic<bool> closed{false};
};
