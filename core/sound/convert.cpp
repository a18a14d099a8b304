#include "core/sound/convert.h"

namespace {

// From the end backwards, so that no frame is overwritten before it has been read.
template <typename T> void RateMul2(T* samples, S32 frames, S32 channels, const T* previous)
{
    for (S32 i = frames - 1; i >= 0; i--) {
        for (S32 c = channels - 1; c >= 0; c--) {
            const S32 sample = samples[i * channels + c];
            const S32 before = i > 0 ? samples[(i - 1) * channels + c] : previous[c];
            samples[(2 * i + 1) * channels + c] = T(sample);
            samples[2 * i * channels + c] = T((before + sample) >> 1);
        }
    }
}

template <typename T> void RateDiv2(T* samples, S32 frames, S32 channels)
{
    for (S32 i = 0; i < frames / 2; i++) {
        for (S32 c = 0; c < channels; c++) {
            const S32 first = samples[2 * i * channels + c];
            const S32 second = samples[(2 * i + 1) * channels + c];
            samples[i * channels + c] = T((first + second) >> 1);
        }
    }
}

// Returns the number of frames at the new rate.
template <typename T> S32 ChangeRate(T* samples, U8 from, U8 to, S32 frames, const void* previous)
{
    const S32 channels = SoundChannels(from);
    int doublings = SoundRateShift(from) - SoundRateShift(to);
    for (; doublings > 0; doublings--) {
        RateMul2(samples, frames, channels, static_cast<const T*>(previous));
        frames *= 2;
    }
    for (; doublings < 0; doublings++) {
        RateDiv2(samples, frames, channels);
        frames /= 2;
    }
    return frames;
}

void Widen(void* block, S32 count)
{
    const U8* bytes = static_cast<const U8*>(block);
    S16* samples = static_cast<S16*>(block);
    for (S32 i = count - 1; i >= 0; i--)
        samples[i] = S16((bytes[i] - 128) * 256);
}

void Narrow(void* block, S32 count)
{
    U8* bytes = static_cast<U8*>(block);
    const S16* samples = static_cast<const S16*>(block);
    for (S32 i = 0; i < count; i++)
        bytes[i] = U8((samples[i] >> 8) + 128);
}

template <typename T> void ToStereo(T* samples, S32 frames)
{
    for (S32 i = frames - 1; i >= 0; i--)
        samples[2 * i] = samples[2 * i + 1] = samples[i];
}

template <typename T> void ToMono(T* samples, S32 frames)
{
    for (S32 i = 0; i < frames; i++)
        samples[i] = T((samples[2 * i] + samples[2 * i + 1]) >> 1);
}

template <typename T> void ChangeChannels(T* samples, U8 from, U8 to, S32 frames)
{
    if (SoundChannels(from) < SoundChannels(to))
        ToStereo(samples, frames);
    else if (SoundChannels(from) > SoundChannels(to))
        ToMono(samples, frames);
}

// A level on a straight line at positions a fixed step apart: from + span * offset / width toward
// `from`, carried from frame to frame as quotient and remainder, which is exact without a division
// for each.
class Level {
public:
    Level(S32 from, S32 to, U32 width, U32 offset, U32 step) : start(from), denominator(width)
    {
        falls = to < from;
        if (width == 0)
            return;
        const U64 span = U64(falls ? from - to : to - from);
        quotient = S32(span * offset / width);
        remainder = span * offset % width;
        quotientStep = S32(span * step / width);
        remainderStep = span * step % width;
    }

