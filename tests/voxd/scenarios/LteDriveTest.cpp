#include "voxd/scenarios/ScenarioRun.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

class LteDrive : public testing::Test {
protected:
    std::string cell(std::string_view key) const { return textAt(run.display(), "Serving Cell Info", key); }

    ScenarioRun run{"lte"};
};

TEST_F(LteDrive, AllRecordsNameTheSameServingCell)
{
    int compared = 0;
    run.decodeFor(2min, [&] {
        const auto at = [&](const char* section, const char* key) { return textAt(run.display(), section, key); };
        if (run.code == 0xB17F) {
            EXPECT_EQ(at("Serving Cell Measurements", "Physical Cell ID"), cell("Physical Cell ID"));
            EXPECT_EQ(at("Serving Cell Measurements", "E-ARFCN"), cell("Download Frequency"));
        } else if (run.code == 0xB179) {
            EXPECT_EQ(at("Connected mode LTE Intra-frequency Measurement", "Serving Physical Cell ID"),
                      cell("Physical Cell ID"));
        } else if (run.code == 0xB186) {
            EXPECT_EQ(at("Reselection Candidates", "Serving Cell ID"), cell("Physical Cell ID"));
            EXPECT_EQ(at("Reselection Candidates", "Serving EARFCN"), cell("Download Frequency"));
        } else if (run.code == 0xFF0001) {
            EXPECT_EQ(cell("UARFCN"), cell("Download Frequency"));
        } else {
            return;
        }
        ++compared;
    });
    EXPECT_GT(compared, 3000);
}

// A cell monitor report also gives the cell's identity, in another form.
TEST_F(LteDrive, CellMonitorAgreesWithTheModem)
{
    std::string area, identity, band;
    run.decodeFor(2min, [&] {
        if (run.code == 0xB0C2) {
            area = cell("Tracking Area Code");
            identity = cell("Cell Identity");
            band = cell("Freq Band Indicator");
        } else if (run.code == 0xFF0001) {
            EXPECT_EQ(cell("Tracking Area Code"), area);
            EXPECT_EQ(cell("Cell Identity"), identity);
            EXPECT_EQ(cell("Freq Band Indicator"), band);
        }
    });
    EXPECT_FALSE(area.empty());
}

TEST_F(LteDrive, BandFrequencyAndBandwidthBelongTogether)
{
    std::set<std::string> bands;
    run.decodeFor(5min, [&] {
        if (run.code != 0xB0C2)
            return;
        bands.insert(cell("Freq Band Indicator"));
        if (cell("Freq Band Indicator") == "3") {
            EXPECT_EQ(cell("Download Frequency"), "1300");
            EXPECT_EQ(cell("Upload Frequency"), "19300");
            EXPECT_EQ(cell("Download Bandwidth"), "20 MHz");
        } else {
            EXPECT_EQ(cell("Download Frequency"), "6300");
            EXPECT_EQ(cell("Upload Frequency"), "24300");
            EXPECT_EQ(cell("Download Bandwidth"), "10 MHz");
        }
    });
    EXPECT_EQ(bands, (std::set<std::string>{"20", "3"}));
}

TEST_F(LteDrive, TheNeighborThatGrewStrongBecomesTheServingCell)
{
    std::string serving, frequency;
    std::set<std::string> neighbors; // since the last change
    int reselected = 0, heard = 0;
    run.decodeFor(4min, [&] {
        if (run.code == 0xB0C2 && cell("Physical Cell ID") != serving) {
            if (cell("Download Frequency") == frequency) {
                ++reselected;
                heard += neighbors.contains(cell("Physical Cell ID"));
            }
            serving = cell("Physical Cell ID");
            frequency = cell("Download Frequency");
            neighbors.clear();
        }
        const char* list = run.code == 0xB180   ? "Neighbor Cells List"
                           : run.code == 0xB179 ? "Measured Neighbor Cells"
                                                : "";
        eachText(nodeNamed(list, run.display()), "", [&](const std::string& path, const std::string& text) {
            if (path == "[]/Physical Cell ID")
                neighbors.insert(text);
        });
    });
    EXPECT_GE(reselected, 3);
    EXPECT_LE(reselected, 60);
    EXPECT_EQ(heard, reselected);
}

TEST_F(LteDrive, BothNetworksAndSeveralAreasAreVisited)
{
    std::set<std::string> areas, locations;
    run.decodeFor(8min, [&] {
        if (run.code != 0xB0C2 && run.code != 0xFF0000)
            return;
        areas.insert(cell("Tracking Area Code"));
        locations.insert(textAt(run.display(), "SIM Info", "EF-LOCI"));
    });
    areas.erase("");
    EXPECT_EQ(areas, (std::set<std::string>{"5377", "5378", "9473", "9474"}));
    EXPECT_GE(locations.size(), 4u);
}

} // namespace
} // namespace kestrum
