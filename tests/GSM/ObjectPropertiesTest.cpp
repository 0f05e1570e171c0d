// Properties of every tree that the modem can send.
#include "LogGenerator/GSM/GSMLogGenerator.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

rc::Gen<Value> trees(int depth)
{
    auto text = rc::gen::map(rc::gen::element(std::string(), std::string("x"), std::string("a longer text than most")),
                             [](std::string each) { return Value(std::move(each)); });
    if (depth == 0)
        return text;
    auto array = rc::gen::map(rc::gen::container<std::vector<Value>>(trees(depth - 1)),
                              [](std::vector<Value> elements) { return Value(makeArray(std::move(elements))); });
    auto dictionary =
        rc::gen::map(rc::gen::container<std::vector<Value>>(trees(depth - 1)), [](std::vector<Value> all) {
            auto made = makeDictionary();
            for (auto& each : all)
                made->set(std::to_string(made->size()), std::move(each));
            return Value(made);
        });
    return rc::gen::oneOf(text, array, dictionary);
}

bool hasWrapperBelow(const Value& node)
{
    const auto isWrapper = [](const Value& child) { return child.dictionary() && child.dictionary()->size() == 1; };
    bool found = false;
    if (const auto dictionary = node.dictionary())
        for (const auto& entry : *dictionary)
            found = found || isWrapper(entry.value) || hasWrapperBelow(entry.value);
    if (const auto array = node.array())
        for (const auto& element : *array)
            found = found || isWrapper(element) || hasWrapperBelow(element);
    return found;
}

RC_GTEST_PROP(AnyTree, HasNoWrapperBelowItsRootWhenTidied, ())
{
    const Value received = *rc::gen::resize(5, trees(4));
    const Value before = deepCopy(received);
    const Value tidied = GSMLogGenerator::processObject(received);
    RC_ASSERT(received == before);
    RC_ASSERT(tidied.kind() == received.kind());
    RC_ASSERT(!hasWrapperBelow(tidied));
    if (const auto array = received.array())
        RC_ASSERT(tidied.array()->size() + (array->empty() ? 0u : 1u) == array->size());
    if (const auto dictionary = received.dictionary())
        RC_ASSERT(tidied.dictionary()->size() == dictionary->size());
}

} // namespace
} // namespace kestrum