    S32 Next()
    {
        const S32 level = falls ? start - quotient : start + quotient;
        quotient += quotientStep;
        remainder += remainderStep;
        if (remainder >= denominator && denominator != 0) {
            remainder -= denominator;
            quotient++;
        }
        return level;
    }

private:
    S32 start;
    U64 denominator;
    bool falls = false;
    S32 quotient = 0, quotientStep = 0;
    U64 remainder = 0, remainderStep = 0;
};

U8 Scale(U8 sample, S32 level)
{
    const S32 scaled = (((sample - 128) * level) >> 15) + 128;
    return U8(scaled < 0 ? 0 : scaled > 255 ? 255 : scaled);
}

// The product of a 16-bit sample and a 16-bit level fits 32 bits.
S16 Scale(S16 sample, S32 level)
{
    const S32 scaled = (sample * level) >> 15;
    return S16(scaled < -32768 ? -32768 : scaled > 32767 ? 32767 : scaled);
}

template <typename T> void ApplyRamp(T* samples, S32 frames, S32 channels, const SSoundRamp& ramp)
{
    const U32 width = ramp.to.position - ramp.from.position;
    Level left(ramp.from.left, ramp.to.left, width, ramp.offset, ramp.step);
    Level right(ramp.from.right, ramp.to.right, width, ramp.offset, ramp.step);
    if (channels == 1) {
        for (S32 i = 0; i < frames; i++)
            samples[i] = Scale(samples[i], (left.Next() + right.Next()) >> 1);
        return;
    }
    for (S32 i = 0; i < frames; i++) {
        samples[2 * i] = Scale(samples[2 * i], left.Next());
        samples[2 * i + 1] = Scale(samples[2 * i + 1], right.Next());
    }
}

// The piece of the envelope in which a position lies. Corners out of order are nothing to fear:
// between the first and the last position some pair of neighbours holds it.
SSoundRamp RampAt(const SEnvelopePoint* points, S32 numPoints, U64 position)
{
    const SEnvelopePoint& last = points[numPoints - 1];
    if (position < points[0].position)
        return {points[0], points[0], 0, 0};
    if (position >= last.position)
        return {last, last, 0, 0};
    S32 i = 0;
    while (points[i].position > position || position >= points[i + 1].position)
        i++;
    return {points[i], points[i + 1], U32(position - points[i].position), 0};
}

// How many frames from `position` on lie before the next corner, and so in one piece.
S32 FramesInPiece(const SEnvelopePoint* points, S32 numPoints, U64 position, U32 step, S32 frames)
{
    const U64 whole = position + U64(frames) * step;
    U64 end = whole;
    for (S32 i = 0; i < numPoints; i++)
        if (points[i].position > position && points[i].position < end)
            end = points[i].position;
    return end == whole ? frames : S32((end - position + step - 1) / step);
}

} // namespace

void Cvt8RateMul2(U8* samples, S32 frames, S32 channels, const U8* previous)
{
    RateMul2(samples, frames, channels, previous);
}

void Cvt16RateMul2(S16* samples, S32 frames, S32 channels, const S16* previous)
{
    RateMul2(samples, frames, channels, previous);
}

void Cvt8RateDiv2(U8* samples, S32 frames, S32 channels)
{
    RateDiv2(samples, frames, channels);
}

void Cvt16RateDiv2(S16* samples, S32 frames, S32 channels)
{
    RateDiv2(samples, frames, channels);
}

S32 ConvertSound(void* block, U8 from, U8 to, S32 frames, const void* previous)
{
    const bool wasWide = from & kSound16Bit;
    const bool wide = to & kSound16Bit;
    U8* bytes = static_cast<U8*>(block);
    S16* words = static_cast<S16*>(block);
    frames = wasWide ? ChangeRate(words, from, to, frames, previous)
                     : ChangeRate(bytes, from, to, frames, previous);
    if (wide && !wasWide)
        Widen(block, frames * SoundChannels(from));
    else if (wasWide && !wide)
        Narrow(block, frames * SoundChannels(from));
    if (wide)
        ChangeChannels(words, from, to, frames);
    else
        ChangeChannels(bytes, from, to, frames);
    return frames;
}

void ApplyRamp8(U8* samples, S32 frames, S32 channels, const SSoundRamp& ramp)
{
    ApplyRamp(samples, frames, channels, ramp);
}

void ApplyRamp16(S16* samples, S32 frames, S32 channels, const SSoundRamp& ramp)
{
    ApplyRamp(samples, frames, channels, ramp);
}

void ApplyEnvelope(void* block, U8 format, S32 frames, const SEnvelopePoint* points, S32 numPoints,
                   U64 position)
{
    if (numPoints <= 0)
        return;
    const U32 step = 1u << SoundRateShift(format);
    const S32 channels = SoundChannels(format);
    for (S32 done = 0; done < frames;) {
        SSoundRamp ramp = RampAt(points, numPoints, position);
        ramp.step = step;
        const S32 run = FramesInPiece(points, numPoints, position, step, frames - done);
        if (format & kSound16Bit)
            ApplyRamp16(static_cast<S16*>(block) + done * channels, run, channels, ramp);
        else
            ApplyRamp8(static_cast<U8*>(block) + done * channels, run, channels, ramp);
        done += run;
        position += U64(run) * step;
    }
}
