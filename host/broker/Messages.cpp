// The part of CMPIBrokerEncFT that is about messages: logged ones, and texts of providers in the
// language of their users, which here are always the providers' own.
#include "host/broker/Conversion.h"

#include <cstdarg>

namespace cmpihost {

namespace {

/// Hands a message to whoever shows it. The string counts where there is no text.
CMPIStatus show(BrokerCore& core, const CallName& call, bool trace, int level, const char* source,
                const char* text, const CMPIString* string) {
    // Looked at even when nobody listens: a dead object would crash an object manager that prints.
    if (text == nullptr && string != nullptr) text = fromHandle(string, call).body.get();
    core.show({trace, level, source == nullptr ? "" : source, text == nullptr ? "" : text});
    return statusOf(CMPI_RC_OK);
}

CMPIStatus logMessage(BrokerCore& core, const CallName& call, int severity, const char* id,
                      const char* text, const CMPIString* string) {
    return show(core, call, false, severity, id, text, string);
}

CMPIStatus traceMessage(BrokerCore& core, const CallName& call, int level, const char* component,
                        const char* text, const CMPIString* string) {
    return show(core, call, true, level, component, text, string);
}

/// There are no message files: texts come from the provider's defaults.
CMPIStatus openMessageFile(BrokerCore&, const char*, CMPIMsgFileHandle* handle) {
    if (handle != nullptr) *handle = nullptr;
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
}

std::string textOrNull(const char* text) {
    return text == nullptr ? "NULL" : text;
}

/// Small integers come widened to int, as C passes them.
std::string messageArgument(CMPIType type, std::va_list& arguments, const CallName& call) {
    switch (type) {
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
            return std::to_string(va_arg(arguments, int));
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_char16:
            return std::to_string(va_arg(arguments, unsigned int));
        case CMPI_sint64:
            return std::to_string(va_arg(arguments, CMPISint64));
        case CMPI_uint64:
            return std::to_string(va_arg(arguments, CMPIUint64));
        case CMPI_real32:
        case CMPI_real64:
            return Value::fromReal(va_arg(arguments, double)).toText();
        case CMPI_boolean:
            return va_arg(arguments, int) != 0 ? "true" : "false";
        case CMPI_chars:
            return textOrNull(va_arg(arguments, const char*));
        case CMPI_string: {
            const auto* const string = va_arg(arguments, const CMPIString*);
            return string == nullptr ? "NULL" : textOrNull(fromHandle(string, call).body.get());
        }
        default:
            throw Failure{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

/// The arguments $0 to $9 of a text, from pairs of type and value.
std::vector<std::string> messageArguments(CMPICount count, std::va_list& arguments,
                                          const CallName& call) {
    if (count > 10) throw Failure{CMPI_RC_ERR_INVALID_PARAMETER};
    std::vector<std::string> result;
    for (CMPICount i = 0; i < count; ++i) {
        // A CMPIType is narrower than int and comes widened as well.
        const auto type = static_cast<CMPIType>(va_arg(arguments, int));
        result.push_back(messageArgument(type, arguments, call));
    }
    return result;
}

/// The text with every $n replaced by argument n, where there is one.
std::string expandMessage(const char* text, const std::vector<std::string>& arguments) {
    std::string result;
    for (const char* at = text; *at != '\0'; ++at) {
        const auto index = static_cast<std::size_t>(at[0] == '$' ? at[1] - '0' : -1);
        if (index < arguments.size()) {
            result += arguments[index];
            ++at;
        } else {
            result += *at;
        }
    }
    return result;
}

CMPIString* expanded(const CMPIBroker* broker, const CallName& call, const char* text,
                     CMPIStatus* status, CMPICount count, std::va_list& arguments) noexcept {
    return exceptionsToStatus<CMPIString*>(status, [&]() -> CMPIString* {
        BrokerCore& core = target(broker, call);
        return reporting<CMPIString*>(core.countCall(call), status, [&] {
            const char* const message = required(core, text, call, "default message");
            return makeString(core,
                              expandMessage(message, messageArguments(count, arguments, call)));
        });
    });
}

CMPIString* getMessage(const CMPIBroker* broker, const char*, const char* text, CMPIStatus* status,
                       CMPICount count, ...) {
    std::va_list arguments;
    va_start(arguments, count);
    CMPIString* const result =
        expanded(broker, {"CMPIBrokerEncFT", "getMessage"}, text, status, count, arguments);
    va_end(arguments);
    return result;
}

CMPIString* getMessage2(const CMPIBroker* broker, const char*, CMPIMsgFileHandle, const char* text,
                        CMPIStatus* status, CMPICount count, ...) {
    std::va_list arguments;
    va_start(arguments, count);
    CMPIString* const result =
        expanded(broker, {"CMPIBrokerEncFT", "getMessage2"}, text, status, count, arguments);
    va_end(arguments);
    return result;
}

}  // namespace

void bindMessages(CMPIBrokerEncFT& table) {
    using FT = CMPIBrokerEncFT;
    bind<&FT::logMessage, &logMessage>(table, "logMessage");
    bind<&FT::trace, &traceMessage>(table, "trace");
    bind<&FT::openMessageFile, &openMessageFile>(table, "openMessageFile");
    bind<&FT::closeMessageFile, &notSupported<CMPIStatus, BrokerCore, CMPIMsgFileHandle>>(
        table, "closeMessageFile");
    table.getMessage = &getMessage;
    table.getMessage2 = &getMessage2;
}

}  // namespace cmpihost
