#ifndef HOST_CLI_ARGUMENT_WORDS_H
#define HOST_CLI_ARGUMENT_WORDS_H

#include <string>
#include <vector>

#include "host/cli/CommandLine.h"

/// The words of a command line, one by one.
namespace cmpihost {

/// The arguments behind the program's name, last one first. An empty value that stands behind a
/// sign of equality becomes an argument of its own: the parser would take the next argument for it,
/// as it would for --log without a value.
std::vector<std::string> splitArguments(int argumentCount, const char* const* arguments);

/// Adds the names between commas; an empty text holds none.
void appendNames(const std::string& list, std::vector<std::string>& to);

/// The value of --format. Throws UsageError, with the words that there are.
Format parseFormat(const std::string& word);

/// Whether it may be meant as the value of --log.
bool beginsWithLogLevel(const std::string& text);

/// The value of --log, LEVEL[,CHANNEL]. Throws UsageError, with the words that there are.
LogRequest parseLogRequest(const std::string& text);

}  // namespace cmpihost

#endif
