#include "host/cli/Suggestion.h"

#include <algorithm>
#include <optional>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost {

namespace {

constexpr std::size_t mostSuggested = 3;

/// How many letters to insert, remove, replace or swap with their neighbour make one word the
/// other.
std::size_t editDistance(const std::string& from, const std::string& to) {
    std::vector<std::size_t> beforeLast;
    std::vector<std::size_t> last(to.size() + 1);
    for (std::size_t column = 0; column <= to.size(); ++column) last[column] = column;
    for (std::size_t row = 1; row <= from.size(); ++row) {
        std::vector<std::size_t> current(to.size() + 1, row);
        for (std::size_t column = 1; column <= to.size(); ++column) {
            const bool same = from[row - 1] == to[column - 1];
            current[column] = std::min(
                {last[column] + 1, current[column - 1] + 1, last[column - 1] + (same ? 0 : 1)});
            const bool swapped = row > 1 && column > 1 && from[row - 1] == to[column - 2] &&
                                 from[row - 2] == to[column - 1];
            if (swapped) current[column] = std::min(current[column], beforeLast[column - 2] + 1);
        }
        beforeLast = std::move(last);
        last = std::move(current);
    }
    return last.back();
}

/// The distance, if it is small enough for the length of what was written.
std::optional<std::size_t> nearness(const std::string& written, const std::string& known) {
    const std::size_t most = written.size() < 3 ? 1 : (written.size() + 3) / 4;
    const std::size_t distance = editDistance(written, known);
    // A word of which no letter remains was not meant.
    const bool near = distance <= most && distance < std::max(written.size(), known.size());
    return near ? std::optional(distance) : std::nullopt;
}

/// A class name without the part that says whose class it is.
std::string withoutPrefix(const std::string& name) {
    const std::size_t underscore = name.find('_');
    return underscore == std::string::npos ? name : name.substr(underscore + 1);
}

/// Smaller is nearer. A name of the same owner goes before one of another.
std::optional<std::size_t> rank(const std::string& written, const std::string& known) {
    const std::optional<std::size_t> whole = nearness(written, known);
    const std::optional<std::size_t> rest = nearness(withoutPrefix(written), withoutPrefix(known));
    if (!rest) return whole ? std::optional(2 * *whole) : std::nullopt;
    return std::min(2 * *rest + 1, 2 * whole.value_or(*rest + 1));
}

}  // namespace

std::vector<std::string> nearestNames(const std::string& name,
                                      const std::vector<std::string>& known) {
    std::vector<std::string> nearest;
    std::optional<std::size_t> best;
    const std::string written = base::toLower(name);
    for (const std::string& candidate : known) {
        const std::optional<std::size_t> found = rank(written, base::toLower(candidate));
        if (!found || (best && *found > *best)) continue;
        if (!best || *found < *best) nearest.clear();
        best = found;
        nearest.push_back(candidate);
    }
    std::sort(nearest.begin(), nearest.end());
    nearest.erase(std::unique(nearest.begin(), nearest.end()), nearest.end());
    if (nearest.size() > mostSuggested) nearest.resize(mostSuggested);
    return nearest;
}

std::string didYouMean(const std::string& name, const std::vector<std::string>& known) {
    const std::vector<std::string> nearest = nearestNames(name, known);
    std::string text;
    for (std::size_t index = 0; index < nearest.size(); ++index) {
        const char* before = index == 0                   ? "; did you mean "
                             : index + 1 < nearest.size() ? ", "
                                                          : " or ";
        text += before + base::escapeForTerminal(nearest[index]);
    }
    return text.empty() ? text : text + "?";
}

}  // namespace cmpihost
