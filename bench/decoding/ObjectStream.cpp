// The IFX path: from a message's bytes to the state, and from there to the display tree.
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "core/KestrumModelNode.h"
#include "decoding/Messages.h"
#include "propertylist/Lists.h"
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

/// Adds the value after its parts, and returns its number. For strings of ASCII and less than 256 objects.
std::size_t add(BinaryList& list, const Value& value)
{
    const auto marked = [](unsigned marker, std::size_t count, const std::string& content) {
        const auto small = count < 15 ? count : 15;
        return bigEndian(marker | small, 1) + (count < 15 ? "" : bigEndian(0x10, 1) + bigEndian(count, 1)) + content;
    };
    std::string parts;
    const auto part = [&](const Value& each) { parts += bigEndian(add(list, each), 1); };
    if (const auto dictionary = value.dictionary()) {
        for (const auto& entry : *dictionary)
            part(entry.key);
        for (const auto& entry : *dictionary)
            part(entry.value);
        list.objects.push_back(marked(0xD0, dictionary->size(), parts));
    } else if (const auto array = value.array()) {
        for (const auto& element : *array)
            part(element);
        list.objects.push_back(marked(0xA0, array->size(), parts));
    } else {
        list.objects.push_back(marked(0x50, value.text()->size(), std::string(*value.text())));
    }
    return list.objects.size() - 1;
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
    BinaryList list;
    list.root = add(list, display());
    updateFrom(run, copied(bytesOf(list.bytes())));
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
