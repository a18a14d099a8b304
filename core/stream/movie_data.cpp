#include "core/stream/movie_data.h"

#include <cstdlib>
#include <new>

MovieData* MovieData::Create(S32 size)
{
    MovieData* data = new (std::nothrow) MovieData;
    if (!data)
        return nullptr;
    data->size = size;
    data->bytes = static_cast<U8*>(std::calloc(static_cast<size_t>(size) + 1, 1));
    if (data->bytes)
        return data;
    data->Release();
    return nullptr;
}

MovieData::~MovieData()
{
    std::free(bytes);
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
