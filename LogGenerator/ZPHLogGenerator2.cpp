#include "LogGenerator/ZPHLogGenerator2.h"

#include "platform/Bundle.h"
#include "platform/ChannelMessage.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "support/Format.h"

#include <charconv>
#include <utility>

namespace kestrum {
namespace {

/// Logged before the members are initialised.
DecodingRoles& announced(DecodingRoles& roles, const ClassIndex* index)
{
    roles.log.write(Priority::Error, "Creating ZPHLogGenerator2 object with %p", roles.log.shownAddress(index));
    return roles;
}

} // namespace

ZPHLogGenerator2::ZPHLogGenerator2(DecodingRoles& roles, std::string pListName, std::unique_ptr<ClassIndex> cIndexObj)
    : ZPHLogGenerator(announced(roles, cIndexObj.get())),
      _pListName(std::move(pListName)),
      _cIndex(std::move(cIndexObj))
{
    // The number of the index's owners, always 1.
    _roles.log.write(Priority::Error, "Class Index: %ld", 1L);
}

ZPHLogGenerator2::~ZPHLogGenerator2()
{
    // Kept: the line names the GSM generator for every technology; field logs show it so.
    _roles.log.write(Priority::Warning, "ZPH_GSMLogGenerator is destructed %p", _roles.log.shownAddress(this));
}

void ZPHLogGenerator2::updateState(State& state, Bytes withData)
{
    if (!isOwnDisplay(state))
        getDisplayFromState(state);
    // Before decoding, so that the raw message is kept when a decoder throws.
    appendToBinData(withData);
    updateWithData(withData);
}

void ZPHLogGenerator2::updateWithData(Bytes message)
{
    const auto read = ChannelMessage::read(message);
    if (!read || !_cIndex)
        return;
    if (!read->isOfKnownType()) {
        _roles.log.write(Priority::Error, "Invalid log type: %x. Dropping.", read->type);
        return;
    }
    if (const auto* subscribers = _cIndex->getSubscribers(read->logCode))
        for (Base* section : *subscribers)
            section->updateWithData(read->record, read->logCode);
}

std::optional<std::vector<Value>> ZPHLogGenerator2::nodesOf(LogCode code) const
{
    std::vector<Value> nodes;
    if (const auto* subscribers = _cIndex ? _cIndex->getSubscribers(code) : nullptr)
        for (const Base* section : *subscribers)
            if (Value node = section->node())
                nodes.push_back(std::move(node));
    return nodes;
}

Value ZPHLogGenerator2::processTemplate(const Value& node) const
{
    if (node.isText())
        return node;
    if (const auto dictionary = node.dictionary()) {
        auto processed = makeDictionary();
        for (const auto& [key, value] : *dictionary) {
            const Value child = processTemplate(value);
            if (child.isNull())
                continue;
            if (Base* section = _cIndex ? _cIndex->getClass(key) : nullptr)
                section->updateSectionRef(child);
            processed->set(key, child);
        }
        return processed;
    }
    if (const auto array = node.array()) {
        auto processed = makeArray();
        for (const auto& element : *array)
            if (Value child = processTemplate(element))
                processed->append(std::move(child));
        return processed;
    }
    _roles.log.write(Priority::Error, "Received an object of unknown type");
    _roles.log.write(Priority::Error, "Processing the template");
    return {};
}

void ZPHLogGenerator2::printDict(const Value& node) const
{
    if (node.isText())
        return;
    if (const auto dictionary = node.dictionary()) {
        for (const auto& entry : *dictionary)
            printDict(entry.value);
    } else if (const auto array = node.array()) {
        for (const auto& element : *array)
            printDict(element);
    } else {
        _roles.log.write(Priority::Error, "Received an object of unknown type");
    }
}

Value ZPHLogGenerator2::loadTemplate(State& state) const
{
    if (Value known = state.at(StateKey::kTemplate))
        return known;
    const auto path = _roles.bundle.pathForResource(_pListName, "plist");
    const Value loaded = path ? _roles.propertyLists.load(*path) : Value();
    if (!loaded.dictionary()) {
        _roles.log.write(Priority::Error, "Cannot load template for display");
        return {};
    }
    state.set(StateKey::kTemplate, loaded);
    return loaded;
}

bool ZPHLogGenerator2::isOwnDisplay(const State& state) const
{
    const Value* display = state.find(StateKey::kDisplay);
    return display != nullptr && display->borrowedDictionary() != nullptr &&
           display->borrowedDictionary() == _display.dictionary();
}

Value ZPHLogGenerator2::getDisplayFromState(State& state)
{
    if (isOwnDisplay(state))
        return state.at(StateKey::kDisplay);

    dropForeignDisplay(state);
    const Value existing = state.at(StateKey::kDisplay);
    if (originOfDisplay(state) == Origin::Own) {
        takeOver(loadTemplate(state), existing);
        _display = SectionRef(existing);
    }
    if (existing)
        return existing;

    const Value loaded = loadTemplate(state);
    if (!loaded)
        return {};
    _roles.log.write(Priority::Warning, "Initialized class index: %p, Self: %p", _roles.log.shownAddress(_cIndex.get()),
                     _roles.log.shownAddress(this));
    if (_cIndex)
        _cIndex->status();
    const Value built = processTemplate(loaded);
    printDict(built);
    setDisplay(state, built);
    state.set(StateKey::kExtraInfo, makeDictionary());
    _display = SectionRef(built);
    return existing;
}

void ZPHLogGenerator2::takeOver(const Value& templateNode, const Value& displayNode) const
{
    const auto templates = templateNode.dictionary(), displayed = displayNode.dictionary();
    if (templates && displayed) {
        for (const auto& [key, value] : *templates) {
            const Value child = displayed->at(key);
            if (Base* section = _cIndex ? _cIndex->getClass(key) : nullptr)
                section->updateSectionRef(child);
            takeOver(value, child);
        }
    }
    const auto templateArray = templateNode.array(), displayedArray = displayNode.array();
    if (templateArray && displayedArray)
        for (std::size_t i = 0; i < templateArray->size() && i < displayedArray->size(); ++i)
            takeOver((*templateArray)[i], (*displayedArray)[i]);
}

Value ZPHLogGenerator2::generateLogUsingState(State& state)
{
    const Value display = getDisplayFromState(state);
    moveBinDataToState(state);
    updateHistoryInState(state);
    return display;
}

DictionaryRef ZPHLogGenerator2::getStartCommand() const
{
    auto ordinary = makeArray(), extra = makeArray();
    for (const auto& text : _cIndex ? _cIndex->getAllLogCodes() : std::vector<std::string>()) {
        LogCode code = 0;
        std::from_chars(text.data(), text.data() + text.size(), code);
        if (code >= ChannelMessage::kExtraCodes)
            extra->append(code - ChannelMessage::kExtraCodes);
        else
            ordinary->append(code);
    }
    return makeDictionary({{"SetState", "Streaming"}, {"SetZephraLogCodes", ordinary}, {"SetVoxExtraCodes", extra}});
}

} // namespace kestrum
