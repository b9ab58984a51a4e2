#ifndef HOST_CLI_TERMINAL_H
#define HOST_CLI_TERMINAL_H

#include <cstddef>
#include <string>
#include <string_view>

namespace cmpihost {

/// What can be shown where a stream ends. A plain value; any thread may read it.
struct Terminal {
    /// The columns of a line; 0: it is no terminal, and lines are as long as their text.
    std::size_t width = 0;
    /// Whether the locale has UTF-8, so that lines can be drawn and any text can be shown.
    bool utf8 = true;

    /// A text as it is to be written: control characters escaped, and on a terminal that has no
    /// UTF-8 every other character that is not ASCII, too, as \u00e9 or \U0001f600. Elsewhere
    /// such characters stay, for what reads them is no terminal and may be a request.
    std::string shown(std::string_view text) const;
};

/// The terminal behind a file descriptor. Its width is what it tells itself, else what COLUMNS
/// says, else 80. The locale is read from LC_ALL, LC_CTYPE or LANG, the first that is not empty;
/// the process keeps the locale that it has, for a provider in it may depend on that.
Terminal terminalOf(int descriptor);

/// The columns that a text takes: two for wide characters such as ideographs, none for marks that
/// combine with the character before. Control characters and bytes that are no characters count
/// as one; they are to be escaped first.
std::size_t columnsOf(std::string_view text);

/// A text that is broken at blanks, so that its lines take `width` columns at most. The first line
/// begins where the caller stands, in column `indent`; all others begin with as many blanks. A
/// word that is too long keeps its line for itself; a line end in the text stays one. The text is
/// as it was where the width is 0 or leaves hardly any room beside the indent.
std::string wrap(std::string_view text, std::size_t width, std::size_t indent = 0);

}  // namespace cmpihost

#endif
