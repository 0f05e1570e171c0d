#include "voxd/capture/Capture.h"
#include "platform/ChannelMessage.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>

#include <sstream>

namespace kestrum {
namespace {

using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;

struct Read {
    std::vector<std::string> messages;
    std::string fault;
    std::uint64_t offset;
};

Read readAll(const std::string& bytes, CaptureFormat format)
{
    std::istringstream stream(bytes);
    CaptureReader reader(stream, format);
    Read read{};
    while (const auto message = reader.next())
        read.messages.emplace_back(textOf(*message));
    read.fault = reader.fault();
    read.offset = reader.offset();
    return read;
}

TEST(Kcap, GivesEachMessageBehindItsLength)
{
    const auto read = readAll("\x03\0\0\0abc\0\0\0\0\x01\0\0\0d"s, CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, ElementsAre("abc", "", "d"));
    EXPECT_EQ(read.fault, "");
    EXPECT_EQ(read.offset, 16u);
}

TEST(Kcap, IsWrittenAsItIsRead)
{
    std::ostringstream stream;
    writeKcap(stream, bytesOf("abc"));
    writeKcap(stream, bytesOf(std::string(300, 'x')));
    EXPECT_EQ(stream.str(), "\x03\0\0\0abc\x2C\x01\0\0"s + std::string(300, 'x'));
}

TEST(Kcap, TellsWhereATruncatedMessageBegins)
{
    const auto read = readAll("\x03\0\0\0abc\x09\0\0\0shor"s, CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, ElementsAre("abc"));
    EXPECT_EQ(read.fault, "the last message ends 5 bytes short");
    EXPECT_EQ(read.offset, 7u);
}

TEST(Kcap, TellsOfATruncatedLength)
{
    const auto read = readAll("\x03\0\0"s, CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, IsEmpty());
    EXPECT_EQ(read.fault, "the length has only 3 of its 4 bytes");
}

TEST(Kcap, RefusesALengthBeyondReason)
{
    const auto read = readAll("\xFF\xFF\xFF\xFF...."s, CaptureFormat::Kcap);
    EXPECT_EQ(read.fault, "a message of 4294967295 bytes, allowed are 16777216");
}

TEST(Kcap, PassesOverNotesOfMissingMessages)
{
    std::ostringstream file;
    for (int i = 0; i < 100'000; ++i)
        writeKcapGap(file, 7);
    writeKcap(file, bytesOf("one"));
    writeKcapGap(file, std::uint64_t{1} << 40);
    std::istringstream written(file.str());
    CaptureReader reader(written, CaptureFormat::Kcap);
    const auto message = reader.next();
    ASSERT_TRUE(message);
    EXPECT_EQ(textOf(*message), "one");
    EXPECT_FALSE(reader.next());
    EXPECT_EQ(reader.fault(), "");
    EXPECT_EQ(reader.offset(), file.str().size());
}

TEST(Kcap, TellsOfANoteThatIsCutOff)
{
    std::ostringstream file;
    writeKcapGap(file, 7);
    std::istringstream written(file.str().substr(0, 11));
    CaptureReader reader(written, CaptureFormat::Kcap);
    EXPECT_FALSE(reader.next());
    EXPECT_EQ(reader.fault(), "the last message ends 1 bytes short");
    EXPECT_EQ(reader.offset(), 0u);
}

TEST(Kcap, NotesSayHowManyMessagesAreMissing)
{
    std::ostringstream file;
    writeKcapGap(file, 0x0102030405060708);
    EXPECT_EQ(file.str(), std::string("\x08\0\0\x80\x08\x07\x06\x05\x04\x03\x02\x01", 12));
    EXPECT_EQ(kcapGap(bytesOf(file.str())), 0x0102030405060708u);
    EXPECT_FALSE(kcapGap(bytesOf(file.str()).first(11)));
    EXPECT_FALSE(kcapGap(bytesOf("\x08 no note here")));
}

TEST(Dlf, GivesRecordsAsOrdinaryChannelMessages)
{
    // length 14 (header 12, payload 2), code 0xB0C2, time stamp
    const auto read = readAll("\x0E\0\xC2\xB0"
                              "12345678"
                              "hi"
                              "\x0C\0\x7A\x41"
                              "abcdefgh"s,
                              CaptureFormat::Dlf);
    EXPECT_THAT(read.messages, ElementsAre("\x01\x0E\0\xC2\xB0"
                                           "12345678hi"s,
                                           "\x01\x0C\0\x7A\x41"
                                           "abcdefgh"s));
    EXPECT_EQ(read.fault, "");
    EXPECT_EQ(read.offset, 26u);
}

TEST(Dlf, RefusesALengthBelowItsHeader)
{
    const auto read = readAll("\x0C\0\x7A\x41"
                              "abcdefgh\x0B\0..........."s,
                              CaptureFormat::Dlf);
    EXPECT_EQ(read.messages.size(), 1u);
    EXPECT_EQ(read.fault, "a record of 11 bytes, less than its header's 12");
    EXPECT_EQ(read.offset, 12u);
}

TEST(Dlf, TellsWhereATruncatedRecordBegins)
{
    EXPECT_EQ(readAll("\x20\0\x7A\x41"
                      "abcdefgh"s,
                      CaptureFormat::Dlf)
                  .fault,
              "the last message ends 20 bytes short");
    EXPECT_EQ(readAll("\x20"s, CaptureFormat::Dlf).fault, "the length has only 1 of its 2 bytes");
}

TEST(CaptureFormats, AreToldByTheFilesEnding)
{
    EXPECT_EQ(captureFormat("a/b.kcap"), CaptureFormat::Kcap);
    EXPECT_EQ(captureFormat("b.dlf"), CaptureFormat::Dlf);
    EXPECT_FALSE(captureFormat("b.kestrum"));
    EXPECT_FALSE(captureFormat("kcap"));
}

TEST(ChannelRecords, HaveTheirCodeAndTimeStampBehindTheType)
{
    const auto record = channelRecord(bytesOf("\x01\x0C\0\xC2\xB0\x08\x07\x06\x05\x04\x03\x02\x01"s));
    ASSERT_TRUE(record);
    EXPECT_EQ(record->code, 0xB0C2u);
    EXPECT_EQ(record->timeStamp, 0x0102030405060708u);
}

TEST(ChannelRecords, OfTheServiceHaveExtraCodes)
{
    EXPECT_EQ(channelRecord(bytesOf("\xFF\x0C\0\x02\0........"s))->code, 0xFF0002u);
}

TEST(ChannelRecords, AreReadBehindAPrefix)
{
    EXPECT_EQ(channelRecord(bytesOf("\x81\xAA\x01\x0C\0\xC2\xB0........"s))->code, 0xB0C2u);
}

TEST(ChannelRecords, AreNotWhatIsTooShortOrOfAnotherType)
{
    EXPECT_FALSE(channelRecord({}));
    EXPECT_FALSE(channelRecord(bytesOf("\x81"s)));
    EXPECT_FALSE(channelRecord(bytesOf("\x01\x0C\0\xC2\xB0......."s))) << "12 bytes";
    EXPECT_FALSE(channelRecord(bytesOf("\x81\xAA\x01\x0C\0\xC2\xB0......."s)));
    EXPECT_FALSE(channelRecord(bytesOf("\x02\x0C\0\xC2\xB0........"s)));
    EXPECT_FALSE(channelRecord(bytesOf("<?xml version=\"1.0\"?>")));
}

struct Told {
    const char* name;
    std::string message;
    std::string_view technology;

    friend void PrintTo(const Told& shown, std::ostream* out) { *out << shown.name; }
};

class Technology : public testing::TestWithParam<Told> {};

TEST_P(Technology, IsToldByTheMessage)
{
    EXPECT_EQ(technologyOf(bytesOf(GetParam().message)).value_or("none"), GetParam().technology);
}

std::string record(const char* code)
{
    return "\x01\x0C\0"s + code + "........";
}

INSTANTIATE_TEST_SUITE_P(
    Messages, Technology,
    testing::Values(Told{"Cdma", record("\x83\x11"), "kVoxLogChannelTechnology_Zephra_CDMA"},
                    Told{"Umts", record("\x7A\x41"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"Gsm", record("\x34\x51"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"NonAccessStratum", record("\x35\x71"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"Lte", record("\x79\xB1"), "kVoxLogChannelTechnology_Zephra_LTE"},
                    Told{"Utran", record("\xE0\xD0"), "kVoxLogChannelTechnology_Zephra_UTRAN2"},
                    Told{"CellMonitorOfAny", "\xFF\x0C\0\x01\0........"s, "none"},
                    Told{"XmlList", "<?xml version=\"1.0\"?>", "kVoxLogChannelTechnology_IFX"},
                    Told{"XmlListBehindBlanks", "\xEF\xBB\xBF \n<plist/>", "kVoxLogChannelTechnology_IFX"},
                    Told{"BinaryList", "bplist00", "kVoxLogChannelTechnology_IFX"}, Told{"Nothing", "", "none"},
                    Told{"Noise", "\x42\x42", "none"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
