#ifndef HOST_CLI_SUGGESTION_H
#define HOST_CLI_SUGGESTION_H

#include <string>
#include <vector>

namespace cmpihost {

/// The names of `known` that are nearest to `name`, in alphabetical order, at most three; none when
/// nothing is near enough to have been meant. Letter case does not count, and neither does the part
/// of a class name before the underscore: OperatingSystem is near to KORVA_OperatingSystem.
std::vector<std::string> nearestNames(const std::string& name,
                                      const std::vector<std::string>& known);

/// The same as the end of a complaint: "; did you mean X or Y?", safe to print on a terminal; empty
/// when nothing is near.
std::string didYouMean(const std::string& name, const std::vector<std::string>& known);

}  // namespace cmpihost

#endif
