#include "platform/propertylist/PropertyListCodec.h"

#include "platform/propertylist/BinaryReader.h"
#include "platform/propertylist/Limits.h"
#include "platform/propertylist/XmlReader.h"
#include "platform/propertylist/XmlWriter.h"

#include <cstdio>
#include <memory>
#include <system_error>

namespace kestrum {
namespace {

struct CloseFile {
    void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

/// The file's bytes; nothing when it cannot be read or holds more than `most` bytes.
std::optional<std::vector<std::byte>> contents(const std::string& path, std::size_t most)
{
    const File file(std::fopen(path.c_str(), "rb"));
    if (!file)
        return std::nullopt;
    std::vector<std::byte> bytes;
    std::byte block[1 << 16];
    while (const std::size_t count = std::fread(block, 1, sizeof block, file.get())) {
        if (count > most - bytes.size())
            return std::nullopt;
        bytes.insert(bytes.end(), block, block + count);
    }
    return std::ferror(file.get()) ? std::nullopt : std::optional(std::move(bytes));
}

/// Nothing when the value has no XML form.
std::optional<std::string> xmlText(const Value& value)
{
    if (value.isNull())
        return std::nullopt;
    try {
        return propertylist::writeXml(value);
    } catch (const propertylist::Refusal&) {
        return std::nullopt;
    }
}

} // namespace

PropertyListCodec::Parsed PropertyListCodec::parseWithError(Bytes bytes, Value spent) const
{
    try {
        if (bytes.size() > _maxBytes)
            throw propertylist::Refusal{"too many bytes"};
        return {textOf(bytes).starts_with(propertylist::kBinaryMagic) ? propertylist::readBinary(bytes)
                                                                      : propertylist::readXml(bytes, std::move(spent))};
    } catch (propertylist::Refusal& refusal) {
        return {Value(), std::move(refusal.reason), refusal.offset};
    }
}

Value PropertyListCodec::parse(Bytes bytes)
{
    return parseWithError(bytes).value;
}

Value PropertyListCodec::parseOver(Bytes bytes, Value spent)
{
    return parseWithError(bytes, std::move(spent)).value;
}

std::optional<Data> PropertyListCodec::toXml(const Value& value) const
{
    const auto text = xmlText(value);
    return text ? std::optional(Data(bytesOf(*text))) : std::nullopt;
}

Value PropertyListCodec::load(const std::string& path) const
{
    const auto bytes = contents(path, _maxBytes);
    return bytes ? parseWithError(*bytes).value : Value();
}

PropertyLists::Stored PropertyListCodec::write(const Dictionary& dictionary, const std::string& path) const
{
    const auto text = xmlText(std::make_shared<Dictionary>(dictionary));
    if (!text || text->size() > _maxBytes)
        return Stored::Failed;
    WholeFile::createDirectoryOf(path);
    try {
        WholeFile file(path);
        file.write(bytesOf(*text));
        const auto there = WholeFile::at(path);
        const bool isOurs = there == _lastWritten && there != WholeFile::Identity();
        if (!file.finish(isOurs ? WholeFile::Existing::Replaced : WholeFile::Existing::Kept))
            return Stored::NameTaken;
        _lastWritten = file.identity();
        return Stored::Written;
    } catch (const std::system_error&) {
        return Stored::Failed;
    }
}

} // namespace kestrum
