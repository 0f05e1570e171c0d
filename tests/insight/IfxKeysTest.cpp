#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "insight/keys/KeyEntry.h"
#include "platform/TelephonyService.h"
#include "sections/Measured.h"
#include "voxd/scenarios/Scenario.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

// Ten minutes of the scenario: calls with all their values are among them.
TEST(Keys, OfTheIfxScenarioAreComplete)
{
    TechnologyRun<GSMLogGenerator> run("LTE"); // IFX has no template
    const auto source = makeScenario("ifx", {1, {}, run.codec});
    Measured measured;
    for (int messages = 0; messages < 1200; ++messages) {
        run.receive(source->next()->bytes);
        measured.look(run.display());
    }
    std::set<const KeyEntry*> used;
    for (const auto& [path, units] : measured.byPath()) {
        const KeyEntry* entry = keyEntryAt(kVoxLogChannelTechnology_IFX, path);
        EXPECT_NE(entry, nullptr) << path << " has no entry";
        used.insert(entry);
    }
    for (const auto& section : sectionEntries(kVoxLogChannelTechnology_IFX))
        for (const auto& entry : section.keys)
            EXPECT_TRUE(used.contains(&entry)) << section.name << '/' << entry.key << ": no such key";
}

} // namespace
} // namespace kestrum
