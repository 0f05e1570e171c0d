#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator.h"

#include <memory>
#include <string>

namespace kestrum {

/// The generator of the technologies whose display is a template filled in by sections: loads the template, hands
/// each section its node, and routes every record to the sections that subscribe to its code.
class ZPHLogGenerator2 : public ZPHLogGenerator {
public:
    ~ZPHLogGenerator2() override;

    /// The display and the section references are made before the first record is decoded.
    void updateState(State& state, Bytes withData) override;
    /// Decodes and routes one channel message.
    void updateWithData(Bytes message);

    /// A copy of a template node, in which each section whose name is met gets its own node. Null for what a
    /// template cannot hold: anything but dictionaries, arrays and strings.
    Value processTemplate(const Value& node) const;
    /// Walks a tree and logs what it does not know; diagnostics only.
    void printDict(const Value& node) const;

    /// The display in the state. The call that creates it returns null on purpose: only later ones return it.
    Value getDisplayFromState(State& state);
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;

protected:
    /// `pListName`: the template's resource name, without extension.
    ZPHLogGenerator2(DecodingRoles& roles, std::string pListName, std::unique_ptr<ClassIndex> cIndexObj);
    /// A generator without template and sections: every call on it is harmless.
    ZPHLogGenerator2(DecodingRoles& roles, Uninitialized uninitialized) : ZPHLogGenerator(roles, uninitialized) {}

private:
    /// Whether the display in the state is the one whose nodes the sections hold.
    bool isOwnDisplay(const State& state) const;
    Value loadTemplate(State& state) const;
    /// Gives the sections the nodes of a display that an earlier generator built from the same template. Walks both
    /// side by side: only keys that the template has can be sections.
    void takeOver(const Value& templateNode, const Value& displayNode) const;

    std::string _pListName;
    std::unique_ptr<ClassIndex> _cIndex;
    SectionRef _display; ///< whose nodes the sections hold
};

} // namespace kestrum
