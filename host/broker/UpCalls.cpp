#include "broker/UpCalls.h"

namespace cimhost {
namespace {

Status notSupported(const char* operation) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, std::string(operation) + " is not supported by this object manager."};
}

}  // namespace

Answer<std::vector<Instance>> UpCalls::enumerateInstances(const ContextEntries&, const ObjectPath&,
                                                          const PropertyList&) {
    return {notSupported("EnumerateInstances"), {}};
}

Answer<std::vector<ObjectPath>> UpCalls::enumerateInstanceNames(const ContextEntries&, const ObjectPath&) {
    return {notSupported("EnumerateInstanceNames"), {}};
}

Answer<Instance> UpCalls::getInstance(const ContextEntries&, const ObjectPath&, const PropertyList&) {
    return {notSupported("GetInstance"), {}};
}

Answer<ObjectPath> UpCalls::createInstance(const ContextEntries&, const ObjectPath&, const Instance&) {
    return {notSupported("CreateInstance"), {}};
}

Status UpCalls::modifyInstance(const ContextEntries&, const ObjectPath&, const Instance&, const PropertyList&) {
    return notSupported("ModifyInstance");
}

Status UpCalls::deleteInstance(const ContextEntries&, const ObjectPath&) {
    return notSupported("DeleteInstance");
}

Answer<std::vector<Instance>> UpCalls::execQuery(const ContextEntries&, const ObjectPath&, const std::string&,
                                                 const std::string&) {
    return {notSupported("ExecQuery"), {}};
}

Answer<std::vector<Instance>> UpCalls::associators(const ContextEntries&, const ObjectPath&, const AssociationFilter&,
                                                   const PropertyList&) {
    return {notSupported("Associators"), {}};
}

Answer<std::vector<ObjectPath>> UpCalls::associatorNames(const ContextEntries&, const ObjectPath&,
                                                         const AssociationFilter&) {
    return {notSupported("AssociatorNames"), {}};
}

Answer<std::vector<Instance>> UpCalls::references(const ContextEntries&, const ObjectPath&, const AssociationFilter&,
                                                  const PropertyList&) {
    return {notSupported("References"), {}};
}

Answer<std::vector<ObjectPath>> UpCalls::referenceNames(const ContextEntries&, const ObjectPath&,
                                                        const AssociationFilter&) {
    return {notSupported("ReferenceNames"), {}};
}

Answer<Value> UpCalls::invokeMethod(const ContextEntries&, const ObjectPath&, const std::string&,
                                    const std::vector<NamedValue>&, std::vector<NamedValue>&) {
    return {notSupported("InvokeMethod"), {}};
}

Status UpCalls::setProperty(const ContextEntries&, const ObjectPath&, const std::string&, const Value&) {
    return notSupported("SetProperty");
}

Answer<Value> UpCalls::getProperty(const ContextEntries&, const ObjectPath&, const std::string&) {
    return {notSupported("GetProperty"), {}};
}

}  // namespace cimhost
