#ifndef HOST_CLI_PRINTER_H
#define HOST_CLI_PRINTER_H

#include <memory>
#include <ostream>
#include <vector>

#include "host/broker/Value.h"
#include "host/cli/Terminal.h"
#include "host/mof/Schema.h"

namespace cmpihost {

enum class Format { Table, Mof, Json };

/// Writes what an operation returned. One call a result; each call is a complete text.
class Printer {
  public:
    virtual ~Printer() = default;

    virtual void print(const std::vector<InstanceValue>& instances) = 0;
    virtual void print(const std::vector<ObjectPathValue>& paths) = 0;

  protected:
    Printer() = default;
    Printer(const Printer&) = default;
    Printer& operator=(const Printer&) = default;
};

/// For people: an instance as its path and a line a property, numbers with their names from the
/// schema, sizes and times also in a readable form; a path as a line that a request takes back.
/// Control characters are written out, and long texts broken into lines for the terminal. Stream
/// and schema outlive the printer.
std::unique_ptr<Printer> makeTablePrinter(std::ostream& stream, const Schema& schema,
                                          const Terminal& terminal);

/// An `instance of` declaration for each element; a path declares its keys only.
std::unique_ptr<Printer> makeMofPrinter(std::ostream& stream);

/// One array with an object an element: `class`, `path` and `keys`, for instances `properties` and
/// what the schema and a calendar say about them. Stream and schema outlive the printer.
std::unique_ptr<Printer> makeJsonPrinter(std::ostream& stream, const Schema& schema);

/// The printer of a form. Stream and schema outlive it; the terminal is where the stream ends.
std::unique_ptr<Printer> makePrinter(Format format, std::ostream& stream, const Schema& schema,
                                     const Terminal& terminal);

}  // namespace cmpihost

#endif
