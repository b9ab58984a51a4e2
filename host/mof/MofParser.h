#ifndef HOST_MOF_MOF_PARSER_H
#define HOST_MOF_MOF_PARSER_H

#include <string>
#include <string_view>

#include "host/mof/MofAst.h"

namespace cmpihost::mof {

/// Reads a MOF text as DMTF's DSP0004 lays it down: class declarations with qualifiers, properties,
/// references and methods, and qualifier declarations. Instances are checked for their form and
/// left out; pragmas other than include are passed over, and files that those name are not read.
/// Throws MofError on the first thing that is not MOF; file is the
/// name that it shows. The form of MOF nests nowhere deeper than a list in a qualifier, and
/// neither does this reader: any input costs time and memory in proportion to its length.
Document parse(std::string_view text, const std::string& file);

/// Reads one constant (NULL, TRUE, FALSE, a number, a character, a string) or a list of them in
/// braces, and nothing else. Throws MofError; name is what it shows in place of a file.
Initializer parseInitializer(std::string_view text, const std::string& name);

}  // namespace cmpihost::mof

#endif
