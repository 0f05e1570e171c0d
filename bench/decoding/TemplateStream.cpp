// The binary path without any technology's own conversions: routing, one dictionary section of six rows, the raw copy.
#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator2.h"
#include "decoding/Messages.h"

namespace kestrum::bench {
namespace {

class Cell final : public Base {
public:
    using Base::Base;
    std::string_view getSectionName() const override { return "Cell"; }
    std::vector<LogCode> getLogCodeArray() const override { return {0x5071}; }
    void updateWithData(Record data, LogCode logCode) override
    {
        static constexpr Row kRows[] = {
            {u16(13), "ARFCN", decimal},           {u8(15), "BSIC", decimal}, {u8(16), "RxLev", decimalSigned8},
            {u16(17), "Cell ID", decimalUnsigned}, {u16(19), "LAC", decimal}, {u32(21).bits(3, 12), "Offset", decimal},
        };
        if (accepts(data, logCode, 0x5071, 25))
            publish(data, kRows);
    }
};

class Index final : public ClassIndex {
public:
    using ClassIndex::ClassIndex;

private:
    std::unique_ptr<Base> objCell = create<Cell>();
};

class Generator final : public ZPHLogGenerator2 {
public:
    explicit Generator(DecodingRoles& roles) : ZPHLogGenerator2(roles, "Bench", std::make_unique<Index>(roles)) {}
    std::string_view technology() const override { return "bench"; }
};

void templateStream(benchmark::State& run)
{
    Surroundings surroundings;
    Generator generator(surroundings.roles);
    State state;
    state.set("Template", makeDictionary({{"Cell", makeDictionary()}}));
    std::vector<std::byte> message(60, std::byte{0x2A});
    message[0] = std::byte{1};
    message[3] = std::byte{0x71};
    message[4] = std::byte{0x50};
    int interval = 0;
    measure(run, message, [&] {
        generator.updateState(state, message);
        // The refresh hands the raw messages over, so that their buffer does not grow for ever.
        if (++interval % 100'000 == 0)
            generator.generateLogUsingState(state);
    });
}
BENCHMARK(templateStream);

} // namespace
} // namespace kestrum::bench
