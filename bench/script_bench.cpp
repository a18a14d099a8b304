// Records a second: a loop that counts, one that only calculates, and one that works on texts. And
// pictures a second: clones that move themselves about. Nothing here passes or fails.
#include <benchmark/benchmark.h>

#include <string>

#include "core/player/opcodes.h"
#include "core/player/random.h"
#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"
#include "tests/support/script_writer.h"

namespace {

// The end of every loop: the variable i goes up to 0.
const std::string kCount = R"(
    "i" "i" GetVariable 1 Add SetVariable
    "i" GetVariable 0 Less If top )";

int CountRecords(const std::vector<U8>& program)
{
    const U8* end = program.data() + program.size();
    SActionRecord record = {0, nullptr, 0, program.data()};
    int count = 0;
    while (ReadActionRecord(record.next, end, &record))
        count++;
    return count;
}

// Runs a program on frame 2 of a movie that stands on frame 1, with as many rounds as one run may
// have records for.
void Run(benchmark::State& state, const std::string& round)
{
    const std::vector<U8> program = AssembleScript("top: " + round + kCount);
    const int records = CountRecords(program);
    MovieWriter movie(2000, 2000, Fps(10));
    movie.Show().DoAction(program).Show().End();
    const std::vector<U8> bytes = movie.Bytes();
    NativePlayerWnd player(64, 64);
    player.Feed(bytes.data(), bytes.size());
    const int rounds = 190000 / records;
    for (auto _ : state) {
        player.SetVariable("i", std::to_string(-rounds).c_str(), 0);
        player.CallFrame(&player, 1);
    }
    if (player.actionsAborted || player.stack.Count() > 0)
        state.SkipWithError("the script did not end as it should");
    state.counters["records_per_second"] = benchmark::Counter(
        double(state.iterations()) * rounds * records, benchmark::Counter::kIsRate);
}

void Loop(benchmark::State& state)
{
    Run(state, "");
}

void Arithmetic(benchmark::State& state)
{
    Run(state, R"(7 1 Add 3 Multiply 5 Subtract 2 Divide 9 Less Not 1 And 0 Equals Pop)");
}

void Strings(benchmark::State& state)
{
    Run(state, R"(
        "s" "item" "i" GetVariable StringAdd "/x" StringAdd SetVariable
        "s" GetVariable 1 4 StringExtract "item" StringEquals Pop
        "s" GetVariable StringLength Pop )");
}

// 1000 discs of 16 pixels at 640 x 480; each is a clone whose script moves it 1 pixel right in
// every frame, and from the right side back to the left.
std::vector<U8> ClonesMovie()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(60));
    ShapeBuilder disc;
    disc.Styles(0, disc.AddFill(Rgba{30, 110, 200, 200})).Circle(0, 0, 8 * 20);
    TagWriter ball;
    const std::vector<U8> move = AssembleScript(R"(
        "" 0 "" 0 GetProperty 1 Add SetProperty
        "" 0 GetProperty 640 Less If stay "" 0 0 SetProperty stay: )");
    movie.DefineShape(1, disc).DefineSprite(
        2, ball.Place(1, 1).DoAction(move).Show().DoAction(move).Show().End());
    movie.Place2(1, {.character = 2, .name = "ball"}).DoAction(AssembleScript(R"( "i" 0 SetVariable
        more: "ball" "c" "i" GetVariable StringAdd 16384 "i" GetVariable Add CloneSprite
        "c" "i" GetVariable StringAdd 0 640 RandomNumber SetProperty
        "c" "i" GetVariable StringAdd 1 480 RandomNumber SetProperty
        "i" "i" GetVariable 1 Add SetVariable "i" GetVariable 1000 Less If more Stop )"));
    movie.Show().Show().End();
    return movie.Bytes();
}

void Clones(benchmark::State& state)
{
    SeedRandom(1);
    const std::vector<U8> bytes = ClonesMovie();
    NativePlayerWnd player(640, 480);
    player.Feed(bytes.data(), bytes.size());
    for (auto _ : state)
        player.Tick();
    ScriptThread* last = player.FindTarget(nullptr, "/c999");
    if (!last || player.actionsAborted)
        state.SkipWithError("there are not as many clones as there should be");
    state.counters["pictures_per_second"] =
        benchmark::Counter(double(state.iterations()), benchmark::Counter::kIsRate);
}

} // namespace

int main(int argc, char** argv)
{
    benchmark::RegisterBenchmark("script_loop", Loop);
    benchmark::RegisterBenchmark("script_arithmetic", Arithmetic);
    benchmark::RegisterBenchmark("script_strings", Strings);
    benchmark::RegisterBenchmark("clones_1000", Clones)->Unit(benchmark::kMillisecond);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
