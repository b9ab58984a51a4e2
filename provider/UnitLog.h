#ifndef OSSTATUS_UNIT_LOG_H
#define OSSTATUS_UNIT_LOG_H

#include <exception>
#include <ostream>
#include <string>

#include "Trace.h"

namespace VA::OSStatusProvider {

/// The place that writes a record: the function's unqualified name, and the line.
struct Caller {
    const char* function;
    unsigned int line;

    /// The caller of the function whose default argument this is.
    static constexpr Caller here(const char* function = __builtin_FUNCTION(),
                                 unsigned int line = __builtin_LINE()) {
        return {function, line};
    }

    /// The caller under another name: a template's constructor bears that of the class it serves.
    static constexpr Caller named(const char* function, unsigned int line = __builtin_LINE()) {
        return {function, line};
    }
};

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
/// name and logger category.
class UnitLog {
  public:
    /// `file` and `category` outlive the object.
    constexpr UnitLog(const char* file, const std::string& category)
        : file_(file), category_(category) {}

    void entering(Caller caller = Caller::here()) const { plain(Entering, caller); }
    void exiting(Caller caller = Caller::here()) const { plain(Exiting, caller); }
    void method(Caller caller = Caller::here()) const { plain(Method, caller); }

    /// The method record of a destructor. It may throw as any record may, but not while another
    /// exception is under way: then the record is given up, so that the first one gets through.
    void destructor(Caller caller = Caller::here()) const {
        if (std::uncaught_exceptions() == 0) return method(caller);
        try {
            method(caller);
        } catch (...) {
        }
    }

    /// The same with a parameter list.
    void entering(const ParameterList& parameters, Caller caller = Caller::here()) const {
        withParameters(Entering, parameters, caller);
    }
    void exiting(const ParameterList& parameters, Caller caller = Caller::here()) const {
        withParameters(Exiting, parameters, caller);
    }

    /// What a variable holds; `Value` is const char* or unsigned int.
    template <class Value>
    void variable(const char* name, Value value, Caller caller = Caller::here()) const {
        write(recordLevel, caller, [&] { return trace(name, file_, caller.line, value); });
    }

    /// A caught exception.
    void message(const std::exception& caught, Caller caller = Caller::here()) const {
        write(parameterRecordLevel, caller,
              [&] { return trace(file_, caught.what(), caller.line, Message); });
    }

  private:
    void plain(MessageType type, Caller caller) const {
        write(recordLevel, caller,
              [&] { return trace(file_, caller.function, caller.line, type); });
    }

    void withParameters(MessageType type, const ParameterList& parameters, Caller caller) const {
        write(parameterRecordLevel, caller, [&] {
            return tracepara(file_, caller.function, caller.line, parameters.text(), type);
        });
    }

    template <class Format>
    void write(int level, Caller caller, Format format) const {
        writeRecord(caller.function, file_, caller.line, category_, level, format);
    }

    const char* file_;
    const std::string& category_;
};

}  // namespace VA::OSStatusProvider

#endif
