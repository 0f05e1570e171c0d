#include "LogGenerator/ZPH_GSM/SimInfo.h"

#include "LogGenerator/PropertyListRecord.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

struct File {
    std::string_view key; ///< in the service's dictionary
    std::string_view shownAs;
};

// clang-format off
constexpr File kFiles[] = {
    {"kSimFile_ICCID",    "EF-ICCID"},
    {"kSimFile_MSISDN",   "EF-MSISDN"},
    {"kSimFile_MBDN",     "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN",   "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI",     "EF-LOCI"},
    {"kSimFile_PSLOCI",   "EF-GPRS/PS-LOCI"},
    {"kSimFile_ACC",      "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD",       "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN",    "EF-FPLMN"},
    {"kSimFile_AHPLMN",   "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE",  "EF-RAT MODE"},
    {"kSimFile_PNN",      "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL",      "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = kSimFilesRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "SIM Info",
    .layouts = kLayouts,
    .entryLine = "SimInfo",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

LogCode_0xFF0000::LogCode_0xFF0000(Record record, DecodingRoles& roles)
    : _files(propertyListIn(record, roles).dictionary())
{
    if (_files)
        return;
    roles.log.write(Priority::Error, "SIM File dictionary data could not be constructed");
    throw UnknownDataException();
}

SimInfo::SimInfo(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void SimInfo::decode(Record data, const Layout&)
{
    const LogCode_0xFF0000 record(data, roles);
    for (const auto& file : kFiles)
        if (const Value* contents = record.files()->find(file.key))
            publish(file.shownAs, *contents);
}

} // namespace kestrum
