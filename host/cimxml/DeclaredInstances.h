#pragma once

#include "broker/Broker.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/** Answers requests from the instances that a schema declares. They can be read, but not changed. */
class DeclaredInstances : public UpCalls {
public:
    explicit DeclaredInstances(const Schema& itsSchema) : schema(itsSchema) {}

    Response perform(Request request) override;

private:
    std::vector<Instance> instancesOf(const ObjectPath& path) const;
    Response getInstance(const ObjectPath& path) const;

    const Schema& schema;
};

}  // namespace cimhost::cimxml
