#include "load/RecordShapes.h"

#include <sstream>

namespace load {
namespace {

bool isNumber(const std::string& text) {
    return !text.empty() && text.find_first_not_of("0123456789") == std::string::npos;
}

// "TIME PROCESS THREAD CHANNEL LEVEL CATEGORY FUNCTION FILE:LINE TEXT": the fields before the text,
// which alone may hold blanks. Fewer than eight: no record.
std::vector<std::string> fieldsOf(const std::string& line) {
    std::vector<std::string> fields;
    std::size_t begin = 0;
    while (fields.size() < 8) {
        const std::size_t end = line.find(' ', begin);
        if (end == std::string::npos) break;
        fields.push_back(line.substr(begin, end - begin));
        begin = end + 1;
    }
    return fields;
}

bool isTime(const std::string& text) {
    return text.size() == std::string("2026-01-01T00:00:00.000Z").size() && text.back() == 'Z';
}

// Whether the line is one whole record, and no second one begins within it.
bool isWhole(const std::string& line, const std::vector<std::string>& fields) {
    if (fields.size() < 8 || !isTime(fields[0])) return false;
    const std::string& place = fields[7];
    return isNumber(fields[1]) && isNumber(fields[2]) &&
           (fields[3] == "log" || fields[3] == "trace") && isNumber(fields[4]) &&
           isNumber(place.substr(place.rfind(':') + 1)) &&
           line.find("Z " + fields[1] + ' ', fields[0].size()) == std::string::npos;
}

}  // namespace

std::map<long, Shapes> shapesByThread(const std::string& log) {
    std::map<long, Shapes> result;
    std::istringstream stream(log);
    for (std::string line; std::getline(stream, line);) {
        const std::vector<std::string> fields = fieldsOf(line);
        if (stream.eof() || !isWhole(line, fields)) {
            result[-1].push_back(line);
            continue;
        }
        std::string shape;
        for (std::size_t field = 3; field < fields.size(); ++field) shape += fields[field] + ' ';
        result[std::stol(fields[2])].push_back(shape);
    }
    return result;
}

}  // namespace load
