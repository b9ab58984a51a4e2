// Between the values of CMPI and the value model. Internal.
#pragma once

#include "host/broker/BrokerCore.h"

namespace cmpihost {

/// What a provider passed as (value, type); a null pointer gives null of the type. Throws Failure
/// for a type that cannot be stored, and for handles that are not alive (a violation).
Value readValue(const CMPIValue* value, CMPIType type, const CallName& call);

/// The value as CMPI hands it out. Objects in it are new and belong to the thread's request.
CMPIData writeValue(BrokerCore& core, const Value& value);

/// An object of the thread's request.
CMPIString* makeString(BrokerCore& core, std::string_view text);

CMPIInstance* makeInstance(BrokerCore& core, std::shared_ptr<InstanceValue> value);

/// None for null.
std::optional<std::string> optionalText(const char* text);

/// The content of a null-terminated list of names; none for a null list.
std::optional<std::vector<std::string>> readNames(const char** names);

/// Text that must not be null: null is a violation and throws Failure.
const char* required(BrokerCore& core, const char* text, const CallName& call, const char* what);

}  // namespace cmpihost
