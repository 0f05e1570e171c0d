#include "LogGenerator/ZPH_GSM/PDPContextList.h"

#include "LogGenerator/PropertyListRecord.h"

namespace kestrum {
namespace {

constexpr Layout kLayouts[] = {
    {.code = kPdpContextsRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "PDP Context Info",
    .layouts = kLayouts,
    .entryLine = "PDPContextList",
    .foreignCode = ForeignCode::Decoded,
};

} // namespace

PDPContextList::PDPContextList(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void PDPContextList::decode(Record data, const Layout&)
{
    if (const auto contexts = PDPContextArray(data, roles).contexts())
        replaceArray(sectionRef, {contexts->begin(), contexts->end()});
}

} // namespace kestrum
