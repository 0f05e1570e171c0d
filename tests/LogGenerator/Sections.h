#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator2.h"
#include "doubles/DecodingDoubles.h"

#include <functional>
#include <stdexcept>
#include <utility>

namespace kestrum {

/// A technology for these tests: "Cell" shows a byte of records 0x4001 and 0xFF0002, "Neighbors" lists the payload of
/// records 0x4001 and 0x4002, "Legend" takes no records. "Cell" throws on record 0x4003.
namespace sample {

inline std::vector<std::string>& calls()
{
    static std::vector<std::string> all;
    return all;
}

inline constexpr Row kCell[] = {{u8(13), "Channel", decimalSigned32}};
inline constexpr Layout kCellLayouts[] = {{.code = 0x4001, .minimumLength = 0, .rows = kCell},
                                          {.code = 0xFF0002, .minimumLength = 0, .rows = kCell},
                                          {.code = 0x4003}};
inline constexpr SectionTraits kCellTraits{.name = "Cell", .layouts = kCellLayouts};

class Cell final : public Base {
public:
    explicit Cell(DecodingRoles& decodingRoles) : Base(decodingRoles, kCellTraits) {}
    void updateWithData(Record data, LogCode logCode) override
    {
        calls().push_back(formatted("Cell %u %u", logCode, static_cast<std::uint32_t>(data.size())));
        if (logCode == 0x4003)
            throw std::runtime_error("broken record");
        publish(data, kCell);
    }
};

inline constexpr Layout kNeighborLayouts[] = {{.code = 0x4002}, {.code = 0x4001}};
inline constexpr SectionTraits kNeighborTraits{.name = "Neighbors", .layouts = kNeighborLayouts};

class Neighbors final : public Base {
public:
    explicit Neighbors(DecodingRoles& decodingRoles) : Base(decodingRoles, kNeighborTraits) {}
    void updateWithData(Record data, LogCode logCode) override
    {
        calls().push_back(formatted("Neighbors %u %u", logCode, static_cast<std::uint32_t>(data.size())));
        replaceArray(sectionRef, listed(data, Elements(13, 1), 255, u8(0), decimalSigned32));
    }
};

inline constexpr SectionTraits kLegendTraits{.name = "Legend"};

class Legend final : public Base {
public:
    explicit Legend(DecodingRoles& decodingRoles) : Base(decodingRoles, kLegendTraits) {}
    void updateWithData(Record, LogCode) override { calls().push_back("Legend"); }
};

class Index final : public ClassIndex {
public:
    using ClassIndex::ClassIndex;

private:
    // In the order of registration.
    std::unique_ptr<Base> objCell = create<Cell>(), objNeighbors = create<Neighbors>(), objLegend = create<Legend>();
};

class NoSections final : public ClassIndex {
public:
    using ClassIndex::ClassIndex;
};

class Generator final : public ZPHLogGenerator2 {
public:
    explicit Generator(DecodingRoles& roles, std::string_view technology = "sample")
        : ZPHLogGenerator2(roles, "Sample", std::make_unique<Index>(roles)), _technology(technology)
    {}
    Generator(DecodingRoles& roles, std::unique_ptr<ClassIndex> index)
        : ZPHLogGenerator2(roles, "Sample", std::move(index)), _technology("sample")
    {}
    explicit Generator(DecodingRoles& roles, Uninitialized uninitialized)
        : ZPHLogGenerator2(roles, uninitialized), _technology("sample")
    {}
    static std::unique_ptr<Generator> uninitialized(DecodingRoles& roles)
    {
        return std::make_unique<Generator>(roles, Uninitialized{});
    }

    std::string_view technology() const override { return _technology; }

private:
    std::string_view _technology;
};

/// Adds the template to the doubles: sections inside a dictionary, inside an array and at the top.
inline Value templateTree()
{
    return makeDictionary({{"Radio", makeDictionary({{"Cell", makeDictionary({{"Channel", ""}})}})},
                           {"Lists", makeArray({makeDictionary({{"Neighbors", makeArray({"none yet"})}})})},
                           {"Legend", "values in dBm"}});
}

} // namespace sample

/// The sample technology, with its template in the bundle.
struct SampleDoubles : DecodingDoubles {
    SampleDoubles()
    {
        bundle.paths = {"Sample.plist"};
        propertyLists.files["Sample.plist"] = sample::templateTree();
        sample::calls().clear();
    }

    State state;
};

} // namespace kestrum
