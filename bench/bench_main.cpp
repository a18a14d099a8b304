// Milliseconds a frame for every scene, size, quality and way of drawing; with cairo in the same
// run where it is installed. Nothing here passes or fails.
#include <benchmark/benchmark.h>

#include "bench/scene.h"
#ifdef VEXEL_BENCH_CAIRO
#include "bench/cairo_scene.h"
#endif

namespace {

struct Size {
    S32 width, height;
};

std::string Label(const char* what, const BenchMovie& m, Size s, int quality)
{
    return std::string(what) + "/" + m.name + "/" + std::to_string(s.width) + "x" +
           std::to_string(s.height) + (quality ? "/high" : "/low");
}

template <typename Draw>
void Register(const char* what, const BenchMovie& m, Size s, int q, Draw draw)
{
    auto run = [=](benchmark::State& state) {
        BenchScene scene(m, s.width, s.height, q);
        draw(scene);
        for (auto _ : state)
            draw(scene);
    };
    benchmark::RegisterBenchmark(Label(what, m, s, q).c_str(), run)->Unit(benchmark::kMillisecond);
}

#ifdef VEXEL_BENCH_CAIRO
void RegisterCairo(const BenchMovie& m, Size s)
{
    auto run = [=](benchmark::State& state) {
        BenchScene scene(m, s.width, s.height, 1);
        CairoScene cairo(&scene.player);
        for (auto _ : state)
            cairo.Draw();
    };
    benchmark::RegisterBenchmark(Label("cairo", m, s, 1).c_str(), run)
        ->Unit(benchmark::kMillisecond);
}
#endif

void RegisterAll(const BenchMovie& m, Size s)
{
    for (int q : {1, 0}) {
        Register("repaint", m, s, q, [](BenchScene& b) { b.Repaint(); });
        Register("rebuild", m, s, q, [](BenchScene& b) { b.Rebuild(); });
        Register("moving", m, s, q, [](BenchScene& b) { b.MoveSmallObject(); });
        Register("tick", m, s, q, [](BenchScene& b) { b.player.Tick(); });
    }
#ifdef VEXEL_BENCH_CAIRO
    if (m.inCairo)
        RegisterCairo(m, s);
#endif
}

} // namespace

int main(int argc, char** argv)
{
    for (const BenchMovie& m : BenchMovies())
        for (Size s : {Size{640, 480}, Size{1920, 1080}})
            RegisterAll(m, s);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
