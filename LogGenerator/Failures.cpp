#include "LogGenerator/Failures.h"

#include "support/Format.h"

namespace kestrum {
namespace {

std::string fileName(const std::string& file)
{
    return file.empty() ? "<Unknown File>" : file;
}

} // namespace

AssertionFailure::AssertionFailure(const std::string& operation, const std::string& object, const std::string& file,
                                   int line, std::string description)
    : std::runtime_error(
          formatted("Assertion failure in %s of %s, %s:%d: %s", operation, object, fileName(file), line, description)),
      _file(fileName(file)),
      _line(line),
      _description(std::move(description))
{}

} // namespace kestrum
