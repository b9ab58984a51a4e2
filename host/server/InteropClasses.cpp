#include "host/server/InteropClasses.h"

namespace cmpihost::server {

const char* const interopMof = R"mof(
   [Abstract, Version ( "1.0.0" ),
    Description ("Anything that is managed. Here: what the server is made of.")]
class CIM_ManagedElement {
      [Description ("A short text about the object. Not published.")]
   string Caption;

      [Description ("A text about the object.")]
   string Description;

      [Description ("A name for people to read.")]
   string ElementName;
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system.")]
class CIM_ManagedSystemElement : CIM_ManagedElement {
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system that is no hardware.")]
class CIM_LogicalElement : CIM_ManagedSystemElement {
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system that can be in use or not.")]
class CIM_EnabledLogicalElement : CIM_LogicalElement {
      [Description ("Whether it is in use."),
       ValueMap { "0", "1", "2", "3", "4", "5", "6", "7", "8", "9", "10", "11..32767",
          "32768..65535" },
       Values { "Unknown", "Other", "Enabled", "Disabled", "Shutting Down", "Not Applicable",
          "Enabled but Offline", "In Test", "Deferred", "Quiesce", "Starting", "DMTF Reserved",
          "Vendor Reserved" }]
   uint16 EnabledState;
};

   [Abstract, Version ( "1.0.0" ), Description ("What a system does for others.")]
class CIM_Service : CIM_EnabledLogicalElement {
      [Key, MaxLen ( 256 ), Propagated ( "CIM_System.CreationClassName" ),
       Description ("The class of the system that the service runs on.")]
   string SystemCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_System.Name" ),
       Description ("The name of the system that the service runs on.")]
   string SystemName;

      [Key, MaxLen ( 256 ), Description ("The class that the instance was made from.")]
   string CreationClassName;

      [Key, MaxLen ( 256 ), Description ("The name of the service on its system.")]
   string Name;

      [Description ("Whether the service runs.")]
   boolean Started;
};

   [Abstract, Version ( "1.0.0" ), Description ("A service by which WBEM clients ask a system.")]
class CIM_WBEMService : CIM_Service {
};

   [Version ( "1.0.0" ), Description ("The server that answers WBEM clients.")]
class CIM_ObjectManager : CIM_WBEMService {
      [Description (
          "Whether statistics are gathered by the model of the CIM schema: false. The counters of "
          "KORVA_ObjectManager always count.")]
   boolean GatherStatisticalData;
};

   [Version ( "1.0.0" ),
    Description (
       "This server, with counters of what it did since it was started. A request that is being "
       "answered is not counted yet.")]
class KORVA_ObjectManager : CIM_ObjectManager {
      [Counter, Description ("The operations and methods that were answered, failed ones too.")]
   uint64 Operations;

      [Counter, Description ("The operations and methods that ended with a status other than OK.")]
   uint64 FailedOperations;

      [Counter,
       Description (
          "The requests that were refused before they were understood as an operation: with an "
          "HTTP status other than 200.")]
   uint64 RefusedRequests;

      [Counter, Units ( "MicroSeconds" ),
       Description (
          "The time that the operations took, in sum; divided by Operations it is the mean. Of "
          "two that ran at once each counts in full.")]
   uint64 OperationTime;

      [Units ( "Seconds" ), Description ("The time since the server was started.")]
   uint64 UpTime;
};

   [Version ( "1.0.0" ), Description ("A namespace of the server; there is one for each.")]
class CIM_Namespace : CIM_ManagedElement {
      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.SystemCreationClassName" ),
       Description ("The class of the system that the server runs on.")]
   string SystemCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.SystemName" ),
       Description ("The name of the system that the server runs on.")]
   string SystemName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.CreationClassName" ),
       Description ("The class of the server: KORVA_ObjectManager.")]
   string ObjectManagerCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.Name" ),
       Description ("The name of the server.")]
   string ObjectManagerName;

      [Key, MaxLen ( 256 ), Description ("The class that the instance was made from.")]
   string CreationClassName;

      [Key, MaxLen ( 256 ), Description ("The name of the namespace, as requests have it.")]
   string Name;

      [Required,
       Description ("What kind of classes the namespace holds; 1 says nothing in particular.")]
   uint16 ClassInfo;
};

   [Version ( "1.0.0" ), Description ("A namespace, for clients that look for no other class.")]
class __Namespace {
      [Key, MaxLen ( 256 ), Description ("The whole name of the namespace, as requests have it.")]
   string Name;
};
)mof";

}  // namespace cmpihost::server
