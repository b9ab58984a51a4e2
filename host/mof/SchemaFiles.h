#ifndef HOST_MOF_SCHEMA_FILES_H
#define HOST_MOF_SCHEMA_FILES_H

#include <filesystem>
#include <vector>

#include "host/mof/MofAst.h"

namespace cmpihost {

/// Reads MOF files, in the order given. Of a folder, and the folders in it, those that end in
/// ".mof", by their names; what they include is not followed, since a folder is read as a whole. A
/// file that is given itself is followed by the files that it includes, whose names are relative to
/// it, and so on. A file that is met again, by whatever name, is read once. Throws mof::MofError
/// for a file that is no MOF or includes one that is not there, std::runtime_error for a folder or
/// a file that cannot be read and for one that is no regular file.
std::vector<mof::Document> readSchemaFiles(const std::vector<std::filesystem::path>& paths);

}  // namespace cmpihost

#endif
