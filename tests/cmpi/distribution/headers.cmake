# Headers of level 2.1, as a distribution may have them: those of include/cmpi with what that level adds.
# No slot moves; tables grow at their ends, and more is const.
#   cmake -DFROM=<include/cmpi> -DTO=<folder> -P headers.cmake
cmake_minimum_required(VERSION 3.25)

# edit(<header> <text> <text in its place>): fails when the header does not have the text.
function(edit header old new)
    file(READ "${TO}/${header}" text)
    string(FIND "${text}" "${old}" place)
    if(place EQUAL -1)
        message(FATAL_ERROR "${header} has no ${old}")
    endif()
    string(REPLACE "${old}" "${new}" text "${text}")
    file(WRITE "${TO}/${header}" "${text}")
endfunction()

# grow(<header> <struct> <members>): members at the end of a struct.
function(grow header struct members)
    file(READ "${TO}/${header}" text)
    string(REGEX MATCH "\nstruct ${struct} {.*" rest "${text}")
    string(FIND "${rest}" "\n};" length)
    if(length LESS 1)
        message(FATAL_ERROR "${header} has no struct ${struct}")
    endif()
    string(SUBSTRING "${rest}" 0 ${length} old)
    edit(${header} "${old}\n};" "${old}\n${members}\n};")
endfunction()

file(GLOB headers "${FROM}/*.h")
file(REMOVE_RECURSE "${TO}")
file(COPY ${headers} DESTINATION "${TO}")

edit(cmpidt.h "#define CMPIVersion200 200" "#define CMPIVersion200 200\n#define CMPIVersion210 210")
edit(cmpidt.h "#define CMPI_VERSION CMPIVersion200" "#define CMPI_VERSION CMPIVersion210")
edit(cmpidt.h "#if CMPI_VERSION == CMPIVersion200" "#if CMPI_VERSION >= CMPIVersion200")
edit(cmpidt.h "#define CMPICurrentVersion CMPIVersion200" "#define CMPICurrentVersion CMPIVersion210")
edit(cmpidt.h "typedef struct _CMPIDateTime CMPIDateTime;" [[typedef struct _CMPIDateTime CMPIDateTime;
typedef struct _CMPIPropertyList CMPIPropertyList;
typedef struct _CMPIEnumerationFilter CMPIEnumerationFilter;
typedef int CMPIVersion;]])
edit(cmpios.h "#define CMPI_THREAD_KEY_TYPE unsigned long int" "#define CMPI_THREAD_KEY_TYPE unsigned int")

grow(broker_tables.h _CMPIBrokerFT [[
    CMPIEnumeration* (*enumerateInstancesFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
        const CMPIObjectPath* op, const char** properties, const CMPIEnumerationFilter* filter, CMPIStatus* rc);
    CMPIEnumeration* (*associatorsFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
        const CMPIObjectPath* op, const char* assocClass, const char* resultClass, const char* role,
        const char* resultRole, const char** properties, const CMPIEnumerationFilter* filter, CMPIStatus* rc);
    CMPIEnumeration* (*referencesFiltered)(const CMPIBroker* mb, const CMPIContext* ctx,
        const CMPIObjectPath* op, const char* resultClass, const char* role, const char** properties,
        const CMPIEnumerationFilter* filter, CMPIStatus* rc);]])
grow(broker_tables.h _CMPIBrokerEncFT [[
    CMPIPropertyList* (*newPropertyList)(const CMPIBroker* mb, const char** properties, CMPIStatus* rc);
    CMPIString* (*newStringCP)(const CMPIBroker* mb, const char* data, const unsigned int cpid, CMPIStatus* rc);
    CMPIEnumerationFilter* (*newEnumerationFilter)(const CMPIBroker* mb, const char* filterQuery,
        const char* filterQueryLanguage, CMPIStatus* rc);]])
grow(broker_tables.h _CMPIBrokerExtFT [[
    CMPIStatus (*destroyMutex2)(CMPI_MUTEX_TYPE mutex);
    CMPIStatus (*lockMutex2)(CMPI_MUTEX_TYPE mutex);
    CMPIStatus (*unlockMutex2)(CMPI_MUTEX_TYPE mutex);
    CMPIStatus (*destroyCondition2)(CMPI_COND_TYPE cond);]])
grow(broker_tables.h _CMPIBrokerMemFT "    void (*freeChars)(const CMPIBroker* mb, char* chars);")
grow(object_tables.h _CMPIStringFT
    "    char* (*newCharsCP)(const CMPIString* self, const unsigned int cpid, CMPIStatus* rc);")
grow(mi_tables.h _CMPIInstanceMIFT [[
    CMPIStatus (*enumerateInstancesFiltered)(CMPIInstanceMI* mi, const CMPIContext* ctx,
        const CMPIResult* rslt, const CMPIObjectPath* op, const char** properties,
        const CMPIEnumerationFilter* filter);]])
grow(mi_tables.h _CMPIAssociationMIFT [[
    CMPIStatus (*associatorsFiltered)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
        const CMPIObjectPath* op, const char* assocClass, const char* resultClass, const char* role,
        const char* resultRole, const char** properties, const CMPIEnumerationFilter* filter);
    CMPIStatus (*referencesFiltered)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
        const CMPIObjectPath* op, const char* resultClass, const char* role, const char** properties,
        const CMPIEnumerationFilter* filter);]])
grow(mi_tables.h _CMPIIndicationMIFT [[
    CMPIStatus (*authorizeFilterCollection)(CMPIIndicationMI* mi, const CMPIContext* ctx,
        const CMPIInstance* collInst, const char* owner);
    CMPIStatus (*activateFilterCollection)(CMPIIndicationMI* mi, const CMPIContext* ctx,
        const CMPIInstance* collInst, CMPIBoolean firstActivation);
    CMPIStatus (*deActivateFilterCollection)(CMPIIndicationMI* mi, const CMPIContext* ctx,
        const CMPIInstance* collInst, CMPIBoolean lastDeactivation);]])

edit(mi_tables.h "(*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* ctx,"
    "(*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,")
edit(mi_tables.h "    int miVersion;" "    const CMPIVersion miVersion;")
edit(broker_tables.h "int severity" "CMPISeverity severity")
edit(broker_tables.h "int level" "CMPILevel level")
edit(broker_tables.h "unsigned int brokerVersion" "CMPIVersion brokerVersion")
edit(object_tables.h "CMPISint32 ftVersion" "int ftVersion")
foreach(header broker_tables.h mi_tables.h object_tables.h)
    file(READ "${TO}/${header}" text)
    string(REPLACE "    int ftVersion" "    const CMPIVersion ftVersion" text "${text}")
    string(REGEX REPLACE "    (const )?void\\* hdl" "    const void* hdl" text "${text}")
    string(REGEX REPLACE "    (CMPI[A-Za-z]+FT\\*) " "    const \\1 " text "${text}")
    file(WRITE "${TO}/${header}" "${text}")
endforeach()
