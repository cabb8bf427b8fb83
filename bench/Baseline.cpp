#include "Baseline.h"

#include <algorithm>
#include <type_traits>
#include <utility>

#include "BaselineCalls.h"
#include "RecordFile.h"

namespace bench {

namespace {

/** Whether rows of this type are records, which are stored in a file and can be changed. */
template <class Row>
constexpr bool isRecord = std::is_same_v<Row, LeaseRow> || std::is_same_v<Row, WarrantyRow>;

template <class Row>
struct ClassBaseline final : Baseline {
    ClassBaseline(const CMPIBroker* itsBroker, std::vector<Row> itsRows, std::filesystem::path itsFile)
        : broker(itsBroker), rows(std::move(itsRows)), file(std::move(itsFile)) {}

    Interfaces interfaces() override { return {&instances, nullptr}; }

    const CMPIBroker* broker;
    std::vector<Row> rows;
    std::filesystem::path file;
    CMPIInstanceMI instances{this, &table};

    static CMPIInstanceMIFT table;
};

template <class Row>
ClassBaseline<Row>& baselineOf(const CMPIInstanceMI* mi) {
    return *const_cast<ClassBaseline<Row>*>(static_cast<const ClassBaseline<Row>*>(mi->hdl));
}

constexpr CMPIStatus success{CMPI_RC_OK, nullptr};

/** The row with the keys of a path; the end if there is none. */
template <class Row>
auto find(std::vector<Row>& rows, const CMPIObjectPath* path) {
    Row wanted{};
    for (const auto& key : Row::keys) {
        wanted.*key.member = stringKey(path, key.name);
    }
    return std::find_if(rows.begin(), rows.end(), [&](const Row& row) {
        return std::all_of(Row::keys.begin(), Row::keys.end(),
                           [&](const auto& key) { return row.*key.member == wanted.*key.member; });
    });
}

template <class Row>
CMPIStatus enumInstanceNames(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    const ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    const char* nameSpace = nameSpaceOf(path);
    for (const Row& row : baseline.rows) {
        result->ft->returnObjectPath(result, pathOf(baseline.broker, nameSpace, row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus enumInstances(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                         const char**) {
    const ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    const char* nameSpace = nameSpaceOf(path);
    for (const Row& row : baseline.rows) {
        result->ft->returnInstance(result, instanceOf(baseline.broker, nameSpace, row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char**) {
    ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    const auto row = find(baseline.rows, path);
    if (row != baseline.rows.end()) {
        result->ft->returnInstance(result, instanceOf(baseline.broker, nameSpaceOf(path), *row));
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance*) {
    ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    if (find(baseline.rows, path) == baseline.rows.end()) {
        Row& row = baseline.rows.emplace_back();
        row.instanceId = stringKey(path, "InstanceID");
        result->ft->returnInstance(result, instanceOf(baseline.broker, nameSpaceOf(path), row));
        writeRows(baseline.file, baseline.rows);
    }
    result->ft->returnDone(result);
    return success;
}

template <class Row>
CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char**) {
    ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    const auto row = find(baseline.rows, path);
    if (row != baseline.rows.end()) {
        const CMPIData data = instance->ft->getProperty(instance, Row::modified.name, nullptr);
        (*row).*Row::modified.member = characters(data.value.string);
        writeRows(baseline.file, baseline.rows);
    }
    return success;
}

template <class Row>
CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    ClassBaseline<Row>& baseline = baselineOf<Row>(mi);
    const auto row = find(baseline.rows, path);
    if (row != baseline.rows.end()) {
        baseline.rows.erase(row);
        writeRows(baseline.file, baseline.rows);
    }
    return success;
}

/** The baseline of a product class has no operations that change instances. */
template <class Row>
CMPIInstanceMIFT baselineTable() {
    if constexpr (isRecord<Row>) {
        return {CMPIVersion200,
                CMPIVersion200,
                "instanceBaseline",
                nullptr,
                enumInstanceNames<Row>,
                enumInstances<Row>,
                getInstance<Row>,
                createInstance<Row>,
                modifyInstance<Row>,
                deleteInstance<Row>,
                nullptr};
    } else {
        return {CMPIVersion200,
                CMPIVersion200,
                "instanceBaseline",
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
CMPIInstanceMIFT ClassBaseline<Row>::table = baselineTable<Row>();

}  // namespace

template <class Row>
std::unique_ptr<Baseline> makeBaseline(const CMPIBroker* broker, std::vector<Row> rows, std::filesystem::path file) {
    return std::make_unique<ClassBaseline<Row>>(broker, std::move(rows), std::move(file));
}

template std::unique_ptr<Baseline> makeBaseline(const CMPIBroker*, std::vector<LeaseRow>, std::filesystem::path);
template std::unique_ptr<Baseline> makeBaseline(const CMPIBroker*, std::vector<WarrantyRow>, std::filesystem::path);
template std::unique_ptr<Baseline> makeBaseline(const CMPIBroker*, std::vector<AgentRow>, std::filesystem::path);
template std::unique_ptr<Baseline> makeBaseline(const CMPIBroker*, std::vector<AssetRow>, std::filesystem::path);

}  // namespace bench
