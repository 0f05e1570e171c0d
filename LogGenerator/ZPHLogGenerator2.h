#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator.h"

#include <memory>
#include <string>

namespace kestrum {

/// Base class for technologies with a template and sections: loads the template, gives each section its node, and
/// passes every record to the sections that subscribe to its code.
class ZPHLogGenerator2 : public ZPHLogGenerator {
public:
    ~ZPHLogGenerator2() override;

    /// Creates the display and the sections' references before it decodes the first record.
    void updateState(State& state, Bytes withData) override;
    /// Decodes one channel message and passes it to the sections of its code.
    void updateWithData(Bytes message);

    /// The nodes of the sections that take the code.
    std::optional<std::vector<Value>> nodesOf(LogCode code) const override;

    /// Copies a template node. A section whose name is a key gets the copied value as its node. Null for a value other
    /// than a dictionary, an array or a string.
    Value processTemplate(const Value& node) const;
    /// Walks a tree and logs values of unexpected kinds; diagnostics only.
    void printDict(const Value& node) const;

    /// The display in the state. Kept: the call that creates the display returns null, later calls return it.
    Value getDisplayFromState(State& state);
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;

protected:
    /// `pListName`: the template's resource name, without extension.
    ZPHLogGenerator2(DecodingRoles& roles, std::string pListName, std::unique_ptr<ClassIndex> cIndexObj);
    /// A generator without template and sections: its functions do nothing.
    ZPHLogGenerator2(DecodingRoles& roles, Uninitialized uninitialized) : ZPHLogGenerator(roles, uninitialized) {}

private:
    /// Whether the sections refer to nodes of the display in the state.
    bool isOwnDisplay(const State& state) const;
    Value loadTemplate(State& state) const;
    /// Gives the sections the nodes of a display that an earlier generator built from the same template. Walks template
    /// and display together: only the template's keys can be sections.
    void takeOver(const Value& templateNode, const Value& displayNode) const;

    std::string _pListName;
    std::unique_ptr<ClassIndex> _cIndex;
    SectionRef _display; ///< the display with the sections' nodes
};

} // namespace kestrum
