// A row here is all that a command without habits of its own needs.
#include "host/cli/Commands.h"

namespace cmpihost {

namespace {

constexpr const char* classPath = "Path of the class: [NAMESPACE:]CLASS";
constexpr const char* instancePath = "Path of the instance: [NAMESPACE:]CLASS.KEY=VALUE,...";
constexpr const char* sourcePath = "Path of the instance to start from";
constexpr const char* objectPath = "Path of the class or instance that has the method";

CommandRow operation(const char* name, const char* help, Operation which, const char* path,
                     Takes takes, Filters filters, const char* example) {
    return {name, help, Command::Operation, which, path, takes, filters, example};
}

/// Of commands that ask no single provider.
CommandRow overview(const char* name, const char* help, Command which, Takes takes,
                    const char* example) {
    return {name,    help,  which,         Operation::EnumerateInstances,
            nullptr, takes, Filters::None, example};
}

}  // namespace

const std::vector<CommandRow>& commandRows() {
    static const std::vector<CommandRow> rows = {
        operation("ei", "Enumerate the instances of a class", Operation::EnumerateInstances,
                  classPath, Takes::Properties, Filters::None,
                  "ei KORVA_OperatingSystem NumberOfProcesses FreePhysicalMemory"),
        operation("ein", "Enumerate the names of the instances of a class",
                  Operation::EnumerateInstanceNames, classPath, Takes::Nothing, Filters::None,
                  "ein KORVA_OperatingSystem"),
        operation("gi", "Get one instance", Operation::GetInstance, instancePath, Takes::Properties,
                  Filters::None, "gi KORVA_OperatingSystem Version"),
        operation("ci", "Create an instance", Operation::CreateInstance, classPath,
                  Takes::Assignments, Filters::None,
                  "ci KORVA_OperatingSystem Name=Test OSType=36"),
        operation("mi", "Modify an instance", Operation::ModifyInstance, instancePath,
                  Takes::Assignments, Filters::None,
                  "mi 'KORVA_OperatingSystem.Name=\"Test\"' OSType=36"),
        operation("di", "Delete an instance", Operation::DeleteInstance, instancePath,
                  Takes::Nothing, Filters::None, "di 'KORVA_OperatingSystem.Name=\"Test\"'"),
        operation("ai", "Get the instances associated with an instance", Operation::Associators,
                  sourcePath, Takes::Properties, Filters::Associators,
                  "ai KORVA_OperatingSystem --assoc-class KORVA_RunningOS"),
        operation("ain", "Get the names of the associated instances", Operation::AssociatorNames,
                  sourcePath, Takes::Nothing, Filters::Associators, "ain KORVA_OperatingSystem"),
        operation("ri", "Get the associations that refer to an instance", Operation::References,
                  sourcePath, Takes::Properties, Filters::References,
                  "ri KORVA_OperatingSystem --result-class KORVA_RunningOS"),
        operation("rin", "Get the names of those associations", Operation::ReferenceNames,
                  sourcePath, Takes::Nothing, Filters::References, "rin KORVA_OperatingSystem"),
        operation("im", "Invoke a method", Operation::InvokeMethod, objectPath, Takes::Method,
                  Filters::None, "im KORVA_OperatingSystem RequestStateChange RequestedState=2"),
        operation("xq", "Execute a query", Operation::ExecQuery, nullptr, Takes::Query,
                  Filters::None, "xq 'SELECT * FROM KORVA_OperatingSystem'"),
        overview("tree", "Draw the host, what is installed and running on it", Command::Tree,
                 Takes::Namespace, "tree"),
        overview("classes", "List the classes of the schema", Command::Classes, Takes::Nothing,
                 "classes"),
        overview("describe", "Describe a class or one of its properties", Command::Describe,
                 Takes::Subject, "describe KORVA_OperatingSystem.FreePhysicalMemory"),
        overview("namespaces", "List the namespaces that have providers", Command::Namespaces,
                 Takes::Nothing, "namespaces"),
        overview("serve", "Serve WBEM clients over HTTP: becomes cmpihost-serve", Command::Serve,
                 Takes::Nothing, "serve"),
    };
    return rows;
}

const std::vector<OptionRow>& optionRows() {
    static const std::vector<OptionRow> rows = {
        {"--provider", "FILE", &CommandLine::provider,
         "Library of a provider, asked for every class; without it the provider that is registered "
         "for the class"},
        {"--name", "NAME", &CommandLine::miName,
         "Name of the provider in that library; without it the one that it exports"},
        {"--registration", "PATH", &CommandLine::registrations,
         "File, or folder of *.reg, that says which provider serves which class; can be given "
         "again; without it the folder beside this program"},
        {"--schema", "PATH", &CommandLine::schemas,
         "MOF file or folder of MOF files; can be given again; without it the folder beside this "
         "program"},
        {"--bare", nullptr, &CommandLine::bare,
         "Ask OperatingSystemProvider without its facade, and complete no path that lacks keys"},
        {"--format", "FORMAT", &CommandLine::format,
         "How results are printed: table (the default), mof or json"},
        {"--value", "PROPERTY", &CommandLine::value,
         "Print the values of this property only, one a line"},
        {"--log", "[=LEVEL[,CHANNEL]]", &CommandLine::log,
         "Show what providers record on the standard error. LEVEL: failures, 3000 (calls with "
         "parameters, too) or 4000 (everything, the default). CHANNEL: log, trace or cmpi; without "
         "it log and cmpi"},
        {"--time", nullptr, &CommandLine::time,
         "Tell on the standard error how long loading, request and output took"},
    };
    return rows;
}

const std::vector<FilterRow>& filterRows() {
    static const std::vector<FilterRow> rows = {
        {"--assoc-class", "CLASS", &CommandLine::assocClass, "Class of the association", nullptr},
        {"--result-class", "CLASS", &CommandLine::resultClass, "Class of the far end",
         "Class of the association"},
        {"--role", "NAME", &CommandLine::role, "Reference that points to the source",
         "Reference that points to the source"},
        {"--result-role", "NAME", &CommandLine::resultRole, "Reference that points to the far end",
         nullptr},
    };
    return rows;
}

const char* const programHelp =
    "Embedded CIM host: loads CMPI provider libraries as an object manager does,\n"
    "runs one operation on them and prints what they return.";

const char* const pathHelp =
    "Paths:\n"
    "  root/cimv2:KORVA_OperatingSystem\n"
    "  'KORVA_OperatingSystem.CSName=\"myhost\",Name=\"Debian GNU/Linux\"'\n"
    "  The namespace is root/cimv2 when a path names none. In a text key, \\\" and\n"
    "  \\\\ stand for \" and \\. Single quotes around the path keep the shell away\n"
    "  from it. The path of an instance can lack keys when only one instance has\n"
    "  those that it gives.\n";

const char* const statusHelp =
    "\n"
    "Exit status:\n"
    "  0  done\n"
    "  1  the provider answered a CIM status other than OK, named on the standard\n"
    "     error, or the results cannot be written\n"
    "  2  wrong usage, or a path that lacks keys and that several instances fit\n"
    "  3  a library or registration does not load, or there is no cmpihost-serve\n"
    "  4  there is no such instance: gi was returned none or answered\n"
    "     CIM_ERR_NOT_FOUND, or none fits a path that lacks keys\n"
    "  5  the host caught the provider at something, in place of 0, 1 and 4\n"
    "\n"
    "What the host catches the provider at (a null result, an undeclared property,\n"
    "an object used after its request) is told on the standard error in lines that\n"
    "begin with 'caught:'.";

}  // namespace cmpihost
