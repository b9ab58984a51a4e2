// The numbers are the contract: other libraries of the same interface know nothing else.
#include "NodeLexicon.h"

namespace VA::NodeLexicon {

static_assert(sizeof(NodeType) == 4);
static_assert(OperatingSystemNode == 17);

static_assert(sizeof(Properties) == 4);
static_assert(Name == 108);
static_assert(OSType == 128);
static_assert(Version == 134);
static_assert(InstallDate == 139);
static_assert(Distributed == 140);
static_assert(LastBootUpTime == 141);
static_assert(MaxNumberOfProcesses == 142);
static_assert(MaxProcessMemorySize == 143);
static_assert(NumberOfProcesses == 144);
static_assert(NumberOfUsers == 145);
static_assert(NumberOfLicensedUsers == 146);
static_assert(TotalVirtualMemorySize == 147);
static_assert(FreeVirtualMemory == 148);
static_assert(FreePhysicalMemory == 149);
static_assert(TotalVisibleMemorySize == 150);
static_assert(TotalSwapSpaceSize == 151);
static_assert(SizeStoredInPagingFiles == 152);
static_assert(FreeSpaceInPagingFiles == 153);

}  // namespace VA::NodeLexicon
