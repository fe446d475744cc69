// SPDX-License-Identifier: GPL-3.0-or-later

// What it takes to read and to write a list.

#include "bench/BenchEdls.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <benchmark/benchmark.h>

namespace cadrel::bench {

namespace {

/// The EDL of a benchmark's argument, in a project of its rate.
class WrittenEdl {
public:
    explicit WrittenEdl(const benchmark::State& state)
    {
        writeEdl(m_folder / "big.edl", makeCut(static_cast<std::size_t>(state.range(0))));
    }

    std::wstring path() const { return tests::widePath(m_folder / "big.edl"); }

private:
    tests::TestProject m_project{core::Framerate(24, 0)};
    tests::TempFolder m_folder;
};

void Detect(benchmark::State& state)
{
    const WrittenEdl edl(state);

    for (auto _ : state) {
        core::Framerate framerate;
        benchmark::DoNotOptimize(core::fileio::CmxParser().detect(edl.path(), framerate));
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void Load(benchmark::State& state)
{
    const WrittenEdl edl(state);

    for (auto _ : state) {
        core::EventList events;
        core::Framerate framerate;
        events.load(edl.path(), false, framerate, true, false);
        benchmark::DoNotOptimize(events.size());
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void Save(benchmark::State& state)
{
    const WrittenEdl edl(state);
    core::EventList events;
    events.load(edl.path(), false);
    const tests::TempFolder target;

    for (auto _ : state)
        events.save(tests::widePath(target / "saved.edl"));
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

BENCHMARK(Detect)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(Load)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(Save)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);

} // namespace

} // namespace cadrel::bench
