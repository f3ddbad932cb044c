// Reports and errors of the importer.
#include "tools/importer/ImportStar.h"

int64_t ImportReport::Skipped() const
{
    int64_t total = 0;
    for (const auto& [reason, count] : skipped)
        total += count;
    return total;
}

namespace {

std::string Describe(const std::string& file, int64_t line, const std::string& reason)
{
    return line > 0 ? file + ":" + std::to_string(line) + ": " + reason : file + ": " + reason;
}

} // namespace

ImportError::ImportError(const std::string& file, int64_t line, const std::string& reason)
    : std::runtime_error(Describe(file, line, reason))
    , file(file)
    , line(line)
    , reason(reason)
{
}
