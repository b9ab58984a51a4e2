#ifndef TESTS_FAULTS_FILE_FAULTS_H
#define TESTS_FAULTS_FILE_FAULTS_H

#include <string>

/// The program's own open, read, opendir, readdir and statx: let calls fail that are made for files
/// below one folder. Other files are read as ever. All for one thread.
namespace fileFaults {

enum class Fault {
    Missing,      ///< open, opendir, statx: ENOENT
    Denied,       ///< open, opendir, statx: EACCES
    Gone,         ///< open: the file is removed for good a moment before
    Error,        ///< read, readdir: EIO
    Garbage,      ///< read: other bytes, as many, to the end of the file
    CutShort,     ///< read: one byte, and the end of the file after it
    Piecemeal,    ///< read: one byte, the others by the next call
    Interrupted,  ///< open, read: EINTR
};

/// From now on until release(), the n-th call (from 1) of those that `fault` can befall, below the
/// folder `root`, meets it.
void meet(Fault fault, unsigned n, const std::string& root);

/// What was met: nothing fails any more. The path, relative to the root, that the call was for;
/// "(none)" when there were fewer calls.
std::string release();

}  // namespace fileFaults

#endif
