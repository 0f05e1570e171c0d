#include "capture/CaptureReader.h"
#include "capture/CaptureWriter.h"
#include "capture/Messages.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::string_literals;

TEST(KcapWriter, PutsTheLengthBeforeAMessage)
{
    std::ostringstream stream;
    writeKcap(sinkTo(stream), bytesOf("abc"));
    writeKcap(sinkTo(stream), bytesOf(std::string(300, 'x')));
    EXPECT_EQ(stream.str(), "\x03\0\0\0abc\x2C\x01\0\0"s + std::string(300, 'x'));
}

TEST(KcapWriter, NotesHowManyMessagesAreMissing)
{
    std::ostringstream stream;
    writeKcapGap(sinkTo(stream), 0x0102030405060708);
    EXPECT_EQ(stream.str(), std::string("\x08\0\0\x80\x08\x07\x06\x05\x04\x03\x02\x01", 12));
}

/// The form of a message in a DLF stream; "refused" when the stream cannot hold it.
std::string asDlf(const std::string& message)
{
    std::ostringstream stream;
    if (writeDlf(sinkTo(stream), bytesOf(message)))
        return stream.str();
    EXPECT_EQ(stream.str(), "") << "nothing of a refused message is written";
    return "refused";
}

TEST(DlfWriter, LeavesOutTypeAndPrefix)
{
    EXPECT_EQ(asDlf(message(0xB0C1, "payload")), dlf(0xB0C1, "payload"));
    EXPECT_EQ(asDlf("\x81\x07" + message(0xB0C1, "payload")), dlf(0xB0C1, "payload"));
}

TEST(DlfWriter, WritesTheLengthThatTheRecordHas)
{
    auto lying = message(0xB0C1, "payload");
    lying.replace(1, 2, littleEndian(4000, 2));
    EXPECT_EQ(asDlf(lying), dlf(0xB0C1, "payload"));
}

TEST(DlfWriter, RefusesWhatIsNoOrdinaryRecord)
{
    EXPECT_EQ(asDlf(message(2, "<plist/>", kStamp, 0xFF)), "refused");
    EXPECT_EQ(asDlf(message(2, "payload", kStamp, 2)), "refused");
    EXPECT_EQ(asDlf("<plist/>"), "refused");
    EXPECT_EQ(asDlf("\x81\x07" + message(0xB0C1, "").substr(0, 11)), "refused") << "its header is cut off";
}

TEST(DlfWriter, RefusesARecordThatIsLongerThanItsLengthCanSay)
{
    EXPECT_EQ(asDlf(message(0xB0C1, std::string(65'523, 'x'))).size(), 65'535u);
    EXPECT_EQ(asDlf(message(0xB0C1, std::string(65'524, 'x'))), "refused");
}

RC_GTEST_PROP(KcapWriter, WritesWhatIsRead, (const std::vector<std::string>& messages))
{
    std::stringstream stream;
    for (const auto& each : messages)
        writeKcap(sinkTo(stream), bytesOf(each));
    ByteWindow window(stream);
    const auto reader = CaptureReader::make(CaptureFormat::Kcap, window, OnDamage::Stop,
                                            [](const CaptureFault& fault) { RC_FAIL(fault.reason); });
    std::vector<std::string> read;
    while (const auto message = reader->next())
        read.emplace_back(textOf(*message));
    RC_ASSERT(read == messages);
}

} // namespace
} // namespace kestrum
