#pragma once

#include "LogGenerator/Base.h"

#include <exception>

namespace kestrum {

/// The telephony service's SIM record: a dictionary of elementary files.
class LogCode_0xFF0000 {
public:
    /// The record holds no dictionary.
    class UnknownDataException : public std::exception {
    public:
        const char* what() const noexcept override { return "LogCode_0xFF0000::UnknownDataException"; }
    };

    /// Logs "SIM File dictionary data could not be constructed" and throws UnknownDataException when there is none.
    LogCode_0xFF0000(Record record, DecodingRoles& roles);

    /// Never null.
    const DictionaryRef& files() const { return _files; }

private:
    DictionaryRef _files;
};

/// Elementary files of the SIM (3GPP TS 31.102), each as the telephony service sends it, of any type. LTE and UTRAN
/// have this section too.
class SimInfo final : public Base {
public:
    explicit SimInfo(DecodingRoles& decodingRoles);

private:
    /// May throw LogCode_0xFF0000::UnknownDataException.
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
