#include "tests/support/sound_writer.h"

#include <sstream>

std::vector<U8> SoundMovie(const std::string& words, U16 samples, U8 format, int times)
{
    MovieWriter movie(2000, 2000, Fps(10));
    movie.Raw(18, ByteWriter().PutU16(format * 0x101u).PutU16(samples).PutU16(1105));
    const std::vector<U8> sound = {14, 1, 0, 0, 0}, none;
    for (int turn = 1; turn <= times; turn++) {
        std::istringstream in(words);
        for (std::string word; in >> word;) {
            int a = turn, b = 0;
            std::sscanf(&word[1], "%d,%d", &a, &b);
            ByteWriter body;
            if (word[0] == 'b' && format == 30)
                body.UB(2, 0).SB(16, a).UB(6, 0);
            else
                body.PutU16(U32(a)).PutBytes(word[0] == 'd' ? sound : none).PutU16(U32(b));
            constexpr int kTags[] = {1, 19, 19, 14, 15, 3};
            movie.Raw(kTags[std::string("/bmdsf").find(word[0])], body);
        }
    }
    movie.End();
    return movie.Bytes();
}
