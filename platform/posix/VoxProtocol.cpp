#include "platform/posix/VoxProtocol.h"

#include "support/Format.h"
#include "support/Record.h"

namespace kestrum::vox {

std::string addressOfPort(std::string_view name, int process)
{
    return formatted("%s.%d", name, process);
}

std::vector<std::byte> encode(const LogChannelAnswer& answer)
{
    std::vector<std::byte> bytes;
    for (const std::int32_t word : {answer.errorDomain, answer.errorCode})
        for (unsigned shift = 0; shift < 32; shift += 8)
            bytes.push_back(static_cast<std::byte>(static_cast<std::uint32_t>(word) >> shift));
    const Bytes name = bytesOf(answer.remotePort ? std::string_view(*answer.remotePort) : std::string_view());
    bytes.insert(bytes.end(), name.begin(), name.end());
    return bytes;
}

std::optional<LogChannelAnswer> decodeAnswer(Bytes payload)
{
    const Record record(payload);
    const auto domain = record.read(u32(0)), code = record.read(u32(4));
    if (!domain || !code)
        return std::nullopt;
    LogChannelAnswer answer{static_cast<std::int32_t>(*domain), static_cast<std::int32_t>(*code), std::nullopt};
    if (payload.size() > 8)
        answer.remotePort = textOf(payload.subspan(8));
    return answer;
}

} // namespace kestrum::vox
