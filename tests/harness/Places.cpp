#include "harness/Places.h"

// The only file that is compiled with paths of the machine, so a compiler cache can serve all others in any checkout.
std::string kestrum::inCheckout(std::string_view path)
{
    return std::string(KESTRUM_SOURCE_DIR "/").append(path);
}

std::string kestrum::builtProgram(std::string_view name)
{
    return std::string(KESTRUM_PROGRAMS_DIR "/").append(name);
}
