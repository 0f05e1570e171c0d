#include "tools/Extraction.h"

#include "capture/CaptureWriter.h"

#include <filesystem>
#include <stdexcept>

namespace kestrum::tools {
namespace {

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

ByteSink sinkTo(WholeFile& file)
{
    return [&file](Bytes bytes) { file.write(bytes); };
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
        throw std::runtime_error("nothing is extracted, existing files would be replaced (see --force): " + there);
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
    writeKcap(sinkTo(*_kcap), message);
    if (_dlf != nullptr && !writeDlf(sinkTo(*_dlf), message))
        ++_inKcapAlone;
}

void Extraction::finish()
{
    for (const auto& [path, file] : _files)
        if (!file->finish(_existing))
            throw std::runtime_error("not extracted, this file exists: " + path);
}

} // namespace kestrum::tools
