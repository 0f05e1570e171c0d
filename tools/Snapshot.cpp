#include "tools/Snapshot.h"

#include "LogGenerator/DlfVersionReport.h"
#include "LogGenerator/State.h"
#include "platform/PropertyLists.h"
#include "support/Base64.h"
#include "support/Format.h"
#include "support/Record.h"

#include <stdexcept>
#include <utility>

namespace kestrum::tools {
namespace {

constexpr LogCode kVersionReport = 0x1FFD;

std::uint64_t leavesOf(const Value& value)
{
    std::uint64_t count = 0;
    if (const auto dictionary = value.dictionary())
        for (const auto& entry : *dictionary)
            count += leavesOf(entry.value);
    else if (const auto array = value.array())
        for (const auto& element : *array)
            count += leavesOf(element);
    else
        count = 1;
    return count;
}

std::optional<std::string> textAt(const Dictionary& dictionary, std::string_view key)
{
    return dictionary.at(key).text();
}

/// The decoded bytes of base64, up to the point where it is cut off or damaged.
Data dataBefore(std::string_view damaged)
{
    constexpr std::string_view kAlphabet = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/=";
    std::string text;
    for (const char each : damaged) {
        if (kAlphabet.find(each) != kAlphabet.npos)
            text += each;
        else if (std::string_view(" \t\r\n").find(each) == std::string_view::npos)
            break;
    }
    text.resize(text.size() / 4 * 4);
    return Data(bytesFromBase64(text).value_or(std::vector<std::byte>()));
}

} // namespace

Value Snapshot::salvaged(Bytes xml)
{
    constexpr std::string_view kData = "<data>";
    const auto text = textOf(xml);
    std::vector<Value> entries;
    for (const char* key : {StateKey::kDisplayState, "DLF"}) {
        const auto mark = formatted("<key>%s</key>", key);
        for (auto at = text.find(mark); at != text.npos; at = text.find(mark, at)) {
            at += mark.size();
            const auto begin = text.find_first_not_of(" \t\r\n", at);
            if (begin == text.npos || !text.substr(begin).starts_with(kData))
                continue;
            at = begin + kData.size();
            entries.emplace_back(makeDictionary({{key, dataBefore(text.substr(at))}}));
        }
    }
    return entries.empty() ? Value() : Value(makeDictionary({{"Data", makeArray(std::move(entries))}}));
}

Snapshot::Snapshot(std::string file, const Value& propertyList, CaptureReader::OnFault onFault)
    : _onFault(std::move(onFault))
{
    const auto root = propertyList.dictionary();
    if (!root || (!root->contains("Timestamp") && !root->contains("Data")))
        throw std::runtime_error("the property list is not a snapshot");
    const auto wrong = [this](const std::string& what, const Value& held, std::string_view expected) {
        _onFault({0, 0, formatted("%s has the type %@, but it must be %s", what, nameOf(held.kind()), expected)});
    };
    _listing = {std::move(file), textAt(*root, "Timestamp"), textAt(*root, "Description"), {}};
    for (const auto key : {"Timestamp", "Description"})
        if (root->contains(key) && !root->at(key).isText())
            wrong(formatted("\"%s\"", key), root->at(key), "a string");
    if (!root->contains("Data"))
        return;
    const auto data = root->at("Data").array();
    if (!data) {
        wrong("\"Data\"", root->at("Data"), "an array");
        return;
    }
    for (const auto& element : *data) {
        const std::size_t index = _listing.entries.size();
        SnapshotListing::Entry listed{{}, {}, 0, "nothing"};
        if (const auto entry = element.dictionary()) {
            listed.description = textAt(*entry, "Description").value_or("");
            listed.date = textAt(*entry, "Date").value_or("");
            const Value dlf = entry->at("DLF"), state = entry->at(StateKey::kDisplayState);
            if (dlf.data() != nullptr) {
                listed.content = "DLF";
                listed.size = dlf.data()->size();
                _dlf = *dlf.data();
                _dlfEntry = index;
            } else if (dlf) {
                wrong(formatted("entry %lu: \"DLF\"", index), dlf, "data");
            } else if (state.data() != nullptr) {
                listed.content = "records";
                listed.size = state.data()->size();
                _intervals.emplace_back(index, *state.data());
            } else if (state.isText() || state.dictionary() || state.array()) {
                listed.content = "tree";
                listed.size = leavesOf(state);
                _trees.push_back(state);
            } else if (state) {
                wrong(formatted("entry %lu: \"DisplayState\"", index), state, "data");
            }
        } else {
            wrong(formatted("entry %lu", index), element, "a dictionary");
        }
        _listing.entries.push_back(std::move(listed));
    }
}

Bytes Snapshot::versionReport() const
{
    const Bytes dlf = _dlf ? _dlf->bytes() : Bytes();
    const Record record(dlf);
    const bool isReport = dlf.size() >= kDlfVersionReportSize && record.read(u16(0)) == kDlfVersionReportSize &&
                          record.read(u16(2)) == kVersionReport;
    return isReport ? dlf.first(kDlfVersionReportSize) : Bytes();
}

void Snapshot::recover(PropertyLists& lists, const std::function<void(Bytes)>& take) const
{
    for (const auto& tree : _trees) {
        if (const auto message = lists.toXml(tree))
            take(message->bytes());
        else
            _onFault({0, leavesOf(tree), "a tree cannot be serialised"});
    }
    // The stream does not contain the first byte of each interval.
    std::size_t accounted = versionReport().size();
    for (const auto& [entry, interval] : _intervals)
        accounted += interval.size() >= 2 ? interval.size() - 1 : 0;
    if (!_dlf || _dlf->size() <= accounted) {
        for (const auto& [entry, interval] : _intervals)
            read(interval.bytes(), 0, RecordReader::Origin::Interval, formatted("entry %lu", entry), take);
        return;
    }
    if (!_intervals.empty())
        _onFault({0, 0,
                  formatted(
                      "the DLF stream has %lu bytes, but the other entries account for only %lu: the stream is decoded",
                      _dlf->size(), accounted)});
    read(_dlf->bytes().subspan(versionReport().size()), versionReport().size(), RecordReader::Origin::Dlf,
         formatted("entry %lu", _dlfEntry), take);
}

void Snapshot::read(Bytes bytes, std::uint64_t from, RecordReader::Origin origin, const std::string& place,
                    const std::function<void(Bytes)>& take) const
{
    ByteWindow window(bytes);
    const auto report = [&](const CaptureFault& fault) {
        _onFault({fault.offset + from, fault.size, formatted("%s: %s", place, fault.reason)});
    };
    RecordReader reader(window, OnDamage::Search, report, origin);
    while (const auto message = reader.next())
        take(*message);
}

} // namespace kestrum::tools
