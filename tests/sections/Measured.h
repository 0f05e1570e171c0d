#pragma once

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"
#include "capture/CaptureReader.h"
#include "sections/RecordBuilder.h"
#include "sections/TechnologyRun.h"

#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// The units of a display's readings: a line "Section/Key: unit" for each key, "a number" without a unit, "a text"
/// without a number.
class Measured {
public:
    using Units = std::set<std::string>;

    void look(const Value& display) { look(display, "", "", ""); }

    /// The same by path, as panes show it, but without the indexes of rows. Texts that are no readings are among them.
    const std::map<std::string, Units>& byPath() const { return _byPath; }

    std::string lines() const
    {
        std::string all = "\n";
        for (const auto& [key, units] : _units) {
            all += key + ':';
            for (const auto& unit : units)
                all += (unit == *units.begin() ? " " : ", ") + unit;
            all += '\n';
        }
        return all;
    }

private:
    void look(const Value& node, const std::string& section, const std::string& key, const std::string& path)
    {
        if (const auto dictionary = node.dictionary()) {
            for (const auto& entry : *dictionary)
                if (entry.key != kSortedKey)
                    look(entry.value, key.empty() ? section : key, entry.key,
                         path + '/' + entry.key.substr(entry.key.find(';') + 1));
        } else if (const auto array = node.array()) {
            for (const auto& element : *array)
                look(element, element.dictionary() ? key : section, element.dictionary() ? "" : key, path);
        } else if (const auto reading = node.reading()) {
            note(_units[section + '/' + key], *reading);
            note(_byPath[path], *reading);
            check(section + '/' + key, *reading);
        } else if (node.isText()) {
            _byPath[path]; // without a unit, unless a reading gives one
        }
    }

    static void note(Units& units, const Reading& reading)
    {
        if (!reading.number()) {
            if (units.empty())
                units.insert("a text");
            return;
        }
        units.erase("a text");
        units.insert(reading.unit().empty() ? "a number" : std::string(reading.unit()));
    }

    static void check(const std::string& key, const Reading& reading)
    {
        if (!reading.number())
            return;
        // The unit is the one in the text, and the number the one before it.
        const std::string text = reading.text();
        EXPECT_NE(text.find(reading.unit()), std::string::npos) << key << ": " << text;
        const auto digits = text.find_first_of("-+0123456789");
        ASSERT_NE(digits, std::string::npos) << key << ": " << text;
        EXPECT_NEAR(std::stod(text.substr(digits)), *reading.number(), 0.0051) << key << ": " << text;
    }

    std::map<std::string, Units> _units, _byPath;
};

/// Cells of every technology, serving and neighbour, with all numbers that the service sends.
inline Value everyCell()
{
    auto cells = makeArray();
    for (const char* technology : {"GSM", "UMTS", "LTE", "UTRAN2"})
        for (const char* type : {"Serving", "Neighbor"}) {
            auto cell = makeDictionary({{"kVoxCell_Technology", std::string("kVoxCellTechnology_") + technology},
                                        {"kVoxCell_Type", std::string("kVoxCellType_") + type}});
            for (const char* number : {"MCC", "MNC", "LAC", "TAC", "CellId", "PhysicalCellId", "BandInfo", "ARFCN",
                                       "UARFCN", "ScramblingCode", "RSCP", "EcNo", "RSSI"})
                cell->set(std::string("kVoxCell_") + number, 7);
            cells->append(cell);
        }
    return cells;
}

/// Reads the display after each record that the generator requests, with several contents, and after a list of cells.
template <typename Generator>
Measured measuredBy(std::string_view templateName, const std::vector<RecordBuilder>& others = {})
{
    TechnologyRun<Generator> run(templateName);
    Measured measured;
    const auto receive = [&](Bytes message) {
        run.receive(message);
        measured.look(run.display());
    };
    const auto codes = run.generator->getStartCommand()->at("SetZephraLogCodes").array();
    for (const auto& code : *codes)
        for (const unsigned content : {0x00u, 0x01u, 0x02u, 0x19u, 0x21u})
            receive(record(static_cast<LogCode>(*code.integer()), 1000).fill(13, content).bytes());
    for (const auto& other : others)
        receive(other.bytes());
    const auto built = record(0xFF0001, RecordBuilder::kHeaderSize);
    std::vector<std::byte> bytes(built.bytes().begin(), built.bytes().end());
    const auto list = run.codec.toXml(everyCell());
    bytes.insert(bytes.end(), list->bytes().begin(), list->bytes().end());
    receive(bytes);
    return measured;
}

/// A reselection candidate of each radio access technology.
inline std::vector<RecordBuilder> candidates()
{
    std::vector<RecordBuilder> all;
    for (const int technology : {0, 1, 2, 3, 4})
        all.push_back(record(0xB186, 40).u8(19, 1).u16(23, technology));
    return all;
}

/// The same for the messages of a sample capture.
template <typename Generator>
void readCapture(const std::string& name, TechnologyRun<Generator>& run, Measured& measured)
{
    std::ifstream file(inCheckout("captures/" + name + ".kcap"), std::ios::binary);
    ByteWindow window(file);
    const auto reader = CaptureReader::make(CaptureFormat::Kcap, window, OnDamage::Stop, [](const CaptureFault&) {});
    while (const auto message = reader->next()) {
        run.receive(*message);
        measured.look(run.display());
    }
}

/// The sample capture of CDMA, and records that occur only in traffic.
inline Measured measuredInTheCdmaCapture()
{
    TechnologyRun<C2KLogGenerator> run("C2KTemplate");
    Measured measured;
    readCapture("cdma", run, measured);
    run.receive(record(0x1183, 50).u8(36, 5).bytes());                                  // connected
    run.receive(record(0x119D, 60).u8(14, 1).u8(17, 11).u16(19, 40).u8(41, 1).bytes()); // a bad frame
    measured.look(run.display());
    return measured;
}

} // namespace kestrum
