// What the program writes and tells of sound.
#include "tests/tools/tool.h"

#include <cmath>

namespace {

// 1 kHz at 10000 of 32767, as bytes; in both channels, and rising for the first frames.
ByteWriter Tone(int from, int to, bool stereo = false, int rise = 0)
{
    ByteWriter out;
    for (int i = 2 * from; i < 2 * to; i += stereo ? 1 : 2) {
        const int sample = int(std::lround(10000 * std::sin(2 * M_PI * 1000 * (i / 2) / 44100)));
        out.PutU16(U16(i < 2 * rise ? sample * (i / 2) >> 11 : sample));
    }
    return out;
}

enum Use { kEvent, kStream, kNone };

// Twelve frames, 10 a second, in which the tone is heard for 8820 samples: an event sound started
// by frame 8 (700 ms), or a stream of two blocks from frame 3 on (200 ms), or not at all.
std::vector<U8> Tones(Use use)
{
    MovieWriter m(31 * 20, 21 * 20, Fps(10));
    const ByteWriter head = ByteWriter().PutU16(1).PutU8(14).PutU32(8820);
    m.Raw(kTagSoundStreamHead, ByteWriter().PutU16(0x0E0E).PutU16(4410));
    m.Raw(kTagDefineSound, ByteWriter(head).PutBytes(Tone(0, 8820).Bytes())).Show(2);
    for (int i = 0; i < 5; i++, m.Show())
        if (use == kStream && i < 2)
            m.Raw(kTagSoundStreamBlock, Tone(4410 * i, 4410 * i + 4410));
    if (use == kEvent)
        m.Raw(kTagStartSound, ByteWriter().PutU16(1).PutU8(0));
    m.Show(5).End();
    return m.Bytes();
}

// A sound begins with the mixer's buffer (2048 frames) during which its frame comes up: 700 ms are
// in the 16th, 200 ms in the 5th. A stream that begins late fades in during its first buffer.
TEST_F(Tool, WritesSound)
{
    const std::string head(
        "RIFF\4;\3\0WAVEfmt \x10\0\0\0\1\0\2\0D\xac\0\0\x10\xb1\2\0\4\0\x10\0data\xe0:\3\0", 44);
    const char* decode = "$vexel render ../m -o x.mkv; ffmpeg -v error -i x.mkv -f s16le -";
    const auto Sound = [&](const std::string& words) {
        return Run("render ../m -o - --format wav" + words).out.substr(44);
    };
    const bool skip = Shell("command -v ffmpeg").code != 0;
    for (const Use use : {kNone, kEvent, kStream}) {
        Write("../m", Tones(use));
        const int end = use == kNone ? 0 : 8820, rise = use == kStream ? 2048 : 0;
        const std::vector<U8> tone = Tone(0, end, true, rise).Bytes();
        std::string want(4 * 12 * 4410, '\0');
        std::copy(tone.begin(), tone.end(), want.begin() + 4 * 2048 * (use == kStream ? 4 : 15));
        EXPECT_TRUE(head + want == Shell("$vexel render ../m -o x.wav; cat x.wav").out) << use;
        EXPECT_TRUE(head + want == Shell("cat ../m | $vexel render - -o - --format wav").out);
        EXPECT_TRUE(want.substr(4 * 17640, 4 * 22050) == Sound(" --frames 5-9")) << use;
        EXPECT_TRUE(want.substr(0, 4 * 48730) == Sound(" --duration 1.105")) << use;
        EXPECT_TRUE(skip || (use == kNone ? "" : want) == Shell(decode).out) << use;
    }
    const std::string text = Run("info ../m; $vexel info ../m --json").out;
    const std::string pcm = R"("compression":"pcm","rate":44100,"bits":16,"channels":1,"samples)";
    for (const std::string& said :
         {std::string("Sound  pcm, 44100 Hz, 16 bits, mono, 8820 samples, 0.200 seconds\n"),
          std::string("\n   main  pcm, 44100 Hz, 16 bits, mono, 4410 samples a frame, 2 blocks\n"),
          pcm + R"(":8820,"seconds":0.2}],)", pcm + R"(PerFrame":4410,"blocks":2}]})"})
        EXPECT_NE(std::string::npos, text.find(said)) << said << "is not in\n" << text;
    EXPECT_EQ(1, Run("render ../m -o /dev/full --format wav").code);
    EXPECT_EQ("", Shell("head -c -3 ../m >../n; $vexel render ../n -o y.wav || ls | grep y").out);
}

} // namespace
