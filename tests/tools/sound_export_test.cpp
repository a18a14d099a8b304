// What the program writes and tells of sound.
#include "tests/tools/tool.h"

#include <cmath>

namespace {

constexpr size_t kHead = 44;
constexpr size_t kLength = 12 * 4410; // frames of sound in Tones()

std::vector<S16> Tone(size_t from, size_t samples)
{
    std::vector<S16> tone;
    for (size_t i = from; i < from + samples; i++)
        tone.push_back(S16(std::lround(10000 * std::sin(2 * M_PI * 1000 * double(i) / 44100))));
    return tone;
}

ByteWriter Pcm(const std::vector<S16>& samples, ByteWriter head = {})
{
    for (const S16 sample : samples)
        head.PutU16(U16(sample));
    return head;
}

// Twelve frames, 10 a second, in which 1 kHz is heard at 10000 of 32767 for 8820 samples: an event
// sound started by frame 8 (700 ms), or a stream of two blocks from frame 3 on (200 ms).
std::vector<U8> Tones(bool stream)
{
    MovieWriter m(31 * 20, 21 * 20, Fps(10));
    m.Raw(kTagSoundStreamHead, ByteWriter().PutU16(0x0E0E).PutU16(4410));
    const ByteWriter head = ByteWriter().PutU16(1).PutU8(14).PutU32(8820);
    m.Raw(kTagDefineSound, Pcm(Tone(0, 8820), head)).Show(2);
    for (size_t i = 0; i < 2; i++) {
        if (stream)
            m.Raw(kTagSoundStreamBlock, Pcm(Tone(4410 * i, 4410)));
        m.Show();
    }
    m.Show(3);
    if (!stream)
        m.Raw(kTagStartSound, ByteWriter().PutU16(1).PutU8(0));
    m.Show(5).End();
    return m.Bytes();
}

// The sound of a movie in which the tone, in both channels, begins at that frame of it, and rises
// from silence for so many.
std::string Heard(size_t start, int rise)
{
    std::vector<S16> frames(2 * kLength);
    const std::vector<S16> tone = Tone(0, 8820);
    for (int i = 0; i < 8820; i++)
        frames[2 * (start + i)] = frames[2 * (start + i) + 1] =
            i < rise ? S16(tone[i] * i >> 11) : tone[i];
    const std::vector<U8> bytes = Pcm(frames).Bytes();
    return {bytes.begin(), bytes.end()};
}

// A sound begins with the mixer's buffer (2048 frames) during which its frame comes up: 700 ms are
// in the 16th, 200 ms in the 5th. A stream that begins late fades in during its first buffer.
TEST_F(Tool, WritesSound)
{
    for (const bool stream : {false, true}) {
        Write("../m", Tones(stream));
        const std::string head(
            "RIFF\x04\x3b\x03\0WAVEfmt \x10\0\0\0\1\0\2\0\x44\xac\0\0\x10\xb1\2\0"
            "\4\0\x10\0data\xe0\x3a\x03\0",
            kHead);
        const std::string want = head + (stream ? Heard(4 * 2048, 2048) : Heard(15 * 2048, 0));
        EXPECT_EQ("", Run("render ../m -o x.wav").err);
        EXPECT_TRUE(want == Read("x.wav")) << stream;
        EXPECT_TRUE(want == Shell("cat ../m | $vexel render - -o - --format wav").out) << stream;
        EXPECT_TRUE(want.substr(kHead + 4 * 17640, 4 * 22050) ==
                    Run("render ../m -o - --format wav --frames 5-9").out.substr(kHead));
        EXPECT_TRUE(want.substr(kHead, 4 * 48730) ==
                    Run("render ../m -o - --format wav --duration 1.105").out.substr(kHead));
        if (Shell("command -v ffmpeg").code != 0)
            continue;
        EXPECT_EQ("", Run("render ../m -o x.mkv").err);
        EXPECT_TRUE(want.substr(kHead) == Shell("ffmpeg -v error -i x.mkv -f s16le -").out);
    }
    const std::string probe =
        "; ffprobe -v error -show_entries stream=codec_type -of csv=p=0 x.mkv";
    const bool skip = Shell("command -v ffprobe").code != 0;
    EXPECT_EQ(skip ? "" : "video\naudio\n", Shell(skip ? ":" : ":" + probe).out);
    MovieWriter silent(620, 420, Fps(10));
    silent.Show(3).End();
    Write("../m", silent.Bytes());
    EXPECT_EQ(skip ? "" : "video\n", Shell(skip ? ":" : "$vexel render ../m -o x.mkv" + probe).out);
    EXPECT_TRUE(std::string(4 * 3 * 4410, '\0') ==
                Run("render ../m -o - --format wav").out.substr(kHead));
    EXPECT_EQ(1, Run("render ../m -o /dev/full --format wav").code);
    const Outcome cut = Shell("head -c -3 ../m >../n; $vexel render ../n -o y.wav || ls *y*");
    EXPECT_EQ(0u, cut.err.find("vexel: ../n: truncated: 2 of 3 frames")) << cut.err;
    EXPECT_EQ("", cut.out);
}

} // namespace
