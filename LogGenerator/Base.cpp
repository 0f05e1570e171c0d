#include "LogGenerator/Base.h"

#include "LogGenerator/ArrayLock.h"
#include "platform/RecordWatch.h"

#include <algorithm>
#include <iterator>

namespace kestrum {

void Base::initWithDict(ClassDictionary& classDict, CodeDictionary& codeDict)
{
    classDict[std::string(getSectionName())] = this;
    updateLogCodeDict(codeDict);
}

void Base::updateSectionRef(const Value& node)
{
    sectionRef = SectionRef(node);
    roles.log.write(Priority::Warning, getSectionName());
}

void Base::updateLogCodeDict(CodeDictionary& codeDict)
{
    roles.log.write(Priority::Warning, "Array Count: %d", static_cast<int>(_traits.layouts.size()));
    for (const auto& layout : _traits.layouts)
        codeDict[layout.code].push_back(this);
}

std::vector<LogCode> Base::getLogCodeArray() const
{
    std::vector<LogCode> codes;
    std::ranges::transform(_traits.layouts, std::back_inserter(codes), &Layout::code);
    return codes;
}

void Base::updateWithData(Record data, LogCode logCode)
{
    roles.log.write(_traits.entryPriority, _traits.entryLine);
    const auto known = std::ranges::find(_traits.layouts, logCode, &Layout::code);
    if (known == _traits.layouts.end() && _traits.foreignCode == ForeignCode::Reported)
        return reportUnknown(logCode);
    if (known == _traits.layouts.end() && _traits.foreignCode == ForeignCode::Ignored)
        return;
    const Layout foreign{logCode};
    const Layout& layout = known == _traits.layouts.end() ? foreign : *known;
    if (data.size() >= layout.minimumLength)
        decode(data, layout);
    else if (roles.watch != nullptr)
        roles.watch->tooShort();
}

void Base::decode(Record data, const Layout& layout)
{
    if (layout.list)
        replaceArray(sectionRef,
                     listed(data, layout.list->elements, data.read(layout.list->count).value_or(0), layout.rows));
    else
        publish(data, layout.rows);
}

void Base::clearElementsInArray(const SectionRef& array)
{
    if (auto* node = array.array()) {
        const ArrayLocked locked;
        node->startOver();
    }
}

void Base::replaceArray(const SectionRef& array, std::vector<Value> With)
{
    replaceArray(array, [&With](Array& list) {
        for (Value& element : With)
            list.append(std::move(element));
    });
}

std::int16_t Base::lookUpECNO(std::uint32_t linear)
{
    // A step begins one above the number given here: -1 dB from 417648, -2 dB from 331809, ...
    constexpr std::uint32_t kAbove[] = {417647, 331808, 263624, 209463, 166441, 132268, 105123, 83562,
                                        66435,  52830,  42023,  33440,  26621,  21205,  16903,  13486,
                                        10771,  8615,   6902,   5542,   4461,   3603,   2921,   2240,
                                        1949,   1607,   1336,   1120,   949,    813,    705};
    if (linear >= 524288)
        return 0;
    // Counts all steps instead of a binary search: energies vary so much that the processor mispredicts its branches.
    const auto step = std::ranges::count_if(kAbove, [linear](std::uint32_t above) { return linear <= above; });
    // Kept: below the scale the result is 0, as at full scale.
    return step == std::ssize(kAbove) ? std::int16_t{0} : static_cast<std::int16_t>(-1 - step);
}

void Base::logError(std::string_view text) const
{
    roles.log.write(Priority::Error, text);
}

void Base::reportUnknown(LogCode logCode) const
{
    logError(formatted("Received an unknown log message: %d", static_cast<std::int32_t>(logCode)));
}

void Base::publish(Record data, std::span<const Row> rows) const
{
    if (auto* node = sectionRef.dictionary())
        show(data, rows, *node);
}

void Base::publish(std::string_view key, std::string_view text) const
{
    if (auto* node = sectionRef.dictionary())
        node->setText(key, text);
}

void Base::publish(std::string_view key, Reading reading) const
{
    if (auto* node = sectionRef.dictionary())
        node->set(key, reading);
}

void Base::publish(std::string_view key, Value value) const
{
    if (auto* node = sectionRef.dictionary())
        node->set(key, std::move(value));
}

} // namespace kestrum
