// A broker whose every slot notes how it was called, for tests of the macros.
#ifndef TESTS_CMPI_RECORDING_TABLES_H
#define TESTS_CMPI_RECORDING_TABLES_H

#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <tuple>
#include <type_traits>
#include <vector>

namespace cmpi_test {

// One argument or result as a number, so that calls of any slot compare alike.
template <class T>
std::uint64_t encode(T value) {
    if constexpr (std::is_null_pointer_v<T>) {
        return 0;
    } else if constexpr (std::is_pointer_v<T>) {
        return reinterpret_cast<std::uintptr_t>(value);
    } else {
        return static_cast<std::uint64_t>(value);
    }
}
inline std::uint64_t encode(CMPIStatus status) {
    return encode(status.rc);
}
inline std::uint64_t encode(CMPIData data) {
    return (std::uint64_t{data.type} << 32) | data.value.uint32;
}

// What every recording slot of result type R returns.
template <class R>
R cannedResult() {
    static std::max_align_t somewhere;
    if constexpr (std::is_same_v<R, CMPIStatus>) {
        return {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    } else if constexpr (std::is_same_v<R, CMPIData>) {
        CMPIData data = {CMPI_uint32, CMPI_goodValue, {0}};
        data.value.uint32 = 77;
        return data;
    } else if constexpr (std::is_pointer_v<R>) {
        return static_cast<R>(static_cast<void*>(&somewhere));
    } else {
        return static_cast<R>(1);
    }
}

struct Call {
    std::string slot;
    std::vector<std::uint64_t> arguments;
};
inline Call lastCall;

// A function with the signature of a slot. It notes its call in lastCall.
template <auto Slot, class Type = decltype(Slot)>
struct Recorder {
    static constexpr bool exists = false;
};
template <auto Slot, class Table, class R, class... Arguments>
struct Recorder<Slot, R (*Table::*)(Arguments...)> {
    static constexpr bool exists = true;
    using TableType = Table;
    static inline std::string name;

    static R call(Arguments... arguments) {
        lastCall = {name, {encode(arguments)...}};
        if constexpr (!std::is_void_v<R>) {
            return cannedResult<R>();
        }
    }
};

using Tables =
    std::tuple<CMPIBrokerFT, CMPIBrokerEncFT, CMPIBrokerExtFT, CMPIBrokerMemFT, CMPIContextFT,
               CMPIResultFT, CMPIErrorFT, CMPIInstanceFT, CMPIObjectPathFT, CMPISelectExpFT,
               CMPISelectCondFT, CMPISubCondFT, CMPIPredicateFT, CMPIArgsFT, CMPIStringFT,
               CMPIArrayFT, CMPIEnumerationFT, CMPIDateTimeFT, CMPIInstanceMIFT,
               CMPIAssociationMIFT, CMPIMethodMIFT, CMPIPropertyMIFT, CMPIIndicationMIFT>;

// Calls of the slot are noted by its name, such as "CMPIArgsFT.addArg".
template <auto Slot>
void install([[maybe_unused]] Tables& tables, [[maybe_unused]] const char* name) {
    if constexpr (Recorder<Slot>::exists) {
        Recorder<Slot>::name = name;
        std::get<typename Recorder<Slot>::TableType>(tables).*Slot = &Recorder<Slot>::call;
    }
}

// A broker and one object of each kind, whose slots all record (but for the two that take a
// variable list), and values to call macros with.
class CmpiMacros : public testing::Test {
  protected:
    CmpiMacros() {
#define RECORD(...)
#define UNION(...)
#define MEMBER(type, member, ...) install<&type::member>(tables, #type "." #member);
#include "Records.inc"
#undef RECORD
#undef UNION
#undef MEMBER
        lastCall = {};
    }

    // Checks that the macro that made result called the slot with just these arguments, the object
    // included, and handed its result through.
    template <class Result, class... Arguments>
    void expectCall(const char* slot, Result result, Arguments... arguments) {
        const std::vector<std::uint64_t> expected = {encode(arguments)...};
        EXPECT_EQ(lastCall.slot, slot);
        EXPECT_EQ(lastCall.arguments, expected) << slot;
        EXPECT_EQ(encode(result), encode(cannedResult<Result>())) << slot;
        lastCall = {};
    }

    template <class Table>
    Table* table() {
        return &std::get<Table>(tables);
    }

    Tables tables{};
    char handle = 0;
    CMPIBroker brokerObject = {&handle, table<CMPIBrokerFT>(), table<CMPIBrokerEncFT>(),
                               table<CMPIBrokerExtFT>(), table<CMPIBrokerMemFT>()};
    CMPIContext contextObject = {&handle, table<CMPIContextFT>()};
    CMPIResult resultObject = {&handle, table<CMPIResultFT>()};
    CMPIError errorObject = {&handle, table<CMPIErrorFT>()};
    CMPIInstance instanceObject = {&handle, table<CMPIInstanceFT>()};
    CMPIObjectPath pathObject = {&handle, table<CMPIObjectPathFT>()};
    CMPIObjectPath otherPathObject = {&handle, table<CMPIObjectPathFT>()};
    CMPISelectExp queryObject = {&handle, table<CMPISelectExpFT>()};
    CMPISelectCond conditionObject = {&handle, table<CMPISelectCondFT>()};
    CMPISubCond subConditionObject = {&handle, table<CMPISubCondFT>()};
    CMPIPredicate predicateObject = {&handle, table<CMPIPredicateFT>()};
    CMPIArgs argsObject = {&handle, table<CMPIArgsFT>()};
    CMPIArgs outArgsObject = {&handle, table<CMPIArgsFT>()};
    CMPIString stringObject = {&handle, table<CMPIStringFT>()};
    CMPIArray arrayObject = {&handle, table<CMPIArrayFT>()};
    CMPIEnumeration enumerationObject = {&handle, table<CMPIEnumerationFT>()};
    CMPIDateTime dateTimeObject = {&handle, table<CMPIDateTimeFT>()};
    CMPIStatus statusObject = {CMPI_RC_OK, nullptr};
    CMPIString* outNameObject = nullptr;

    const CMPIBroker* const mb = &brokerObject;
    const CMPIContext* const ctx = &contextObject;
    const CMPIResult* const rslt = &resultObject;
    CMPIError* const err = &errorObject;
    CMPIInstance* const inst = &instanceObject;
    CMPIObjectPath* const path = &pathObject;
    CMPIObjectPath* const otherPath = &otherPathObject;
    CMPIStatus* const rc = &statusObject;
    CMPIString** const outName = &outNameObject;
    const char* const ns = "root/cimv2";
    const char* const cn = "CIM_OperatingSystem";
    const char* const name = "Name";
    const char* const text = "localhost";
    const char* const origin = "CIM_ManagedElement";
    const char* listItems[2] = {"Name", nullptr};
    const char* keyItems[2] = {"CreationClassName", nullptr};
    const char** const list = listItems;
    const char** const keys = keyItems;
    CMPIUint32 number = 7;
};

}  // namespace cmpi_test

#endif
