#include "AssetIDDetails.h"

#include <algorithm>
#include <ctime>
#include <optional>
#include <type_traits>

#include "AssetFile.h"
#include "KO/File.h"
#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "KO/PropertyFile.h"
#include "KO/Strings.h"
#include "KO/Utils.h"
#include "Trace.h"

KO::Mutex KO::_fileMutex;

namespace KO::LeaseWarrantyProvider {

std::string loggerAssetIDDetails = LoggerNames::loggerName(LoggerNames::shortened);

namespace {

const TraceSource traceSource{loggerAssetIDDetails, "AssetIDDetails.cpp"};

constexpr const char* assetCaption = "Asset ID Information";
constexpr unsigned int assetStringArea = 1024;
constexpr unsigned int presentTime = 3;

}  // namespace

AssetIDDetails::AssetIDDetails() : _FileName(getFileName()) {
    const Traced traced(at(traceSource));
    std::optional<PropertyFile> file;
    std::optional<FileLock> lock;
    try {
        _ComputerNode.selectNode(NodeLexicon::NT_COMPUTER);
        _SystemNode.selectNode(NodeLexicon::NT_SYSTEM);
        if (!_ComputerNode || !_SystemNode) {
            return;
        }
        file.emplace(File::Path(_FileName));
        traceMessage(at(traceSource), "Opening File");
        lock.emplace();
        traceMessage(at(traceSource), "File Locked successfully");
        file->open(FILE_MODE_READ);
        traceMessage(at(traceSource), "File Open successfully");
        readFixedFields(*file);
        readPersonalizedPairs(*file);
        _Loaded = true;
        file->close();
    } catch (...) {
        _Loaded = false;
        traceMessage(at(traceSource), "Throwing Exception in Constructor");
    }
}

AssetIDDetails::~AssetIDDetails() {
    const Traced traced(at(traceSource));
}

void AssetIDDetails::readFixedFields(PropertyFile& file) {
    forEachField(
        [&](const StoredFields::Field& field, std::string& text) {
            text = Utils::ReadStringFromFile(file, field.key);
            traceVariable(at(traceSource, Level::flow, "AssetIDDetails"), field.name, text);
        },
        [&](const StoredFields::Field& field, DateTime& date) { date = Utils::ReadDateFromFile(file, field.key); });
}

void AssetIDDetails::readPersonalizedPairs(PropertyFile& file) {
    const auto readOrNull = [&](const char* key) {
        std::string text = Utils::ReadStringFromFile(file, key);
        return text.empty() ? std::string(emptyPersonalized) : text;
    };
    std::vector<PersonalizedPair> pairs;
    for (const PairKeys& keys : pairKeys) {
        std::string label = readOrNull(keys.label);
        std::string data = readOrNull(keys.data);
        traceVariable(at(traceSource, Level::flow, "AssetIDDetails"), "label", label);
        traceVariable(at(traceSource, Level::flow, "AssetIDDetails"), "data", data);
        pairs.emplace_back(std::move(label), std::move(data));
    }
    _PersonalizedData = std::move(pairs);
}

void AssetIDDetails::flushAssetData() {
    const Traced traced(at(traceSource));
    try {
        PropertyFile file{File::Path(_FileName)};
        const FileLock lock;
        file.open(FILE_MODE_WRITE);
        forEachField([&](const auto& field, const auto& text) { Utils::WriteStringToFile(file, field.key, text); },
                     [&](const auto& field, const auto& date) { Utils::WriteDateToFile(file, field.key, date); });
        for (std::size_t pair = 0; pair < std::min(pairCount, _PersonalizedData.size()); ++pair) {
            Utils::WriteStringToFile(file, pairKeys[pair].label, _PersonalizedData[pair].first);
            Utils::WriteStringToFile(file, pairKeys[pair].data, _PersonalizedData[pair].second);
        }
        file.close();
    } catch (...) {
        traceMessage(at(traceSource), "Throwing Exception while writing Data");
    }
}

std::wstring AssetIDDetails::getFileName() {
    const Traced traced(at(traceSource));
    std::wstring path;
    std::optional<FileLock> lock;
    try {
        lock.emplace();
        path = make_wstring(PlatformUtilities::getKelsaDataDir()) + assetFileName;
        File file(path);
        file.open(FILE_MODE_WRITE);
        file.close();
        traceMessage(at(traceSource), "Asset.dat file opened in write mode Successfully");
    } catch (...) {
        traceMessage(at(traceSource, Level::detail), "Failed while opening Asset.dat in write mode");
    }
    return path;
}

AssetIDDetails::operator bool() const {
    const Traced traced(at(traceSource));
    return _ComputerNode;
}

void AssetIDDetails::operator++() {
    const Traced traced(at(traceSource));
    do {
        ++_ComputerNode;
    } while (_FilterActive && _ComputerNode && !evaluate());
}

void AssetIDDetails::setFilter(FilterType type, std::string value) {
    const Traced traced(at(traceSource, Level::error), label::filterType, type, label::reference, value);
    _FilterActive = true;
    _Filters.push_back({type, value});
    while (_ComputerNode && !evaluate()) {
        ++_ComputerNode;
    }
}

bool AssetIDDetails::evaluate() const {
    const Traced traced(at(traceSource));
    return std::all_of(_Filters.begin(), _Filters.end(), [&](const Filter& filter) {
        std::string value;
        return !comparedValue(filter.type, value) || value == filter.value;
    });
}

bool AssetIDDetails::comparedValue(FilterType type, std::string& value) const {
    switch (type) {
        case FILTER_NAME:
            return _ComputerNode.getProperty(NodeLexicon::PROPERTY_NAME, value);
        case FILTER_VENDOR:
            return _SystemNode.getProperty(NodeLexicon::PROPERTY_VENDOR, value);
        case FILTER_VERSION:
            value = make_string(Product::getVersion());
            return true;
        default:
            value = _SystemNode.convertPathToString(_SystemNode.getPathToNode());
            return true;
    }
}

template <class Member, class Value>
bool AssetIDDetails::stored(const CallSite& site, const Member& member, Value& value) const {
    const Traced traced(site);
    if (_Loaded) {
        if constexpr (std::is_same_v<Member, DateTime>) {
            value = Utils::convertCIMDateTime(member);
        } else {
            value = member;
        }
    }
    return _Loaded;
}

template <class Member, class Value>
void AssetIDDetails::store(const CallSite& site, Member& member, const Value& value) {
    const Traced traced(site);
    if constexpr (std::is_same_v<Member, DateTime>) {
        member = Utils::convertStringToDateTime(value);
    } else {
        member = value;
    }
}

bool AssetIDDetails::getAssetNumber(std::string& value) const {
    return stored(at(traceSource), _AssetNumber, value);
}

bool AssetIDDetails::getAssetIdTag(std::string& value) const {
    return stored(at(traceSource), _AssetIdTag, value);
}

bool AssetIDDetails::getPrimaryOwnerName(std::string& value) const {
    return stored(at(traceSource), _OwnerName, value);
}

bool AssetIDDetails::getPrimaryOwnerPhone(std::string& value) const {
    return stored(at(traceSource), _OwnerPhone, value);
}

bool AssetIDDetails::getPrimaryOwnerPosition(std::string& value) const {
    return stored(at(traceSource), _OwnerPosition, value);
}

bool AssetIDDetails::getPrimaryOwnerDepartment(std::string& value) const {
    return stored(at(traceSource), _OwnerDepartment, value);
}

bool AssetIDDetails::getSystemLocation(std::string& value) const {
    return stored(at(traceSource), _SystemLocation, value);
}

bool AssetIDDetails::getZOPMProfile(std::string& value) const {
    return stored(at(traceSource), _ZOPMProfile, value);
}

bool AssetIDDetails::getDeploymentProfile(std::string& value) const {
    return stored(at(traceSource), _ZOPMProfile, value);
}

bool AssetIDDetails::getLastInventoried(std::string& value) const {
    return stored(at(traceSource), _LastInventoried, value);
}

bool AssetIDDetails::getPurchaseDate(std::string& value) const {
    return stored(at(traceSource), _PurchaseDate, value);
}

bool AssetIDDetails::getZOPMUpdateTime(std::string& value) const {
    return stored(at(traceSource), _ZOPMUpdateTime, value);
}

bool AssetIDDetails::getDeploymentUpdateTime(std::string& value) const {
    return stored(at(traceSource), _ZOPMUpdateTime, value);
}

bool AssetIDDetails::getPersonalizedData(std::vector<PersonalizedPair>& value) const {
    return stored(at(traceSource), _PersonalizedData, value);
}

bool AssetIDDetails::getCSName(std::string& value) const {
    const Traced traced(at(traceSource));
    return _ComputerNode.getProperty(NodeLexicon::PROPERTY_NAME, value);
}

bool AssetIDDetails::getName(std::string& value) const {
    const Traced traced(at(traceSource));
    return _ComputerNode.getProperty(NodeLexicon::PROPERTY_NAME, value);
}

bool AssetIDDetails::getVendor(std::string& value) const {
    const Traced traced(at(traceSource));
    return _SystemNode.getProperty(NodeLexicon::PROPERTY_VENDOR, value);
}

bool AssetIDDetails::getProductName(std::string& value) const {
    const Traced traced(at(traceSource));
    std::string name;
    if (!_ComputerNode.getProperty(NodeLexicon::PROPERTY_PRODUCT_NAME, name)) {
        return false;
    }
    const std::size_t dash = name.find('-');
    if (dash != std::string::npos) {
        // Also removes the character before the dash, normally a blank. A name with a leading dash stays unchanged.
        value = dash == 0 ? name : name.substr(0, dash - 1);
    }
    return true;
}

std::string AssetIDDetails::getIdentifyingNumber() const {
    const Traced traced(at(traceSource));
    return _SystemNode.convertPathToString(_SystemNode.getPathToNode());
}

std::string AssetIDDetails::getVersion() const {
    const Traced traced(at(traceSource));
    return make_string(Product::getVersion());
}

std::string AssetIDDetails::getCaption() const {
    const Traced traced(at(traceSource));
    return assetCaption;
}

std::string AssetIDDetails::getDescription() const {
    const Traced traced(at(traceSource));
    return assetCaption;
}

unsigned int AssetIDDetails::getAssetIDStringArea() const {
    const Traced traced(at(traceSource));
    return assetStringArea;
}

std::string AssetIDDetails::getLocalDateTime() const {
    const Traced traced(at(traceSource));
    return Utils::convertCIMDateTime(DateTime(std::time(nullptr), presentTime));
}

void AssetIDDetails::setAssetNumber(const std::string& value) {
    store(at(traceSource), _AssetNumber, value);
}

void AssetIDDetails::setOwnerName(const std::string& value) {
    store(at(traceSource), _OwnerName, value);
}

void AssetIDDetails::setOwnerPhone(const std::string& value) {
    store(at(traceSource), _OwnerPhone, value);
}

void AssetIDDetails::setOwnerPosition(const std::string& value) {
    store(at(traceSource), _OwnerPosition, value);
}

void AssetIDDetails::setOwnerDepartment(const std::string& value) {
    store(at(traceSource), _OwnerDepartment, value);
}

void AssetIDDetails::setSystemLocation(const std::string& value) {
    store(at(traceSource), _SystemLocation, value);
}

void AssetIDDetails::setZOPMProfile(const std::string& value) {
    store(at(traceSource), _ZOPMProfile, value);
}

void AssetIDDetails::setLastInventoried(const std::string& value) {
    store(at(traceSource), _LastInventoried, value);
}

void AssetIDDetails::setSystemPurchaseDate(const std::string& value) {
    store(at(traceSource), _PurchaseDate, value);
}

void AssetIDDetails::setZOPMUpdateTime(const std::string& value) {
    store(at(traceSource), _ZOPMUpdateTime, value);
}

void AssetIDDetails::setPersonalizedData(const std::vector<PersonalizedPair>& value) {
    store(at(traceSource), _PersonalizedData, value);
}

}  // namespace KO::LeaseWarrantyProvider
