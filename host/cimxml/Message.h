#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "cimxml/XmlElement.h"

namespace cimhost::cimxml {

/** A request message: one method call, intrinsic (a CIM operation) or extrinsic (a method of a class). */
struct Message {
    std::string id{};
    std::string protocolVersion{};
    std::string method{};  ///< name of the operation or method
    bool isIntrinsic = true;
    std::string nameSpace{};                                       ///< such as "root/cimv2"
    std::vector<std::pair<std::string, XmlElement>> parameters{};  ///< without a value: an element without name
    XmlElement target{};                                           ///< of an extrinsic call: CLASSNAME or INSTANCENAME

    /** The value of a parameter; null if the parameter is absent or has no value. */
    const XmlElement* find(std::string_view parameter) const;

    /** The value that the header CIMObject must have: the namespace, with the object of an extrinsic call. */
    std::string object{};
};

/**
 * Reads a CIM-XML request message.
 * @throws RequestRefused for other documents, with the HTTP status and CIMError that DSP0200 defines
 */
Message readMessage(std::string_view document, const XmlLimits& limits = {});

/** The namespace in a LOCALNAMESPACEPATH, such as "root/cimv2". */
std::string nameSpaceOf(const XmlElement& localNameSpacePath);

}  // namespace cimhost::cimxml
