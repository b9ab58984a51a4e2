#ifndef PROVIDER_UNIT_LOG_H
#define PROVIDER_UNIT_LOG_H

#include <exception>
#include <ostream>
#include <string>

#include "Trace.h"
#include "base/SourceLocation.h"

namespace VA::OSStatusProvider {

using base::SourceLocation;

/// The text of a parameter list, which the records on entering and on leaving share. Each parameter
/// is a name, which brings the leading blank and the "=", and an address.
class ParameterList {
  public:
    /// One parameter.
    ParameterList(const char* name, const void* pointer) {
        ZBLog::ZBMessageBuffer buffer;
        text_ = buffer.str(insert(buffer, name, pointer));
    }

    /// An adapter's construction for a request.
    ParameterList(const void* broker, const void* context, const void* objectPath) {
        ZBLog::ZBMessageBuffer buffer;
        insert(buffer, " _broker=", broker);
        insert(buffer, " _context=", context);
        text_ = buffer.str(insert(buffer, " objectPath=", objectPath));
    }

    /// Valid as long as this object.
    const char* text() const noexcept { return text_.c_str(); }

  private:
    // Addresses go through the buffer's output stream, which every logging layer offers.
    static std::ostream& insert(ZBLog::ZBMessageBuffer& buffer, const char* name,
                                const void* pointer) {
        buffer << name;
        std::ostream& stream = buffer;
        return stream << pointer;
    }

    std::string text_;
};

/// The records of one source unit: each goes to the log and to the trace, under the unit's file
/// name and logger category. Every unit that writes records has one, named `log`.
class UnitLog {
  public:
    /// `file` and `category` outlive the object.
    constexpr UnitLog(const char* file, const std::string& category)
        : file_(file), category_(category) {}

    void entering(SourceLocation location = SourceLocation::current()) const {
        plain(Entering, location);
    }
    void exiting(SourceLocation location = SourceLocation::current()) const {
        plain(Exiting, location);
    }
    void method(SourceLocation location = SourceLocation::current()) const {
        plain(Method, location);
    }

    /// The method record of a destructor. It may throw as any record may, but not while another
    /// exception is under way: then the record is given up, so that the first one gets through.
    void destructor(SourceLocation location = SourceLocation::current()) const {
        if (std::uncaught_exceptions() == 0) return method(location);
        try {
            method(location);
        } catch (...) {
        }
    }

    /// The same with a parameter list.
    void entering(const ParameterList& parameters,
                  SourceLocation location = SourceLocation::current()) const {
        withParameters(Entering, parameters, location);
    }
    void exiting(const ParameterList& parameters,
                 SourceLocation location = SourceLocation::current()) const {
        withParameters(Exiting, parameters, location);
    }

    /// What a variable holds; `Value` is const char* or unsigned int.
    template <class Value>
    void variable(const char* name, Value value,
                  SourceLocation location = SourceLocation::current()) const {
        write(recordLevel, location, [&] { return trace(name, file_, location.line, value); });
    }

    /// A caught exception.
    void message(const std::exception& caught,
                 SourceLocation location = SourceLocation::current()) const {
        write(parameterRecordLevel, location,
              [&] { return trace(file_, caught.what(), location.line, Message); });
    }

  private:
    void plain(MessageType type, SourceLocation location) const {
        write(recordLevel, location,
              [&] { return trace(file_, location.function, location.line, type); });
    }

    void withParameters(MessageType type, const ParameterList& parameters,
                        SourceLocation location) const {
        write(parameterRecordLevel, location, [&] {
            return tracepara(file_, location.function, location.line, parameters.text(), type);
        });
    }

    template <class Format>
    void write(int level, SourceLocation location, Format format) const {
        writeRecord(location.function, file_, location.line, category_, level, format);
    }

    const char* file_;
    const std::string& category_;
};

}  // namespace VA::OSStatusProvider

#endif
