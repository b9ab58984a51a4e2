#ifndef VA_NODE_LEXICON_H
#define VA_NODE_LEXICON_H

#include <cstdint>

/// The numbers by which the framework's instrumentation names nodes and their properties.
/// The numbers are the contract; the names only make them readable.
namespace VA::NodeLexicon {

/// Kinds of managed nodes.
enum NodeType : std::uint32_t {
    OperatingSystemNode = 17,  ///< the operating system of the host
};

/// Properties of a node. The type behind each is the overload of Instrumentation::getProperty that
/// reads it; memory sizes are in kilobytes (1024 bytes).
enum Properties : std::uint32_t {
    Name = 108,                     ///< text; names the node
    OSType = 128,                   ///< number of the operating system, from 1 without gaps
    Version = 134,                  ///< text
    InstallDate = 139,              ///< text, "YYYY-MM-DD-HH:MM:SS"
    Distributed = 140,              ///< flag
    LastBootUpTime = 141,           ///< text, "YYYY-MM-DD-HH:MM:SS"
    MaxNumberOfProcesses = 142,     ///< count
    MaxProcessMemorySize = 143,     ///< kilobytes, 0 = unlimited
    NumberOfProcesses = 144,        ///< count
    NumberOfUsers = 145,            ///< count of user sessions
    NumberOfLicensedUsers = 146,    ///< count, 0 = unlimited
    TotalVirtualMemorySize = 147,   ///< kilobytes
    FreeVirtualMemory = 148,        ///< kilobytes
    FreePhysicalMemory = 149,       ///< kilobytes
    TotalVisibleMemorySize = 150,   ///< kilobytes
    TotalSwapSpaceSize = 151,       ///< kilobytes, 0 on a host without swap
    SizeStoredInPagingFiles = 152,  ///< kilobytes, 0 on a host without swap
    FreeSpaceInPagingFiles = 153,   ///< kilobytes, 0 on a host without swap
};

}  // namespace VA::NodeLexicon

#endif
