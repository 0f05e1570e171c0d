#include "tools/Extraction.h"

#include "platform/ChannelMessage.h"

#include <array>
#include <filesystem>
#include <stdexcept>

namespace kestrum {
namespace {

constexpr std::size_t kLongestRecord = 0xFFFF;
constexpr const char *kKcap = ".kcap", *kDlf = ".dlf", *kWritten = "-written.dlf";

std::string stemIn(const std::string& directory, const Snapshot& snapshot)
{
    std::filesystem::create_directories(directory);
    const auto stem = std::filesystem::path(snapshot.listing().file).stem().string();
    return (std::filesystem::path(directory) / (stem == "-" ? "snapshot" : stem)).string();
}

bool isThere(const std::string& path)
{
    return WholeFile::at(path) != WholeFile::Identity();
}

template <std::size_t Width>
std::array<std::byte, Width> littleEndian(std::size_t number)
{
    std::array<std::byte, Width> bytes{};
    for (std::size_t i = 0; i < Width; ++i)
        bytes[i] = static_cast<std::byte>(number >> (8 * i));
    return bytes;
}

} // namespace

Extraction::Extraction(const std::string& directory, const Snapshot& snapshot, WholeFile::Existing existing)
    : _stem(stemIn(directory, snapshot)), _existing(existing)
{
    std::string there;
    for (const auto* ending : {kKcap, kWritten, kDlf})
        if ((ending == kKcap || snapshot.dlf()) && isThere(_stem + ending))
            there += (there.empty() ? "" : ", ") + _stem + ending;
    if (existing == WholeFile::Existing::Kept && !there.empty())
        throw std::runtime_error("nothing is extracted, for there is already " + there + " (--force replaces it)");
    _kcap = &create(kKcap);
    if (!snapshot.dlf())
        return;
    create(kWritten).write(snapshot.dlf()->bytes());
    _dlf = &create(kDlf);
    _dlf->write(snapshot.versionReport());
}

WholeFile& Extraction::create(const std::string& ending)
{
    return *_files.emplace_back(_stem + ending, std::make_unique<WholeFile>(_stem + ending)).second;
}

void Extraction::take(Bytes message)
{
    _kcap->write(littleEndian<4>(message.size()));
    _kcap->write(message);
    if (_dlf == nullptr)
        return;
    const auto read = ChannelMessage::read(message);
    const auto record = read && read->type == ChannelMessage::kOrdinary ? read->record.from(1) : std::nullopt;
    if (!record || record->size() < ChannelMessage::kHeaderSize - 1 || record->size() > kLongestRecord) {
        ++_inKcapAlone;
        return;
    }
    // The length as it is, whatever the record said.
    _dlf->write(littleEndian<2>(record->size()));
    _dlf->write(record->from(2)->bytes());
}

void Extraction::finish()
{
    for (const auto& [path, file] : _files)
        if (!file->finish(_existing))
            throw std::runtime_error("not extracted, for there is already " + path);
}

} // namespace kestrum
