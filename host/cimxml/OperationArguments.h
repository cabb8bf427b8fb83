#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "cimxml/ElementReader.h"
#include "cimxml/Message.h"
#include "model/Request.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/** Reads the parameters of an operation. Throws CimError with CMPI_RC_ERR_INVALID_PARAMETER for a wrong parameter. */
class OperationArguments {
public:
    OperationArguments(const Message& itsMessage, const Schema& schema)
        : message(itsMessage), elements(schema, itsMessage.nameSpace) {}

    const std::string& nameSpace() const { return message.nameSpace; }
    const ElementReader& reader() const { return elements; }

    /** Refuses repeated parameters, and parameters that are not in a list of names separated by spaces. */
    void requireKnown(std::string_view names) const;

    bool has(std::string_view name) const { return message.find(name) != nullptr; }
    bool flag(std::string_view name, bool absent) const;
    std::optional<std::uint32_t> number(std::string_view name) const;
    std::optional<std::string> string(std::string_view name) const;
    PropertyList strings(std::string_view name) const;
    std::optional<std::string> className(std::string_view name) const;
    std::string requiredClassName(std::string_view name) const;
    std::string requiredString(std::string_view name) const;
    const XmlElement& required(std::string_view name) const;
    AssociationFilter filter() const;
    /** Reads an INSTANCENAME or CLASSNAME. Refuses longer paths, since the request names the namespace. */
    ObjectPath path(std::string_view name) const;

private:
    const Message& message;
    ElementReader elements;
};

}  // namespace cimhost::cimxml
