#pragma once

#include <string>
#include <string_view>

#include "host/mof/MofSyntax.h"

namespace cmpihost::mof {

/// Reads a MOF text: class declarations with qualifiers, properties, references and methods.
/// Qualifier declarations and instances are checked for their form and left out; pragmas other
/// than include are passed over. Throws MofError on the first thing that is not MOF; file is the
/// name that it shows. The form of MOF nests nowhere deeper than a list in a qualifier, and
/// neither does this reader: any input costs time and memory in proportion to its length.
Document parse(std::string_view text, const std::string& file);

}  // namespace cmpihost::mof
