#pragma once

#include "entries/Entry.h"
#include "entries/TypedValues.h"

// The functions that read or write one value. `Source` says what a function reads or writes: an
// aggregate of the arguments that name it, with
//     Call describe(const char* function) const;
//     ReadValue read(Simulator& simulator, DataType type) const;
//     void write(Simulator& simulator, DataType type, const Elements& values) const;
// The data type follows from the C type of the value.
namespace simulator {

template <typename Source, typename Value>
void getScalar(const char* function, const Source& source, Value* value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&] { return source.describe(function).out("value", value); };
    withSharedSimulator(status, call, [&](Simulator& simulator) {
        lendScalar(source.read(simulator, typeOf(Value())), value);
    });
}

template <typename Source, typename Value>
void getArray(const char* function, const Source& source, Value** array, std::uint32_t* count,
              qierr_Status* status) {
    clearOutputs(status, array, count);
    const auto call = [&] { return source.describe(function).out("array", array, count); };
    withSharedSimulator(status, call, [&](Simulator& simulator) {
        lendArray(source.read(simulator, arrayType(typeOf(Value()))), array, count);
    });
}

template <typename Source, typename Value>
void setScalar(const char* function, const Source& source, Value value, qierr_Status* status) {
    const auto call = [&] { return source.describe(function).in("value", value); };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        source.write(simulator, typeOf(value), asElements(value));
    });
}

template <typename Source, typename Value>
void setArray(const char* function, const Source& source, const Value* array, std::uint32_t count,
              qierr_Status* status) {
    const auto call = [&] { return source.describe(function).in("array", array, count); };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        source.write(simulator, arrayType(typeOf(Value())), asElements(array, count));
    });
}

}  // namespace simulator
