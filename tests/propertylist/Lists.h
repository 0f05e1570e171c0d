#pragma once

#include "harness/FileContents.h"
#include "harness/Places.h"
#include "harness/Scratch.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace kestrum {

/// The output of peer.py for `input`.
inline std::string peer(const std::string& arguments, const std::string& input)
{
    const ScratchDirectory scratch;
    std::ofstream(scratch / "in", std::ios::binary) << input;
    const std::string command = "python3 '" + inCheckout("tests/propertylist/peer.py") + "' " + arguments + " <'" +
                                scratch / "in" + "' >'" + scratch / "out" + "'";
    if (std::system(command.c_str()) != 0)
        throw std::runtime_error("Python's plistlib refuses");
    return contentsOf(scratch / "out");
}

inline bool peerIsThere()
{
    return std::system("python3 -c 'import plistlib' 2>/dev/null") == 0;
}

inline std::string bigEndian(std::uint64_t number, unsigned width)
{
    std::string text;
    while (width-- > 0)
        text += static_cast<char>(number >> 8 * width & 0xFF);
    return text;
}

inline std::string hex(const std::string& digits)
{
    std::string bytes;
    for (std::size_t i = 0; i + 1 < digits.size(); i += 2)
        bytes += static_cast<char>(std::stoi(digits.substr(i, 2), nullptr, 16));
    return bytes;
}

/// A binary property list from its objects' bytes, whose references to others take one byte. The values in the
/// trailer can be falsified.
struct BinaryList {
    std::vector<std::string> objects;
    std::uint64_t root = 0;
    unsigned tableWidth = 2;                           ///< the real width of an offset
    unsigned offsetWidth = 2, referenceWidth = 1;      ///< as stated in the trailer
    std::int64_t moreObjects = 0, moreTableOffset = 0; ///< added to the correct values

    std::string bytes() const
    {
        std::string text = "bplist00", table;
        for (const auto& object : objects) {
            table += bigEndian(text.size(), tableWidth);
            text += object;
        }
        const auto tableAt = text.size() + static_cast<std::uint64_t>(moreTableOffset);
        text += table + std::string(6, '\0') + bigEndian(offsetWidth, 1) + bigEndian(referenceWidth, 1);
        text += bigEndian(objects.size() + static_cast<std::uint64_t>(moreObjects), 8);
        return text + bigEndian(root, 8) + bigEndian(tableAt, 8);
    }
};

inline std::string repeated(const std::string& text, std::size_t count)
{
    std::string all;
    all.reserve(text.size() * count);
    while (count-- > 0)
        all += text;
    return all;
}

inline std::string xmlList(const std::string& inside)
{
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\">" + inside + "</plist>";
}

inline PropertyListCodec::Parsed parsed(const std::string& text)
{
    return PropertyListCodec().parseWithError(bytesOf(text));
}

/// The XML form; empty when there is none.
inline std::string xmlOf(const Value& value)
{
    const auto xml = PropertyListCodec().toXml(value);
    return xml ? std::string(textOf(xml->bytes())) : std::string();
}

/// A case of a parametrised test, listed by its name.
template <typename Expected>
struct NamedCase {
    const char* name;
    std::string input;
    Expected expected;

    friend void PrintTo(const NamedCase& shown, std::ostream* out) { *out << shown.name; }
};
inline constexpr auto caseName = [](const auto& each) { return std::string(each.param.name); };

} // namespace kestrum
