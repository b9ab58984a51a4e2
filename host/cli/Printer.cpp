// The forms of output are chosen here and known nowhere else: a caller has a Printer, and a new
// form is a file of its own and a line below.
#include "host/cli/Printer.h"

namespace cmpihost {

std::unique_ptr<Printer> makePrinter(Format format, std::ostream& stream, const Schema& schema,
                                     const Terminal& terminal) {
    switch (format) {
        case Format::Mof:
            return makeMofPrinter(stream);
        case Format::Json:
            return makeJsonPrinter(stream, schema);
        case Format::Table:
            break;
    }
    return makeTablePrinter(stream, schema, terminal);
}

}  // namespace cmpihost
