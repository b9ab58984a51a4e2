#pragma once

#include <string>

#include "host/mof/MofSyntax.h"

namespace cmpihost::mof {

/// Reads a number as MOF writes it: decimal, octal (leading 0), hexadecimal (0x), binary (trailing
/// b) or real, each with an optional sign. Returns false with a complaint when it is none of these
/// or does not fit 64 bits.
bool readNumber(const std::string& written, Scalar& value, std::string& complaint);

}  // namespace cmpihost::mof
