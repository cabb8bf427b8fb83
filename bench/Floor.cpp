#include "Floor.h"

#include "FloorCalls.h"
#include "RecordFile.h"

#include <algorithm>
#include <type_traits>
#include <utility>

namespace bench {

namespace {

/** Whether rows of this type are records: kept in a file, made, changed and deleted by clients. */
template <class Row>
constexpr bool isRecord = std::is_same_v<Row, LeaseRow> || std::is_same_v<Row, WarrantyRow>;

template <class Row>
struct ClassFloor final : Floor {
    ClassFloor(const CMPIBroker* itsBroker, std::vector<Row> itsRows, std::filesystem::path itsFile)
        : broker(itsBroker), rows(std::move(itsRows)), file(std::move(itsFile)) {}

    Interfaces interfaces() override { return {&instances, nullptr}; }

    const CMPIBroker* broker;
    std::vector<Row> rows;
    std::filesystem::path file;
    CMPIInstanceMI instances{this, &table};

    static CMPIInstanceMIFT table;
};

template <class Row>
ClassFloor<Row>& floorOf(const CMPIInstanceMI* mi) {
    return *const_cast<ClassFloor<Row>*>(static_cast<const ClassFloor<Row>*>(mi->hdl));
}

constexpr CMPIStatus success{CMPI_RC_OK, nullptr};

/** The row whose keys are those of the path; the end when there is none. */
template <class Row>
auto find(std::vector<Row>& rows, const CMPIObjectPath* path) {
    Row wanted{};
    for (const auto& key : Row::keys) {
        wanted.*key.member = textKey(path, key.name);
    }
    return std::find_if(rows.begin(), rows.end(), [&](const Row& row) {
        return std::all_of(Row::keys.begin(), Row::keys.end(),
                           [&](const auto& key) { return row.*key.member == wanted.*key.member; });
    });
}

template <class Row>
CMPIStatus enumInstanceNames(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    const ClassFloor<Row>& floor = floorOf<Row>(mi);
    const char* nameSpace = nameSpaceOf(path);
    for (const Row& row : floor.rows) {
        result->ft->returnObjectPath(result, pathOf(floor.broker, nameSpace, row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus enumInstances(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                         const char**) {
    const ClassFloor<Row>& floor = floorOf<Row>(mi);
    const char* nameSpace = nameSpaceOf(path);
    for (const Row& row : floor.rows) {
        result->ft->returnInstance(result, instanceOf(floor.broker, nameSpace, row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char**) {
    ClassFloor<Row>& floor = floorOf<Row>(mi);
    const auto row = find(floor.rows, path);
    if (row != floor.rows.end()) {
        result->ft->returnInstance(result, instanceOf(floor.broker, nameSpaceOf(path), *row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance*) {
    ClassFloor<Row>& floor = floorOf<Row>(mi);
    if (find(floor.rows, path) == floor.rows.end()) {
        Row& row = floor.rows.emplace_back();
        row.instanceId = textKey(path, "InstanceID");
        result->ft->returnInstance(result, instanceOf(floor.broker, nameSpaceOf(path), row));
        writeRows(floor.file, floor.rows);
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char**) {
    ClassFloor<Row>& floor = floorOf<Row>(mi);
    const auto row = find(floor.rows, path);
    if (row != floor.rows.end()) {
        const CMPIData data = instance->ft->getProperty(instance, Row::modified.name, nullptr);
        (*row).*Row::modified.member = characters(data.value.string);
        writeRows(floor.file, floor.rows);
    }
    return success;
}

template <class Row>
CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    ClassFloor<Row>& floor = floorOf<Row>(mi);
    const auto row = find(floor.rows, path);
    if (row != floor.rows.end()) {
        floor.rows.erase(row);
        writeRows(floor.file, floor.rows);
    }
    return success;
}

/** Products cannot be made, changed or deleted. */
template <class Row>
CMPIInstanceMIFT floorTable() {
    if constexpr (isRecord<Row>) {
        return {CMPIVersion200,         CMPIVersion200,      "instanceFloor",  nullptr,
                enumInstanceNames<Row>, enumInstances<Row>,  getInstance<Row>, createInstance<Row>,
                modifyInstance<Row>,    deleteInstance<Row>, nullptr};
    } else {
        return {CMPIVersion200,
                CMPIVersion200,
                "instanceFloor",
                nullptr,
                enumInstanceNames<Row>,
                enumInstances<Row>,
                getInstance<Row>,
                nullptr,
                nullptr,
                nullptr,
                nullptr};
    }
}

template <class Row>
CMPIInstanceMIFT ClassFloor<Row>::table = floorTable<Row>();

}  // namespace

template <class Row>
std::unique_ptr<Floor> makeFloor(const CMPIBroker* broker, std::vector<Row> rows, std::filesystem::path file) {
    return std::make_unique<ClassFloor<Row>>(broker, std::move(rows), std::move(file));
}

template std::unique_ptr<Floor> makeFloor(const CMPIBroker*, std::vector<LeaseRow>, std::filesystem::path);
template std::unique_ptr<Floor> makeFloor(const CMPIBroker*, std::vector<WarrantyRow>, std::filesystem::path);
template std::unique_ptr<Floor> makeFloor(const CMPIBroker*, std::vector<AgentRow>, std::filesystem::path);
template std::unique_ptr<Floor> makeFloor(const CMPIBroker*, std::vector<AssetRow>, std::filesystem::path);

}  // namespace bench
