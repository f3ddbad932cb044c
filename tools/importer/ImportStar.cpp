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

void AddAlias(ImportStar& star, const std::string& name)
{
    if (name.empty() || name.find('\t') != std::string::npos)
        return;
    const std::string entry = name + '\t';
    // Whole entries only: "HD 1" must not be taken for the end of "HD 11".
    for (size_t at = star.aliases.find(entry); at != std::string::npos;
         at = star.aliases.find(entry, at + 1)) {
        if (at == 0 || star.aliases[at - 1] == '\t')
            return;
    }
    star.aliases += entry;
}

void AddAliases(ImportStar& star, const std::string& names)
{
    ForEachAlias(names, [&](const std::string& name) { AddAlias(star, name); });
}
