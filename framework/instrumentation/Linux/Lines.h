#ifndef VA_LINUX_LINES_H
#define VA_LINUX_LINES_H

#include <string_view>

namespace VA::Linux {

/// Calls `visit(line, ended)` for each line of `text`, without its newline. `ended` is false only
/// for a last line that has none, which may have been cut short.
template <class Visit>
void forEachLine(std::string_view text, Visit visit) {
    while (!text.empty()) {
        const auto newline = text.find('\n');
        const bool ended = newline != std::string_view::npos;
        visit(text.substr(0, newline), ended);
        text.remove_prefix(ended ? newline + 1 : text.size());
    }
}

}  // namespace VA::Linux

#endif
