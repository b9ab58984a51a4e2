#ifndef TESTS_LOAD_RECORD_SHAPES_H
#define TESTS_LOAD_RECORD_SHAPES_H

#include <map>
#include <string>
#include <vector>

namespace load {

/// Records without what threads may mix: channel, level, category, function and place, in order.
using Shapes = std::vector<std::string>;

/// The shapes of the records of a log by the thread that wrote them. A line that is not one whole
/// record is filed under the thread -1.
std::map<long, Shapes> shapesByThread(const std::string& log);

}  // namespace load

#endif
