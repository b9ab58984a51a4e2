#include "host/cli/Printer.h"

namespace cmpihost {

std::unique_ptr<Printer> makePrinter(Format format, std::ostream& stream, const Schema& schema) {
    switch (format) {
        case Format::Mof:
            return makeMofPrinter(stream);
        case Format::Json:
            return makeJsonPrinter(stream);
        case Format::Table:
            break;
    }
    return makeTablePrinter(stream, schema);
}

}  // namespace cmpihost
