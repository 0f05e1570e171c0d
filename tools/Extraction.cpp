#include "tools/Extraction.h"

#include "platform/ChannelMessage.h"
#include "voxd/capture/Capture.h"

#include <cerrno>
#include <filesystem>
#include <system_error>

namespace kestrum {
namespace {

constexpr std::size_t kLongestRecord = 0xFFFF;

std::string pathIn(const std::string& directory, const Snapshot& snapshot, const char* ending)
{
    std::filesystem::create_directories(directory);
    const auto stem = std::filesystem::path(snapshot.listing().file).stem().string();
    return (std::filesystem::path(directory) / ((stem == "-" ? "snapshot" : stem) + ending)).string();
}

void write(std::ostream& to, Bytes bytes)
{
    to.write(textOf(bytes).data(), static_cast<std::streamsize>(bytes.size()));
}

} // namespace

Extraction::File Extraction::create(const std::string& path)
{
    File file{path, std::ofstream(path, std::ios::binary | std::ios::trunc)};
    if (!file.stream)
        throw std::system_error(errno, std::generic_category(), path);
    return file;
}

void Extraction::close(File& file)
{
    if (file.stream.is_open() && !file.stream.flush())
        throw std::system_error(errno, std::generic_category(), file.path);
}

Extraction::Extraction(const std::string& directory, const Snapshot& snapshot)
    : _kcap(create(pathIn(directory, snapshot, ".kcap")))
{
    if (!snapshot.dlf())
        return;
    auto written = create(pathIn(directory, snapshot, "-written.dlf"));
    write(written.stream, snapshot.dlf()->bytes());
    close(written);
    _dlf = create(pathIn(directory, snapshot, ".dlf"));
    write(_dlf.stream, snapshot.versionReport());
}

void Extraction::take(Bytes message)
{
    writeKcap(_kcap.stream, message);
    if (!_dlf.stream.is_open())
        return;
    const auto read = ChannelMessage::read(message);
    const auto record = read && read->type == ChannelMessage::kOrdinary ? read->record.from(1) : std::nullopt;
    if (!record || record->size() < ChannelMessage::kHeaderSize - 1 || record->size() > kLongestRecord) {
        ++_inKcapAlone;
        return;
    }
    // The length as it is, whatever the record said.
    const std::byte length[] = {static_cast<std::byte>(record->size()), static_cast<std::byte>(record->size() >> 8)};
    write(_dlf.stream, length);
    write(_dlf.stream, record->from(sizeof length)->bytes());
}

void Extraction::finish()
{
    close(_kcap);
    close(_dlf);
}

} // namespace kestrum
