#include "voxd/scenarios/TelephonyReports.h"

#include "platform/TelephonyService.h"
#include "support/Format.h"

namespace kestrum {
namespace {

std::string plmnHex(const Plmn& plmn)
{
    std::string text;
    for (const int octet : plmnOctets(plmn))
        text += formatted("%02x", static_cast<unsigned>(octet));
    return text;
}

} // namespace

DictionaryRef cellReport(std::string_view technology, std::string_view type,
                         std::initializer_list<Dictionary::Entry> numbers)
{
    auto cell = makeDictionary(
        {{std::string(kVoxCell_Technology), Value(technology)}, {std::string(kVoxCell_Type), Value(type)}});
    for (const auto& number : numbers)
        cell->set(number.key, number.value);
    return cell;
}

DictionaryRef simReport(const Plmn& registered, int locationArea, int routingArea)
{
    const auto area = plmnHex(registered) + formatted("%04x", static_cast<unsigned>(locationArea));
    return makeDictionary({
        {"kSimFile_ICCID", Value("8900101000000012345")},
        {"kSimFile_MSISDN", Value("+00100012345678")},
        {"kSimFile_MBDN", Value("+001000999")},
        {"kSimFile_HPPLMN", Value("06")},
        {"kSimFile_LOCI", Value("5a0f3c21" + area + "0000")},
        {"kSimFile_PSLOCI",
         Value("c1a60b7e00d41c" + area + formatted("%02x", static_cast<unsigned>(routingArea)) + "00")},
        {"kSimFile_ACC", Value("0020")},
        {"kSimFile_AD", Value("00000002")},
        {"kSimFile_FPLMN", Value("99f999ffffffffffffffffff")},
        {"kSimFile_AHPLMN", Value(plmnText(World::kHome))},
        {"kSimFile_RATMODE", Value("02")},
        {"kSimFile_PNN", Value("Test Network")},
        {"kSimFile_OPL", Value(plmnHex(World::kHome) + "0000fffe01")},
        {"kSimFile_OPLMNAcT", Value(plmnHex(World::kHome) + "4080" + plmnHex(World::kAbroad) + "4080")},
    });
}

ArrayRef pdpReport(std::string_view radioAccess, bool userData)
{
    const auto context = [&](const char* name, int identity, const char* address, const char* type) {
        return makeDictionary({{"Access Point Name", Value(name)},
                               {"Context ID", std::to_string(identity)},
                               {"State", Value("Active")},
                               {"IP Address", Value(address)},
                               {"Traffic Class", Value(type)},
                               {"Radio Access", Value(radioAccess)}});
    };
    auto contexts = makeArray({context("ims.example", 5, "192.0.2.17", "Conversational")});
    if (userData)
        contexts->append(context("internet.example", 6, "198.51.100.4", "Interactive"));
    return contexts;
}

std::string plmnText(const Plmn& plmn)
{
    return formatted("%03d", plmn.mcc) +
           (plmn.mncDigits == 2 ? formatted("%02d", plmn.mnc) : formatted("%03d", plmn.mnc));
}

std::vector<int> plmnOctets(const Plmn& plmn)
{
    constexpr int kNoDigit = 0xF;
    const std::string digits = plmnText(plmn);
    const auto digit = [&](std::size_t at) { return at < digits.size() ? digits[at] - '0' : kNoDigit; };
    return {digit(0) + (digit(1) << 4), digit(2) + (digit(5) << 4), digit(3) + (digit(4) << 4)};
}

} // namespace kestrum
