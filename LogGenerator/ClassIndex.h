#pragma once

#include "LogGenerator/Base.h"
#include "LogGenerator/ParsedOnce.h"

#include <memory>

namespace kestrum {

/// The sections of one technology, by name and by log code. A technology's subclass creates and owns them.
class ClassIndex {
public:
    explicit ClassIndex(DecodingRoles& decodingRoles);
    virtual ~ClassIndex();
    ClassIndex(const ClassIndex&) = delete;
    ClassIndex& operator=(const ClassIndex&) = delete;

    /// The section of that name; null when there is none.
    Base* getClass(std::string_view sectionName) const;
    /// The sections that subscribed to the code, in order of creation; null when there are none.
    const std::vector<Base*>* getSubscribers(LogCode logCode) const;
    /// All codes as decimal texts, sorted as texts.
    std::vector<std::string> getAllLogCodes() const;
    /// Logs the kind of the registry; diagnostics only.
    void status() const;

protected:
    template <typename Section>
    std::unique_ptr<Section> create()
    {
        auto section = std::make_unique<Section>(roles);
        section->initWithDict(classDict, codeDictionary);
        return section;
    }

    DecodingRoles roles; ///< as given, but `propertyLists` is `_parsedOnce`
    ClassDictionary classDict;
    CodeDictionary codeDictionary;

private:
    ParsedOnce _parsedOnce; ///< used by the sections
};

} // namespace kestrum
