// SPDX-License-Identifier: GPL-3.0-or-later

// What it takes to generate and heal a change EDL.

#include "bench/BenchEdls.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <benchmark/benchmark.h>

namespace cadrel::bench {

namespace {

constexpr std::uint32_t PairedEvents = 20'000;
constexpr std::uint32_t PairedLength = 10;

void addEvent(core::EventList& events, std::uint32_t srcIn, std::uint32_t dstIn, std::uint32_t length)
{
    const auto at = [](std::uint32_t frames) { return core::Timecode(static_cast<std::int32_t>(frames)); };
    const auto event = std::make_shared<core::EventBase>();
    event->setRollName("A001");
    event->setTimecodes(at(srcIn), at(srcIn + length), at(dstIn), at(dstIn + length));
    events.add(event);
}

void generate(core::DataModel& model, benchmark::State& state)
{
    for (auto _ : state) {
        if (model.generateChangeEdl() != util::Result::Ok) {
            state.SkipWithError("the generation failed");
            return;
        }
    }
    state.counters["change events"] = static_cast<double>(model.changeEdl().size());
}

/// Two cuts of a film that differ in one place of a hundred.
void GenerateAndHeal(benchmark::State& state)
{
    const tests::TestProject project(core::Framerate(24, 0));
    const tests::TempFolder folder;
    const Cut oldCut = makeCut(static_cast<std::size_t>(state.range(0)));
    writeEdl(folder / "old.edl", oldCut);
    writeEdl(folder / "new.edl", recut(oldCut, oldCut.size() / 100));
    core::DataModel model;
    model.oldEdl().load(tests::widePath(folder / "old.edl"), false);
    model.newEdl().load(tests::widePath(folder / "new.edl"), false);

    generate(model, state);
}

/// Clip names are compared and there are none: every event has the name of every other.
void PairWithoutNames(benchmark::State& state)
{
    const tests::TestProject project(core::Framerate(24, 0));
    core::DataModel model;
    model.settings().setMatchBy(core::MatchBy::ClipName);
    for (std::uint32_t i = 0; i < PairedEvents; ++i) {
        addEvent(model.oldEdl(), i * PairedLength, i * PairedLength, PairedLength);
        addEvent(model.newEdl(), i * PairedLength + 3, i * PairedLength, PairedLength);
    }

    generate(model, state);
}

/// One new event runs over the material of all old ones.
void PairLongEventWithMany(benchmark::State& state)
{
    const tests::TestProject project(core::Framerate(24, 0));
    core::DataModel model;
    addEvent(model.newEdl(), 0, 0, PairedEvents * PairedLength);
    for (std::uint32_t i = 0; i < PairedEvents; ++i) {
        addEvent(model.oldEdl(), i * PairedLength, i * PairedLength, PairedLength);
        if (i > 0)
            addEvent(model.newEdl(), i * PairedLength, (PairedEvents + i) * PairedLength, PairedLength);
    }

    generate(model, state);
}

/// The same stretch of material stands everywhere, in both cuts.
void PairRepeatedStretch(benchmark::State& state)
{
    const tests::TestProject project(core::Framerate(24, 0));
    core::DataModel model;
    for (std::uint32_t i = 0; i < PairedEvents; ++i) {
        addEvent(model.oldEdl(), 0, i * PairedLength, PairedLength);
        addEvent(model.newEdl(), 0, i * PairedLength, PairedLength);
    }

    generate(model, state);
}

BENCHMARK(GenerateAndHeal)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(PairWithoutNames)->Unit(benchmark::kMillisecond);
BENCHMARK(PairLongEventWithMany)->Unit(benchmark::kMillisecond);
BENCHMARK(PairRepeatedStretch)->Unit(benchmark::kMillisecond);

} // namespace

} // namespace cadrel::bench
