#pragma once

#include "platform/FileSystem.h"
#include "support/Format.h"

#include <map>
#include <set>
#include <string>
#include <utility>

namespace kestrum {

/// A device with the paths and files that the test adds.
class MemoryFileSystem final : public FileSystem {
public:
    bool exists(std::string_view path) const override { return paths.contains(path); }
    std::string diagnosticLogDirectory() const override { return logDirectory; }
    Configuration configuration(std::string_view name) const override
    {
        Configuration found{formatted("/config/%@", name)};
        if (const auto text = configurations.find(name); text != configurations.end())
            found.text = text->second;
        if (found.text.size() > kLongestConfiguration) {
            found.text.clear();
            found.problem = Problem{"it is too long"};
        }
        return found;
    }
    Stored create(const std::string& path, const std::function<void(const Write&)>& contents) override
    {
        std::string text;
        contents([&text](Bytes bytes) { text += textOf(bytes); });
        if (!writable)
            return Stored::Failed;
        return files.emplace(path, std::move(text)).second ? Stored::Written : Stored::NameTaken;
    }

    std::set<std::string, std::less<>> paths;
    std::map<std::string, std::string, std::less<>> configurations; ///< by name
    std::map<std::string, std::string, std::less<>> files;          ///< created ones, and their contents
    std::string logDirectory = "/logs";
    bool writable = true;
};

} // namespace kestrum
