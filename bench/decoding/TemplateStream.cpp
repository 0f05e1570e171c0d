// The binary path without the conversions of a technology: routing, one dictionary section of six rows, the raw copy.
#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator2.h"
#include "decoding/Messages.h"

namespace kestrum::bench {
namespace {

constexpr Row kCell[] = {
    {u16(13), "ARFCN", decimalSigned32}, {u8(15), "BSIC", decimalSigned32},
    {u8(16), "RxLev", decimal<signed8>}, {u16(17), "Cell ID", decimalUnsigned},
    {u16(19), "LAC", decimalSigned32},   {u32(21).bits(3, 12), "Offset", decimalSigned32},
};
constexpr Layout kLayouts[] = {{.code = 0x5071, .minimumLength = 25, .rows = kCell}};
static_assert(fits(kLayouts));
constexpr SectionTraits kTraits{.name = "Cell", .layouts = kLayouts};

class Cell final : public Base {
public:
    explicit Cell(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}
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
        // A refresh takes the raw messages, so that their buffer stays bounded.
        if (++interval % 100'000 == 0)
            generator.generateLogUsingState(state);
    });
}
BENCHMARK(templateStream);

} // namespace
} // namespace kestrum::bench
