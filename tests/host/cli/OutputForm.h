#ifndef TESTS_HOST_CLI_OUTPUT_FORM_H
#define TESTS_HOST_CLI_OUTPUT_FORM_H

#include <string>

/// Why a text is no JSON of a form that docs/cmpihost.schema.json defines ("instances", "tree"), or
/// of any with an empty name; a line for each thing that is wrong. Empty: it is such JSON.
std::string complaintOnJson(const std::string& text, const std::string& form = {});

/// Why a text is no MOF; empty: it is.
std::string complaintOnMof(const std::string& text);

#endif
