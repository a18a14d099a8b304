// What a text field of 60,000 characters costs: milliseconds of the processor on the average and at
// worst, and how often the heap was asked. Nothing here passes or fails.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <ctime>
#include <string>

#include "core/display/edit_text.h"
#include "core/text/field_record.h"
#include "platform/headless/native_player.h"
#include "tests/support/allocation_counter.h"
#include "tests/support/glyph_writer.h"

namespace {

constexpr U32 kLength = 60000;
constexpr S32 kTenLines = 2 * 40 + 10 * 280; // twips, for a font of 12 pixels

// Words of one to nine letters in one paragraph, or one endless word.
std::string Prose(U32 length, bool words = true)
{
    std::string text;
    U32 noise = 1, word = 1;
    while (text.size() < length) {
        noise = noise * 1664525 + 1013904223;
        const bool space = words && --word == 0;
        word = space ? 2 + (noise >> 24) % 9 : word;
        text += space ? ' ' : char('a' + (noise >> 24) % 26);
    }
    return text;
}

// A player of 640 x 480 pixels with a field that is bound to "v", of which many may stand there.
class FieldScene {
public:
    explicit FieldScene(const std::string& text, S32 height = kTenLines, int count = 1)
        : player(640, 480)
    {
        MovieWriter movie(640 * 20, 480 * 20, Fps(10));
        FieldText field;
        field.box = {0, 600 * 20, 0, height};
        field.flags = kFieldFont | kFieldColor | kFieldMultiline | kFieldWrap | kFieldText;
        field.height = 240;
        field.variable = "v";
        field.text = text;
        movie.Raw(kTagDefineEditText, FieldBody(2, field));
        for (int i = 1; i <= count; i++)
            movie.Place(2, U16(i), Mat::Translate(400, 400));
        movie.Show().End();
        const std::vector<U8> bytes = movie.Bytes();
        player.Feed(bytes.data(), bytes.size());
        player.EndOfData();
        player.Picture();
    }
    SObject* Object() { return player.scene.FindChild(player.rootObject, 1); }
    EditText* Field() { return Object()->editText; }
    void Set(const char* name, const char* value) { player.SetVariable(&player, name, value, 1); }

    NativePlayerWnd player;
};

double ProcessorSeconds()
{
    timespec t;
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &t);
    return double(t.tv_sec) + double(t.tv_nsec) * 1e-9;
}

// Times `step` and, untimed, undoes it after every round; both have been done once before.
template <typename Step, typename Undo> void Measure(benchmark::State& state, Step step, Undo undo)
{
    double worst = 0;
    S64 allocations = 0;
    step(), undo(), step(), undo();
    for (auto _ : state) {
        const int before = gAllocations;
        const double start = ProcessorSeconds();
        step();
        const double seconds = ProcessorSeconds() - start;
        allocations += gAllocations - before;
        state.SetIterationTime(seconds);
        worst = std::max(worst, seconds);
        undo();
    }
    state.counters["worst_ms"] = worst * 1000;
    state.counters["allocations"] = double(allocations) / double(state.iterations());
}

void Nothing() {}

// The whole way from the key to the picture, or with no height all but painting it.
// `place` is how far into the text, in halves.
void Type(benchmark::State& state, int place, bool words, S32 height)
{
    FieldScene s(Prose(kLength, words), height > 0 ? height : kTenLines);
    const auto key = [&](int code) {
        if (!s.player.HandleKeyDown(code, 0))
            state.SkipWithError("no field has the focus");
    };
    s.player.MouseDown(30, 30);
    s.player.MouseUp(30, 30);
    const U32 at = kLength / 2 * U32(place);
    s.Field()->Select(at, at);
    if (height == 0)
        s.player.StopPainting();
    s.player.UpdateScreen();
    Measure(
        state, [&] { key('x'); }, [&] { key(8); });
    if (s.Field()->Length() != kLength || s.Field()->Caret() != at)
        state.SkipWithError("the text is not what it should be");
}

// Ten lines out of many, or as much of the text as ten lines hold.
void Repaint(benchmark::State& state, bool whole)
{
    std::string text = Prose(kLength);
    FieldScene s(text);
    for (U32 length = 2000; !whole && s.Field()->MaxScroll() > 1; length--)
        s.Set("v", (text = text.substr(0, length)).c_str());
    Measure(
        state, [&] { s.Object()->Modify(), s.player.UpdateScreen(); }, Nothing);
}

void Scroll(benchmark::State& state)
{
    FieldScene s(Prose(kLength));
    const auto to = [&s](const char* line) { s.Set("v.scroll", line), s.player.UpdateScreen(); };
    Measure(
        state, [&] { to("101"); }, [&] { to("100"); });
    if (s.Field()->Scroll() != 100)
        state.SkipWithError("the field does not scroll");
}

// A script gives the fields another text, or the one that they have; nothing is painted.
void SetVariable(benchmark::State& state, int fields, bool other)
{
    std::string text = Prose(kLength);
    FieldScene s(text, kTenLines, fields);
    const std::string first = text;
    text.back() = other ? '!' : text.back();
    Measure(
        state, [&] { s.Set("v", text.c_str()); }, [&] { s.Set("v", first.c_str()); });
}

// From nothing to the lines, and to the picture.
void Place(benchmark::State& state, bool words)
{
    FieldScene s(Prose(kLength, words));
    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix;
    info.character = s.player.FindCharacter(2);
    info.depth = 1;
    s.player.scene.RemoveObject(s.player.rootObject, 1);
    Measure(
        state, [&] { s.player.scene.PlaceObject(s.player.rootObject, &info); },
        [&] { s.player.scene.RemoveObject(s.player.rootObject, 1); });
}

template <typename Run, typename... Args> void Register(const char* name, Run run, Args... args)
{
    benchmark::RegisterBenchmark(name, run, args...)
        ->Unit(benchmark::kMillisecond)
        ->UseManualTime();
}

} // namespace

int main(int argc, char** argv)
{
    constexpr S32 kAllLines = 440 * 20;
    Register("type/at_the_end", Type, 2, true, kTenLines);
    Register("type/in_the_middle", Type, 1, true, kTenLines);
    Register("type/at_the_start", Type, 0, true, kTenLines);
    Register("type/at_the_end_30_lines", Type, 2, true, kAllLines);
    Register("type/at_the_end_unpainted", Type, 2, true, 0);
    Register("type/in_the_middle_unpainted", Type, 1, true, 0);
    Register("type/at_the_start_unpainted", Type, 0, true, 0);
    Register("type/at_the_start_of_one_word_unpainted", Type, 0, false, 0);
    Register("repaint/ten_of_many_lines", Repaint, true);
    Register("repaint/ten_lines", Repaint, false);
    Register("set/equal_1_field", SetVariable, 1, false);
    Register("set/other_end_1_field", SetVariable, 1, true);
    Register("set/equal_100_fields", SetVariable, 100, false);
    Register("set/other_end_100_fields", SetVariable, 100, true);
    Register("scroll/by_a_line", Scroll);
    Register("place/words", Place, true);
    Register("place/one_word", Place, false);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
