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
    /// The sections that subscribed to the code, in their order; null when there are none.
    const std::vector<Base*>* getSubscribers(LogCode logCode) const;
    /// The decimal texts of all codes, in the order of the texts.
    std::vector<std::string> getAllLogCodes() const;
    /// Logs what the registry is; diagnostics only.
    void status() const;

protected:
    template <typename Section>
    std::unique_ptr<Section> create()
    {
        auto section = std::make_unique<Section>(roles);
        section->initWithDict(classDict, codeDictionary);
        return section;
    }

    DecodingRoles roles; ///< as given, but for the property lists
    ClassDictionary classDict;
    CodeDictionary codeDictionary;

private:
    ParsedOnce _parsedOnce; ///< the sections', through `roles`
};

} // namespace kestrum
