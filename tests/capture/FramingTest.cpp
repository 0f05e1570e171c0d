#include "capture/CaptureReader.h"
#include "capture/CaptureWriter.h"
#include "capture/Messages.h"

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
    std::uint64_t offset = 0; ///< of the fault, or of the end if there is none
    std::uint64_t missing = 0;
};

/// Reads the messages by their lengths alone.
Read readAll(const std::string& bytes, CaptureFormat format)
{
    std::istringstream stream(bytes);
    ByteWindow window(stream);
    Read read;
    const auto reader = CaptureReader::make(format, window, OnDamage::Stop, [&](const CaptureFault& fault) {
        EXPECT_EQ(read.fault, "") << "a second fault";
        EXPECT_EQ(fault.size, 0u);
        read.fault = fault.reason;
        EXPECT_EQ(fault.offset, window.offset());
    });
    while (const auto message = reader->next())
        read.messages.emplace_back(textOf(*message));
    EXPECT_FALSE(reader->next());
    read.offset = window.offset();
    read.missing = reader->missing();
    return read;
}

TEST(Kcap, GivesEachMessageBehindItsLength)
{
    const auto read = readAll("\x03\0\0\0abc\0\0\0\0\x01\0\0\0d"s, CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, ElementsAre("abc", "", "d"));
    EXPECT_EQ(read.fault, "");
    EXPECT_EQ(read.offset, 16u);
}

TEST(Kcap, TellsWhereATruncatedMessageBegins)
{
    const auto read = readAll("\x03\0\0\0abc\x09\0\0\0shor"s, CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, ElementsAre("abc"));
    EXPECT_EQ(read.fault, "the last message is cut off (5 bytes missing)");
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
    EXPECT_EQ(read.fault, "a message of 4294967295 bytes, longer than the limit of 16777216");
}

TEST(Kcap, PassesOverNotesOfMissingMessages)
{
    std::string notes;
    for (int i = 0; i < 100'000; ++i)
        notes += note(7);
    const auto read = readAll(notes + kcap("one") + note(std::uint64_t{1} << 40), CaptureFormat::Kcap);
    EXPECT_THAT(read.messages, ElementsAre("one"));
    EXPECT_EQ(read.fault, "");
    EXPECT_EQ(read.offset, notes.size() + 7 + 12);
    EXPECT_EQ(read.missing, 700'000 + (std::uint64_t{1} << 40));
}

TEST(Kcap, TellsOfANoteThatIsCutOff)
{
    const auto read = readAll(note(7).substr(0, 11), CaptureFormat::Kcap);
    EXPECT_EQ(read.fault, "the last message is cut off (1 bytes missing)");
    EXPECT_EQ(read.offset, 0u);
    EXPECT_EQ(read.missing, 0u);
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
    EXPECT_EQ(read.fault, "a record of 11 bytes, shorter than its header of 12");
    EXPECT_EQ(read.offset, 12u);
}

TEST(Dlf, TellsWhereATruncatedRecordBegins)
{
    EXPECT_EQ(readAll("\x20\0\x7A\x41"
                      "abcdefgh"s,
                      CaptureFormat::Dlf)
                  .fault,
              "the last message is cut off (20 bytes missing)");
    EXPECT_EQ(readAll("\x20"s, CaptureFormat::Dlf).fault, "the length has only 1 of its 2 bytes");
}

TEST(Dlf, GivesPropertyListsAsRecordsOfTheTelephonyService)
{
    const auto read = readAll(dlf(2, "<?xml version=\"1.0\"?><plist/>") + dlf(2, "no list"), CaptureFormat::Dlf);
    EXPECT_THAT(read.messages,
                ElementsAre(message(2, "<?xml version=\"1.0\"?><plist/>", kStamp, 0xFF), message(2, "no list")));
}

TEST(CaptureFormats, AreToldByTheFilesEnding)
{
    EXPECT_EQ(captureFormat("a/b.kcap"), CaptureFormat::Kcap);
    EXPECT_EQ(captureFormat("b.dlf"), CaptureFormat::Dlf);
    EXPECT_FALSE(captureFormat("b.kestrum"));
    EXPECT_FALSE(captureFormat("kcap"));
}

TEST(CaptureFormats, AreToldByTheFilesFirstBytes)
{
    EXPECT_EQ(captureFormatFromBytes(bytesOf(kcap("abc"))), CaptureFormat::Kcap);
    EXPECT_EQ(captureFormatFromBytes(bytesOf(dlf(0xB0C1, "abc"))), CaptureFormat::Dlf);
    EXPECT_EQ(captureFormatFromBytes({}), CaptureFormat::Kcap);
}

} // namespace
} // namespace kestrum
