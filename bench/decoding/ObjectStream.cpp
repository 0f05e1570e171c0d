// The IFX path: from a message's bytes to the state, and from there to the display tree.
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "core/KestrumModelNode.h"
#include "decoding/Messages.h"
#include "support/Format.h"

namespace kestrum::bench {
namespace {

/// A display as a modem sends it: a serving cell, eight neighbours after their header, wrappers around values.
Value display()
{
    const auto wrapped = [](const char* text) { return Value(makeDictionary({{"value", text}})); };
    auto neighbors = makeArray({"header"});
    for (int i = 0; i < 8; ++i)
        neighbors->append(makeDictionary({{"ARFCN", std::to_string(512 + i)},
                                          {"BSIC", wrapped("37")},
                                          {"RxLev", formatted("-%d dBm", 70 + i)},
                                          {"C1", "24"}}));
    return makeDictionary({{"Serving Cell", makeDictionary({{"MCC", "262"},
                                                            {"MNC", "01"},
                                                            {"LAC", wrapped("4660")},
                                                            {"Cell ID", "22136"},
                                                            {"ARFCN", "62"},
                                                            {"RxLev", "-67 dBm"}})},
                           {"Neighbors", neighbors},
                           {"RR State", wrapped("Dedicated")}});
}

void updateFrom(benchmark::State& run, const std::vector<std::byte>& message)
{
    Surroundings surroundings;
    const auto generator = GSMLogGenerator::generator(surroundings.roles);
    State state;
    measure(run, message, [&] { generator->updateState(state, message); });
}

void objectStreamXml(benchmark::State& run)
{
    updateFrom(run, copied(PropertyListCodec().toXml(display())->bytes()));
}
BENCHMARK(objectStreamXml);

void objectStreamBinary(benchmark::State& run)
{
    updateFrom(run, binaryPropertyList(display()));
}
BENCHMARK(objectStreamBinary);

void objectStreamTree(benchmark::State& run)
{
    const Value shown = GSMLogGenerator::processObject(display());
    for (auto _ : run) {
        PathDictionary paths;
        benchmark::DoNotOptimize(KestrumModelNode::makeTreeFromObject(shown, paths));
    }
}
BENCHMARK(objectStreamTree);

} // namespace
} // namespace kestrum::bench
