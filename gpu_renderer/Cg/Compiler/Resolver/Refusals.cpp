#include <Cg/Compiler/Resolver/Refusals.h>

#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <cstddef>

namespace cg {

namespace {

constexpr std::size_t MAX_SUGGESTED_NAME = 40;

/// Number of single-letter changes from one name to the other; stops counting above the limit.
std::size_t editDistance(Name a, Name b, std::size_t limit) {
    if (a.size() > b.size() + limit || b.size() > a.size() + limit)
        return limit + 1;
    std::vector<std::size_t> row(b.size() + 1);
    for (std::size_t j = 0; j <= b.size(); ++j)
        row[j] = j;
    for (std::size_t i = 1; i <= a.size(); ++i) {
        std::size_t diagonal = row[0];
        row[0] = i;
        for (std::size_t j = 1; j <= b.size(); ++j) {
            const std::size_t above = row[j];
            row[j] = std::min({row[j] + 1, row[j - 1] + 1, diagonal + (a[i - 1] == b[j - 1] ? 0U : 1U)});
            diagonal = above;
        }
    }
    return row[b.size()];
}

} // namespace

std::string suggestion(Name name, const std::vector<Name>& known) {
    if (name.size() < 2 || name.size() > MAX_SUGGESTED_NAME)
        return {};
    const std::size_t limit = name.size() < 4 ? 1 : 2;
    Name best;
    std::size_t bestDistance = limit + 1;
    for (const Name candidate : known) {
        if (candidate == name)
            continue; // known, but with an error of its own
        const std::size_t distance = editDistance(name, candidate, limit);
        if (distance < bestDistance || (distance == bestDistance && distance <= limit && candidate < best)) {
            bestDistance = distance;
            best = candidate;
        }
    }
    return bestDistance <= limit ? "; did you mean " + inQuotes(best) + "?" : std::string();
}

std::string noMatchingFunction(Name name, const std::vector<TypedExpr*>& arguments) {
    std::string types;
    for (const TypedExpr* argument : arguments)
        types += (types.empty() ? "" : ", ") + nameOf(argument->type);
    return "no matching function " + inQuotes(name) + " for (" + types + ")";
}

} // namespace cg
