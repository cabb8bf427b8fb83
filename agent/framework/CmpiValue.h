#pragma once

#include <cmpidt.h>
#include <cmpift.h>

#include <optional>
#include <string>

namespace KO {

/**
 * Calls a function of a CMPI object's table, such as callTable<&CMPIObjectPathFT::getKeyCount>(path, &status).
 * Where the object, its table or the function is missing, the answer is zero.
 */
template <auto Function, typename Object, typename... Arguments>
auto callTable(Object* object, Arguments... arguments) {
    using Result = decltype((object->ft->*Function)(object, arguments...));
    if (object == nullptr || object->ft == nullptr || object->ft->*Function == nullptr) {
        return Result{};
    }
    return (object->ft->*Function)(object, arguments...);
}

/** The same for the functions by which a broker makes objects. An object made with a failing status is none. */
template <auto Function, typename... Arguments>
auto makeObject(const CMPIBroker* broker, Arguments... arguments) {
    CMPIStatus status{};
    using Result = decltype((broker->eft->*Function)(broker, arguments..., &status));
    if (broker == nullptr || broker->eft == nullptr || broker->eft->*Function == nullptr) {
        return Result{};
    }
    const Result object = (broker->eft->*Function)(broker, arguments..., &status);
    return status.rc == CMPI_RC_OK ? object : Result{};
}

/** A string's characters; none if any part of it is missing. */
std::optional<std::string> textOf(const CMPIString* string);

/** @name Values read from a broker
 * None when the reading failed, the value is null, or it is of another type.
 */
///@{
std::optional<std::string> textOf(const CMPIData& data, const CMPIStatus& status);          ///< a string
std::optional<std::string> dateTimeTextOf(const CMPIData& data, const CMPIStatus& status);  ///< a datetime's text
std::optional<unsigned int> numberOf(const CMPIData& data, const CMPIStatus& status);       ///< any integer that fits
std::optional<bool> flagOf(const CMPIData& data, const CMPIStatus& status);                 ///< a boolean

/** A string, an integer in decimal digits, or a boolean as "true" or "false". */
std::optional<std::string> keyTextOf(const CMPIData& data, const CMPIStatus& status);

/** A reference; null for none. It belongs to the broker. */
CMPIObjectPath* referenceOf(const CMPIData& data, const CMPIStatus& status);
///@}

}  // namespace KO
