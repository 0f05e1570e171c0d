// GSM and UMTS through the real generator: a mix of records as in a drive, and each dictionary section's record
// alone.
#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"
#include "decoding/Messages.h"
#include "harness/Places.h"
#include "sections/RecordBuilder.h"

namespace kestrum::bench {
namespace {

using Message = std::vector<std::byte>;

Message messageOf(const RecordBuilder& record)
{
    return copied(record.bytes());
}

/// The generator with its shipped template.
class Gsm {
public:
    Gsm()
    {
        _surroundings.bundle.paths = {inCheckout("resources/ZPH_GSM.plist")};
        _generator = ZPH_GSMLogGenerator::generator(_surroundings.roles);
    }

    void receive(const Message& message)
    {
        _generator->updateState(_state, message);
        // A refresh takes the raw messages, so that their buffer stays bounded.
        if (++_received % 100'000 == 0)
            _generator->generateLogUsingState(_state);
    }

private:
    Surroundings _surroundings;
    std::unique_ptr<ZPH_GSMLogGenerator> _generator;
    State _state;
    int _received = 0;
};

const RecordBuilder kMeasurements =
    record(0x5137, 29 + 14 * 6).u8(15, 40).u32(16, 24).u32(20, 20).u8(28, 6).u16(29, 62).u8(31, 60).u32(32, 12);
const RecordBuilder kSearcher = record(0x417A, 16 + 59 * 4).u16(13, -300).u8(15, 4).u16(23, 77).u32(108, 60000);
const RecordBuilder kRanking = record(0x4005, 15 + 10 * 4).u8(13, 4).u8(14, 4).u16(17, 320).u8(19, 0xB0);
const RecordBuilder kTransmitPower = record(0x4031, 16 + 14 * 2).u8(14, 2).u16(20, 100).u16(34, 110);
const RecordBuilder kBlockErrors = record(0x4116, 16 + 9 * 2).u8(13, 2).u16(14, 50).u32(17, 1000);
const RecordBuilder kRrState = record(0x512C, 17).u8(13, 5);
const RecordBuilder kMmState = record(0x7131, 16).u8(13, 19).u8(14, 8);
const RecordBuilder kRegistration = record(0x7132, 16).u8(13, 1);
const RecordBuilder kServingPlmn = record(0x7135, 32).bytes(15, {0x13, 0x00, 0x62, 0x12, 0x34, 5});
const RecordBuilder kIdentity = record(0x5134, 26).u16(13, 871).u16(15, 63).u16(17, 4711);

void gsmStream(benchmark::State& run)
{
    // Measurements are frequent, states rare.
    std::vector<Message> mix;
    for (const auto& [record, times] : {std::pair{&kMeasurements, 8},
                                        {&kSearcher, 8},
                                        {&kRanking, 2},
                                        {&kTransmitPower, 8},
                                        {&kBlockErrors, 2},
                                        {&kRrState, 1},
                                        {&kMmState, 1},
                                        {&kRegistration, 1},
                                        {&kServingPlmn, 1},
                                        {&kIdentity, 1}})
        mix.insert(mix.end(), static_cast<std::size_t>(times), messageOf(*record));
    Gsm gsm;
    std::size_t next = 0;
    measure(run, mix.front(), [&] { gsm.receive(mix[next++ % mix.size()]); });
}
BENCHMARK(gsmStream);

void gsmRecord(benchmark::State& run, const RecordBuilder& record)
{
    Gsm gsm;
    const auto message = messageOf(record);
    measure(run, message, [&] { gsm.receive(message); });
}
BENCHMARK_CAPTURE(gsmRecord, rrState, kRrState);
BENCHMARK_CAPTURE(gsmRecord, mmState, kMmState);
BENCHMARK_CAPTURE(gsmRecord, servingPlmn, kServingPlmn);
BENCHMARK_CAPTURE(gsmRecord, identity, kIdentity);
BENCHMARK_CAPTURE(gsmRecord, transmitPower, kTransmitPower);
BENCHMARK_CAPTURE(gsmRecord, measurements, kMeasurements);
BENCHMARK_CAPTURE(gsmRecord, searcher, kSearcher);
BENCHMARK_CAPTURE(gsmRecord, ranking, kRanking);

} // namespace
} // namespace kestrum::bench
