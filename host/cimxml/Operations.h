#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "broker/Broker.h"
#include "cimxml/DeclaredInstances.h"
#include "cimxml/Message.h"
#include "cimxml/ObjectWriter.h"
#include "cimxml/OpenEnumerations.h"
#include "cimxml/OperationArguments.h"
#include "model/Request.h"
#include "operations/ProviderRegistry.h"
#include "schema/Schema.h"

namespace cimhost::cimxml {

/** The user that sends a request. */
struct Caller {
    std::string principal{};
    bool mayWrite = true;
};

/** The results of an operation. Each element is written when next() is called. */
struct OperationResult {
    std::function<bool(std::string& xml)> next{};  ///< appends an element of IRETURNVALUE; false at the end
    std::string parameters{};                      ///< elements PARAMVALUE
    std::size_t count = 0;                         ///< number of results
    std::shared_ptr<void> sending{};               ///< released when the response has been sent or has failed
};

struct OperationsOptions {
    std::string host{};     ///< name of this machine in paths
    std::string version{};  ///< of the server
    EnumerationLimits limits{};
};

/**
 * The CIM operations of the server. Sends operations on instances to the object manager, and answers operations on
 * classes from the schema. Thread-safe. Schema, registry and manager must outlive this object.
 */
class Operations {
public:
    Operations(const Schema& itsSchema, const ProviderRegistry& itsRegistry, UpCalls& itsManager,
               OperationsOptions itsOptions);

    /**
     * Performs the operation of a message.
     * @throws CimError for an operation that fails, RequestRefused for an unknown operation
     */
    OperationResult perform(const Message& message, const Caller& caller);

    /** Frees the results of open enumerations whose timeout has passed. Call periodically. */
    void removeExpired(OpenEnumerations::Clock::time_point now) { enumerations.removeExpired(now); }

    /** Whether an operation can return more than one result. */
    static bool returnsList(std::string_view method);

    /** The name of the class that a message refers to, for the access log; empty if there is none. */
    static std::string subjectOf(const Message& message);

private:
    /** A request with the schema and the target of its namespace. */
    struct Call {
        const OperationArguments& arguments;
        const Caller& caller;
        const Schema& schema;
        UpCalls& target;
        bool isInterop;
        Operation operation;
        ObjectForm form;
    };
    using Handler = OperationResult (Operations::*)(const Call&);
    struct Row {
        const char* name;
        bool writes;
        Handler handler;  ///< null: not supported
        const char* parameters = nullptr;
        Operation operation = Operation::enumerateInstances;  ///< that providers perform
        ObjectForm form = ObjectForm::instance;               ///< of the results
    };
    static const Row rows[];

    OperationResult performMethod(const Message& message, const Schema& schema) const;
    const std::string* findNameSpace(std::string_view name, bool& isInterop) const;

    /** @name Operations on instances: InstanceOperations.cpp */
    ///@{
    OperationResult enumerateInstances(const Call& call);
    OperationResult getInstance(const Call& call);
    OperationResult createInstance(const Call& call);
    OperationResult modifyInstance(const Call& call);
    OperationResult deleteInstance(const Call& call);
    OperationResult traverse(const Call& call);
    ///@}

    /** @name Operations on classes: ClassOperations.cpp */
    ///@{
    OperationResult getClass(const Call& call);
    OperationResult enumerateClasses(const Call& call);
    OperationResult enumerateClassNames(const Call& call);
    OperationResult getQualifier(const Call& call);
    OperationResult enumerateQualifiers(const Call& call);
    OperationResult traverseClasses(const Call& call, const ObjectPath& path) const;
    ///@}

    /** @name Pull operations: PullOperations.cpp */
    ///@{
    OperationResult openEnumeration(const Call& call);
    OperationResult openTraversal(const Call& call);
    OperationResult pull(const Call& call);
    OperationResult closeEnumeration(const Call& call);
    OperationResult open(const Call& call, ResultCursor cursor);
    OperationResult part(const Call& call, OpenEnumeration enumeration, const std::string& identifier,
                         std::uint32_t most);
    std::string keep(OpenEnumeration enumeration, const std::string& identifier, OperationResult& result);
    ///@}

    Response send(const Call& call, Request request) const;
    void requireProvider(const Call& call, const ObjectPath& path, int code) const;
    Response enumerate(const Call& call, const std::string& className, const PropertyList& properties) const;
    Response associate(const Call& call, Request request) const;
    ResultCursor enumeration(const Call& call) const;
    ResultCursor traversal(const Call& call, const ObjectPath& path) const;
    InstanceParts partsOf(const Call& call) const;

    /** A result that writes and frees the objects of the cursor one by one. */
    OperationResult streamed(const Call& call, ResultCursor cursor) const;

    const Class& classOf(const Call& call, const std::string& name) const;
    AssociationFilter filterOf(const Call& call) const;
    ObjectWriter writerFor(const Call& call) const { return {options.host, call.arguments.nameSpace()}; }

    const Schema& schema;
    const ProviderRegistry& registry;
    UpCalls& manager;
    OperationsOptions options;
    std::vector<std::string> nameSpaces;
    Schema interop;
    DeclaredInstances interopInstances;
    OpenEnumerations enumerations;
};

}  // namespace cimhost::cimxml
