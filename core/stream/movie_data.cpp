#include "core/stream/movie_data.h"

#include <cstdlib>
#include <new>

#include "core/player/limits.h"

namespace {
size_t liveBytes = 0; // of all movies; the player's thread only
} // namespace

MovieData* MovieData::Create(S32 size)
{
    const size_t count = static_cast<size_t>(size);
    if (count > gLimits.allMovieBytes || liveBytes > gLimits.allMovieBytes - count)
        return nullptr;
    MovieData* data = new (std::nothrow) MovieData;
    if (!data)
        return nullptr;
    data->size = size;
    liveBytes += count;
    data->bytes = static_cast<U8*>(std::calloc(count + 1, 1));
    if (data->bytes)
        return data;
    data->Release();
    return nullptr;
}

MovieData::~MovieData()
{
    std::free(bytes);
    liveBytes -= static_cast<size_t>(size);
}

void MovieData::Release()
{
    if (references.fetch_sub(1, std::memory_order_acq_rel) == 1)
        delete this;
}

void MovieData::Publish(S32 count, S32 lastFrame)
{
    frames.store(lastFrame, std::memory_order_release);
    arrived.store(count, std::memory_order_release);
}
