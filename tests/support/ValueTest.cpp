#include "support/Value.h"
#include "support/Format.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>
#include <string>
#include <utility>
#include <vector>

namespace kestrum {
namespace {

constexpr Quantity kLevel{[](Quantity::Raw raw) { return raw == 0 ? "Not Present" : formatted("-%lu dBm", raw); },
                          [](Quantity::Raw raw) { return raw == 0 ? NAN : -static_cast<double>(raw); }, "dBm"};
// the same text for different quantities
constexpr Quantity kRatio{[](Quantity::Raw raw) { return formatted("-%lu dBm", raw); }};
constexpr Quantity kOnOff{[](Quantity::Raw raw) { return std::string(raw != 0 ? "on" : "off"); }};

std::string percent(double share)
{
    return formatted("%.1f%%", share);
}
constexpr Quantity kShare = computedQuantity<percent>("%");

using namespace std::chrono_literals;

TEST(Value, KnowsItsKind)
{
    EXPECT_EQ(Value().kind(), Value::Kind::Null);
    EXPECT_EQ(Value("text").kind(), Value::Kind::String);
    EXPECT_EQ(Value(-1).kind(), Value::Kind::Integer);
    EXPECT_EQ(Value(UINT64_MAX).kind(), Value::Kind::Integer);
    EXPECT_EQ(Value(0.5f).kind(), Value::Kind::Real);
    EXPECT_EQ(Value(true).kind(), Value::Kind::Boolean);
    EXPECT_EQ(Value(Date(1s)).kind(), Value::Kind::Date);
    EXPECT_EQ(Value(Data()).kind(), Value::Kind::Data);
    EXPECT_EQ(Value(makeArray()).kind(), Value::Kind::Array);
    EXPECT_EQ(Value(makeDictionary()).kind(), Value::Kind::Dictionary);
    EXPECT_EQ(nameOf(Value::Kind::Dictionary), "dictionary");
}

TEST(Value, OfANullReferenceIsNull)
{
    EXPECT_TRUE(Value(ArrayRef()).isNull());
    EXPECT_TRUE(Value(DictionaryRef()).isNull());
    EXPECT_FALSE(Value());
    EXPECT_TRUE(Value(false)); // true if there is a value, even the value false
}

TEST(Value, GivesNothingOfAnotherKind)
{
    const Value text = "1";
    EXPECT_FALSE(text.integer() || text.unsignedInteger() || text.real() || text.boolean() || text.date());
    EXPECT_FALSE(text.array() || text.dictionary() || text.data() != nullptr || text.int32());
    EXPECT_EQ(Value(1).text(), std::nullopt);
    EXPECT_FALSE(Value(1).real() || Value(1.0).integer() || Value(true).integer());
}

TEST(Value, TellsSignedFromUnsigned)
{
    EXPECT_NE(Value(-1), Value(UINT64_MAX));
    EXPECT_EQ(Value(-1).integer(), -1);
    EXPECT_FALSE(Value(-1).unsignedInteger());
    EXPECT_EQ(Value(UINT64_MAX).unsignedInteger(), UINT64_MAX);
    EXPECT_FALSE(Value(UINT64_MAX).integer());
    EXPECT_EQ(Value(1u), Value(1));
    EXPECT_EQ(Value(std::uint64_t{INT64_MAX}), Value(INT64_MAX));
    EXPECT_FALSE(Value(std::uint64_t{INT64_MAX} + 1).integer());
}

TEST(Value, ConvertsTo32BitsOnlyWithoutLoss)
{
    EXPECT_EQ(Value(INT32_MIN).int32(), INT32_MIN);
    EXPECT_EQ(Value(INT32_MAX).int32(), INT32_MAX);
    EXPECT_FALSE(Value(std::int64_t{INT32_MAX} + 1).int32());
    EXPECT_FALSE(Value(std::int64_t{INT32_MIN} - 1).int32());
    EXPECT_FALSE(Value(UINT64_MAX).int32());
    EXPECT_EQ(Value(262.0).int32(), 262);
    EXPECT_EQ(Value(-2147483648.0).int32(), INT32_MIN);
    EXPECT_FALSE(Value(2147483648.0).int32());
    EXPECT_FALSE(Value(0.5).int32());
    EXPECT_FALSE(Value(std::nan("")).int32());
    EXPECT_FALSE(Value(HUGE_VAL).int32());
    EXPECT_FALSE(Value(true).int32());
    EXPECT_FALSE(Value("1").int32());
}

TEST(Value, TakesTextOverWhateverItHeld)
{
    Value value = makeArray();
    value.assignText("a");
    EXPECT_EQ(value, Value("a"));
    value.assignText("");
    EXPECT_EQ(value, Value(""));
}

TEST(Value, CopiesShareTheirContainer)
{
    const Value original = makeArray({1});
    const Value copy = original;
    copy.array()->append(2);
    EXPECT_EQ(original, Value(makeArray({1, 2})));
}

TEST(Value, AShallowCopySharesTheChildren)
{
    const Value original = makeDictionary({{"cells", makeArray()}});
    const Value copy = shallowCopy(original);
    copy.dictionary()->set("more", 1);
    copy.dictionary()->at("cells").array()->append("x");
    EXPECT_FALSE(original.dictionary()->contains("more"));
    EXPECT_EQ(original.dictionary()->at("cells"), Value(makeArray({"x"})));
}

TEST(Value, ADeepCopySharesOnlyData)
{
    const Data data(bytesOf("raw"));
    const Value original = makeDictionary({{"cells", makeArray({makeArray()})}, {"raw", data}});
    const Value copy = deepCopy(original);
    EXPECT_EQ(copy, original);
    (*copy.dictionary()->at("cells").array())[0].array()->append("x");
    EXPECT_NE(copy, original);
    EXPECT_TRUE(copy.dictionary()->at("raw").data()->sharesStorageWith(data));
}

TEST(Value, ComparesContents)
{
    EXPECT_EQ(Value(makeDictionary({{"a", 1}, {"b", 2}})), Value(makeDictionary({{"b", 2}, {"a", 1}})));
    EXPECT_NE(Value(makeDictionary({{"a", 1}})), Value(makeDictionary({{"a", 1}, {"b", 2}})));
    EXPECT_NE(Value(makeArray({1, 2})), Value(makeArray({2, 1})));
    EXPECT_NE(Value(makeArray({1})), Value(makeArray({1, 2})));
    EXPECT_EQ(Value(Data(bytesOf("a"))), Value(Data(bytesOf("a"))));
    EXPECT_NE(Value(-1), Value(-2));
    EXPECT_NE(Value(1), Value(1.0));
    EXPECT_NE(Value(true), Value(1));
    EXPECT_NE(Value(""), Value());
}

TEST(Value, DescribesItselfOnOneLine)
{
    EXPECT_EQ(describe(makeDictionary({{"key", "text"},
                                       {"list", makeArray({1, UINT64_MAX, 2.5, true, Data(bytesOf("abc")), Value()})},
                                       {"date", Date(1s)}})),
              "{\"key\": \"text\", \"list\": [1, 18446744073709551615, 2.500000, true, <3 bytes>, null], "
              "\"date\": 1970-01-01 00:00:01 +0000}");
}

TEST(Array, RemovesFromItsStart)
{
    Array array{1, 2, 3};
    array.removeFirst(2);
    EXPECT_EQ(Value(makeArray({3})), Value(std::make_shared<Array>(array)));
    array.removeFirst(1);
    array.removeFirst(0);
    EXPECT_TRUE(array.empty());
}

std::string keysOf(const Dictionary& dictionary)
{
    std::string keys;
    for (const auto& entry : dictionary)
        keys += entry.key + " ";
    return keys;
}

TEST(Dictionary, KeepsTheOrderInWhichKeysCame)
{
    Dictionary dictionary{{"b", 1}, {"a", 2}};
    dictionary.set("c", 3);
    dictionary.set("a", 4);
    EXPECT_EQ(keysOf(dictionary), "b a c ");
    EXPECT_EQ(dictionary.at("a"), Value(4));
    dictionary.remove("b");
    dictionary.remove("not there");
    dictionary.set("b", 5);
    EXPECT_EQ(keysOf(dictionary), "a c b ");
}

TEST(Dictionary, GivesNothingForAnUnknownKey)
{
    const Dictionary dictionary{{"a", Value()}};
    EXPECT_TRUE(dictionary.contains("a"));
    EXPECT_FALSE(dictionary.contains(""));
    EXPECT_EQ(dictionary.find("b"), nullptr);
    EXPECT_TRUE(dictionary.at("b").isNull());
}

TEST(Dictionary, SetsTextInPlace)
{
    Dictionary dictionary;
    dictionary.setText("a", "first");
    dictionary.setText("a", "second");
    EXPECT_EQ(dictionary.at("a"), Value("second"));
    EXPECT_EQ(dictionary.size(), 1u);
}

TEST(Dictionary, FindsEveryKeyOfMany)
{
    // Above a few dozen keys an index is used. It has to follow every change.
    Dictionary dictionary;
    for (int i = 0; i < 1000; ++i)
        dictionary.set(std::to_string(i), i);
    for (int i = 999; i >= 0; --i)
        ASSERT_EQ(dictionary.at(std::to_string(i)), Value(i));
    for (int i = 0; i < 980; i += 2)
        dictionary.remove(std::to_string(i));
    for (int i = 0; i < 1000; ++i)
        ASSERT_EQ(dictionary.contains(std::to_string(i)), i % 2 == 1 || i >= 980) << i;
    Dictionary copy = dictionary;
    for (int i = 1; i < 1000; i += 2)
        copy.remove(std::to_string(i));
    EXPECT_EQ(keysOf(copy), "980 982 984 986 988 990 992 994 996 998 ");
    EXPECT_EQ(dictionary.size(), 510u);
    copy.clear();
    EXPECT_TRUE(copy.empty());
    EXPECT_FALSE(copy.contains("980"));
    copy.set("980", 1);
    EXPECT_EQ(copy.at("980"), Value(1));
}

TEST(Array, FillsItsRowsAgainWhenItStartsOver)
{
    Array list;
    const Dictionary* first = &list.appendRow();
    list.startOver();
    EXPECT_TRUE(list.empty());
    Dictionary& again = list.appendRow();
    EXPECT_EQ(&again, first);
    EXPECT_EQ(list.size(), 1u);
}

TEST(Array, KeepsARowWithAnotherOwnerUnchanged)
{
    Array list;
    list.appendRow().setText("RSSI", "-71 dBm");
    const auto held = list[0].dictionary();
    list.startOver();
    list.appendRow().setText("RSSI", "-90 dBm");
    EXPECT_EQ(held->at("RSSI"), Value("-71 dBm"));
    EXPECT_EQ(list[0].dictionary()->at("RSSI"), Value("-90 dBm"));
}

TEST(Array, HoldsWhatCameSinceItStartedOver)
{
    Array list{"a", makeDictionary({{"key", "b"}}), "c"};
    list.startOver();
    list.appendRow().setText("other", "d");
    list.appendText("e");
    EXPECT_EQ(Value(std::make_shared<Array>(list)), Value(makeArray({makeDictionary({{"other", "d"}}), "e"})));
    list.append("f");
    list.append("g");
    EXPECT_EQ(list.size(), 4u);
    EXPECT_EQ(list.back(), Value("g"));
}

TEST(Array, ReleasesItsElementsWhenItIsCleared)
{
    const auto held = makeDictionary();
    Array list{held, "text"};
    list.startOver();
    EXPECT_EQ(held.use_count(), 2);
    list.clear();
    EXPECT_EQ(held.use_count(), 1);
    Dictionary dictionary{{"key", held}};
    dictionary.clear();
    EXPECT_TRUE(dictionary.empty());
    EXPECT_EQ(held.use_count(), 1);
}

TEST(Dictionary, TellsKeysApartThatDifferInOneByte)
{
    for (std::size_t size = 1; size <= 33; ++size)
        for (std::size_t at = 0; at < size; ++at) {
            const std::string key(size, 'a');
            std::string other = key;
            other[at] = 'b';
            Dictionary dictionary{{key, "left behind"}};
            dictionary.startOver();
            dictionary.setText(other, "new"); // the spare has the other key
            EXPECT_EQ(describe(makeDictionary({{other, "new"}})), describe(std::make_shared<Dictionary>(dictionary)))
                << size << " " << at;
            dictionary.startOver();
            dictionary.setText(other, "again");
            EXPECT_EQ(dictionary.size(), 1u);
            EXPECT_EQ(dictionary.at(other), "again");
        }
}

TEST(Dictionary, ReusesSparesInAnyOrderAndUnderOtherKeys)
{
    Dictionary dictionary{{"a", "1"}, {"b", "2"}, {"c", "3"}};
    dictionary.startOver();
    for (const char* key : {"c", "d", "a", "b", "c"})
        dictionary.setText(key, std::string("new ") + key);
    EXPECT_EQ(describe(std::make_shared<Dictionary>(dictionary)),
              R"({"c": "new c", "d": "new d", "a": "new a", "b": "new b"})");
}

TEST(Array, DropsItsSparesAndNothingElse)
{
    const auto kept = makeDictionary(), spare = makeDictionary();
    Array list{kept, spare};
    list.startOver();
    list.append(kept);
    list.dropSpares();
    EXPECT_EQ(list.size(), 1u);
    EXPECT_EQ(kept.use_count(), 2);
    EXPECT_EQ(spare.use_count(), 1);
}

TEST(Dictionary, DropsItsSparesAndNothingElse)
{
    const auto kept = makeDictionary(), spare = makeDictionary();
    Dictionary dictionary{{"kept", kept}, {"spare", spare}};
    dictionary.startOver();
    dictionary.set("kept", kept);
    dictionary.dropSpares();
    EXPECT_EQ(dictionary.size(), 1u);
    EXPECT_EQ(kept.use_count(), 2);
    EXPECT_EQ(spare.use_count(), 1);
    EXPECT_TRUE(dictionary.slot("spare").isNull());
}

TEST(Value, BecomesTheContainerThatItHolds)
{
    Value value;
    value.becomeArray().appendText("4");
    const Array* array = value.array().get();
    EXPECT_EQ(&value.becomeArray(), array);
    EXPECT_TRUE(array->empty());
    value.becomeDictionary().setText("RSSI", "-71 dBm");
    EXPECT_EQ(value, Value(makeDictionary({{"RSSI", "-71 dBm"}})));
    const Dictionary* dictionary = value.borrowedDictionary();
    EXPECT_EQ(&value.becomeDictionary(), dictionary);
    EXPECT_TRUE(dictionary->empty());
}

TEST(Value, KeepsAContainerWithAnotherOwnerUnchanged)
{
    Value array = makeArray({"4"}), dictionary = makeDictionary({{"RSSI", "-71 dBm"}});
    const Value heldArray = array, heldDictionary = dictionary;
    EXPECT_TRUE(array.becomeArray().empty());
    EXPECT_TRUE(dictionary.becomeDictionary().empty());
    EXPECT_EQ(heldArray, Value(makeArray({"4"})));
    EXPECT_EQ(heldDictionary, Value(makeDictionary({{"RSSI", "-71 dBm"}})));
}

TEST(Reading, HasTextNumberAndUnit)
{
    const Reading level(kLevel, 71);
    EXPECT_EQ(level.text(), "-71 dBm");
    EXPECT_EQ(level.number(), -71.0);
    EXPECT_EQ(level.unit(), "dBm");
}

TEST(Reading, OfANameHasOnlyAText)
{
    const Reading name(kOnOff, 1);
    EXPECT_EQ(name.text(), "on");
    EXPECT_EQ(name.number(), std::nullopt);
    EXPECT_EQ(name.unit(), "");
}

TEST(Reading, OfAnAbsentValueHasOnlyAText)
{
    const Reading absent(kLevel, 0);
    EXPECT_EQ(absent.text(), "Not Present");
    EXPECT_EQ(absent.number(), std::nullopt);
    EXPECT_EQ(absent.unit(), "");
}

TEST(Reading, OfAComputedNumberKeepsAllOfIt)
{
    const auto share = Reading::computed(kShare, 1.0 / 3.0);
    EXPECT_EQ(share.text(), "0.3%");
    EXPECT_EQ(share.number(), 1.0 / 3.0);
    EXPECT_EQ(share.unit(), "%");
}

TEST(Reading, WithoutAFiniteNumberHasOnlyAText)
{
    for (const double none : {0.0 / 0.0, HUGE_VAL, -HUGE_VAL})
        EXPECT_EQ(Reading::computed(kShare, none).number(), std::nullopt);
    EXPECT_EQ(Reading::computed(kShare, -HUGE_VAL).text(), "-inf%");
}

TEST(Value, ReadingIsAString)
{
    const Value value = Reading(kLevel, 71);
    EXPECT_EQ(value.kind(), Value::Kind::String);
    EXPECT_TRUE(value.isText());
    EXPECT_EQ(value.text(), "-71 dBm");
    EXPECT_EQ(value.reading(), Reading(kLevel, 71));
    EXPECT_EQ(describe(value), "\"-71 dBm\"");
    EXPECT_EQ(Value("-71 dBm").reading(), std::nullopt);
}

TEST(Value, ComparesStringsAndReadingsByTheirTexts)
{
    EXPECT_EQ(Value(Reading(kLevel, 71)), Value(Reading(kLevel, 71)));
    EXPECT_EQ(Value(Reading(kLevel, 71)), Value(Reading(kRatio, 71)));
    EXPECT_EQ(Value(Reading(kLevel, 71)), Value("-71 dBm"));
    EXPECT_EQ(Value("-71 dBm"), Value(Reading(kLevel, 71)));
    EXPECT_NE(Value(Reading(kLevel, 71)), Value(Reading(kLevel, 72)));
    EXPECT_NE(Value(Reading(kLevel, 71)), Value("-72 dBm"));
    EXPECT_NE(Value("-72 dBm"), Value(Reading(kLevel, 71)));
    EXPECT_NE(Value(Reading(kLevel, 71)), Value(71));
}

TEST(Value, TakesAReadingInPlaceOfAnything)
{
    for (Value value : {Value(), Value("text"), Value(Reading(kOnOff, 0)), Value(makeArray({"4"}))}) {
        value.assign(Reading(kLevel, 71));
        EXPECT_EQ(value.reading(), Reading(kLevel, 71));
    }
}

TEST(Dictionary, FindsWithoutAnEffectOnWhatComesNext)
{
    // Keys that arrive in their old order reuse the existing entries, whatever is looked up in between.
    Dictionary dictionary{{"a", makeArray({"1"})}, {"b", makeArray({"2"})}};
    const Array* second = dictionary.at("b").array().get();
    dictionary.startOver();
    dictionary.slot("a");
    EXPECT_NE(std::as_const(dictionary).find("a"), nullptr);
    EXPECT_EQ(std::as_const(dictionary).find("b"), nullptr);
    EXPECT_EQ(dictionary.slot("b").array().get(), second);
}

TEST(Dictionary, SlotOfASpareEntryIsEmpty)
{
    const auto shared = makeDictionary({{"key", "shared"}});
    Dictionary dictionary{{"text", "old"},
                          {"reading", Reading(kLevel, 71)},
                          {"number", 5},
                          {"list", makeArray({"old"})},
                          {"row", makeDictionary({{"key", "old"}})},
                          {"shared", shared}};
    dictionary.startOver();
    EXPECT_EQ(dictionary.slot("text"), "");
    EXPECT_TRUE(dictionary.slot("reading").isNull());
    EXPECT_TRUE(dictionary.slot("number").isNull());
    EXPECT_EQ(dictionary.slot("list"), Value(makeArray()));
    EXPECT_EQ(dictionary.slot("row"), Value(makeDictionary()));
    EXPECT_TRUE(dictionary.slot("shared").isNull());
    EXPECT_TRUE(dictionary.slot("new").isNull());
    EXPECT_EQ(shared->at("key"), "shared");
}

TEST(Dictionary, SlotOfAKeyThatIsThereHoldsItsValue)
{
    Dictionary dictionary{{"text", "old"}};
    EXPECT_EQ(dictionary.slot("text"), "old");
}

TEST(Array, SlotOfASpareElementIsEmpty)
{
    Array list{"old", Reading(kLevel, 71), makeArray({"old"})};
    list.startOver();
    EXPECT_EQ(list.slot(), "");
    EXPECT_TRUE(list.slot().isNull());
    EXPECT_EQ(list.slot(), Value(makeArray()));
    EXPECT_TRUE(list.slot().isNull());
}

TEST(Dictionary, HoldsWhatCameSinceItStartedOver)
{
    std::mt19937 random(1);
    const auto below = [&](unsigned limit) { return static_cast<unsigned>(random() % limit); };
    Dictionary dictionary;
    for (int round = 0; round < 2000; ++round) {
        round % 10 == 0 ? dictionary.clear() : dictionary.startOver();
        std::vector<std::pair<std::string, std::string>> expected; // in the order of each key's first insertion
        for (unsigned set = below(70); set > 0; --set) {
            const auto key = "key " + std::to_string(below(round % 2 == 0 ? 5 : 80));
            const auto known = std::ranges::find(expected, key, &std::pair<std::string, std::string>::first);
            if (below(8) == 0) {
                dictionary.remove(key);
                if (known != expected.end())
                    expected.erase(known);
                continue;
            }
            const auto text = std::to_string(set);
            dictionary.setText(key, text);
            if (known != expected.end())
                known->second = text;
            else
                expected.emplace_back(key, text);
        }
        std::vector<std::pair<std::string, std::string>> found;
        for (const auto& [key, value] : dictionary)
            found.emplace_back(key, *value.text());
        ASSERT_EQ(found, expected) << "round " << round;
        for (const auto& [key, text] : expected)
            ASSERT_EQ(dictionary.at(key), Value(text)) << "round " << round;
    }
}

TEST(Data, SharesItsBytes)
{
    const Data data(bytesOf("raw"));
    const Data copy = data;
    EXPECT_TRUE(copy.sharesStorageWith(data));
    EXPECT_FALSE(copy.sharesStorageWith(Data(bytesOf("raw"))));
    EXPECT_TRUE(Data().empty());
    EXPECT_EQ(Data().size(), 0u);
}

} // namespace
} // namespace kestrum
