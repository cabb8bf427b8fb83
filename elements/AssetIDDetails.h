#pragma once

#include <string>
#include <utility>
#include <vector>

#include "KO/DateTime.h"
#include "KO/Instrumentation.h"
#include "KO/Mutex.h"

namespace KO {

class PropertyFile;
struct CallSite;

/** Locked while the asset data file is created, read or written. */
extern Mutex _fileMutex;

}  // namespace KO

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_AssetIDDetails: the asset identification of this computer, which is in the agent's
 * property file asset.dat, and properties of the computer and the product.
 *
 * The element is a cursor over the computer nodes of the instrumentation tree, restricted by filters. The asset data
 * are the same for each node. The constructor reads the file into a snapshot, the setters change the snapshot, and
 * flushAssetData() writes the snapshot to the file.
 *
 * Failures of the file or its lock are logged and never thrown. If the file could not be read, the getters of stored
 * values return false. Other exceptions of the framework are propagated, for example from creating the cursors, reading
 * a node or converting a date.
 */
class AssetIDDetails {
public:
    /** A label and its data string. */
    using PersonalizedPair = std::pair<std::string, std::string>;

    /** Property that a filter compares. Other values compare like FILTER_IDENTIFYING_NUMBER. */
    enum FilterType : int {
        FILTER_IDENTIFYING_NUMBER = 0,
        FILTER_NAME = 1,
        FILTER_VENDOR = 2,
        FILTER_VERSION = 3,
    };

    /** A condition on computer nodes. */
    struct Filter {
        FilterType type;
        std::string value;
    };

    /** Number of personalized pairs. */
    static constexpr std::size_t pairCount = 5;

    /**
     * Reads the file and moves to the first computer node. Creates an empty file if there is none. Does not read the
     * file if there is no computer node or no system node.
     */
    AssetIDDetails();
    /** Does not write the file. */
    ~AssetIDDetails();
    AssetIDDetails(const AssetIDDetails&) = delete;
    AssetIDDetails& operator=(const AssetIDDetails&) = delete;

    /** Returns whether there is a current computer node. */
    operator bool() const;

    /** Moves to the next computer node that passes all filters, or to the end. */
    void operator++();

    /** Adds a filter. Moves to the first node that passes all filters, starting at the current node, or to the end. */
    void setFilter(FilterType type, std::string value);

    /** Returns whether the current node passes all filters. A filter whose property cannot be read passes. */
    bool evaluate() const;

    /** Writes the snapshot to the file. A failure is only logged. */
    void flushAssetData();

    /** Returns the path of the file and creates an empty file if there is none. A failure is only logged. */
    std::wstring getFileName();

    /** @name Stored values
     * Each getter returns whether the file was read. Dates are CIM datetime strings.
     */
    ///@{
    bool getAssetNumber(std::string& value) const;
    bool getAssetIdTag(std::string& value) const;
    bool getPrimaryOwnerName(std::string& value) const;
    bool getPrimaryOwnerPhone(std::string& value) const;
    bool getPrimaryOwnerPosition(std::string& value) const;
    bool getPrimaryOwnerDepartment(std::string& value) const;
    bool getSystemLocation(std::string& value) const;
    bool getZOPMProfile(std::string& value) const;
    bool getDeploymentProfile(std::string& value) const;  ///< same value as getZOPMProfile()
    bool getLastInventoried(std::string& value) const;
    bool getPurchaseDate(std::string& value) const;
    bool getZOPMUpdateTime(std::string& value) const;
    bool getDeploymentUpdateTime(std::string& value) const;  ///< same value as getZOPMUpdateTime()
    bool getPersonalizedData(std::vector<PersonalizedPair>& value) const;
    ///@}

    /** @name Values of the computer
     * Each getter returns whether the instrumentation has the value. If not, it leaves the argument unchanged.
     */
    ///@{
    bool getCSName(std::string& value) const;  ///< name of the computer
    bool getName(std::string& value) const;    ///< name of the computer
    bool getVendor(std::string& value) const;

    /**
     * Reads the product's name without its suffix: from "name - suffix", removes the first dash, the character before
     * it and all that follows. Keeps a name that starts with a dash. If the name has no dash, leaves the argument
     * unchanged and returns true.
     */
    bool getProductName(std::string& value) const;
    ///@}

    std::string getIdentifyingNumber() const;  ///< string form of the system node's path
    std::string getVersion() const;            ///< version of the agent product
    std::string getCaption() const;
    std::string getDescription() const;
    unsigned int getAssetIDStringArea() const;  ///< size of the asset string area in bytes; always 1024
    std::string getLocalDateTime() const;       ///< current time as a CIM datetime string

    /** @name Changes of the snapshot
     * Dates are CIM datetime strings. The asset tag has no setter.
     */
    ///@{
    void setAssetNumber(const std::string& value);
    void setOwnerName(const std::string& value);
    void setOwnerPhone(const std::string& value);
    void setOwnerPosition(const std::string& value);
    void setOwnerDepartment(const std::string& value);
    void setSystemLocation(const std::string& value);
    void setZOPMProfile(const std::string& value);
    void setLastInventoried(const std::string& value);
    void setSystemPurchaseDate(const std::string& value);
    void setZOPMUpdateTime(const std::string& value);
    void setPersonalizedData(const std::vector<PersonalizedPair>& value);
    ///@}

private:
    struct StoredFields;

    template <class OnText, class OnDate>
    void forEachField(OnText onText, OnDate onDate);
    void readFixedFields(PropertyFile& file);
    void readPersonalizedPairs(PropertyFile& file);
    bool comparedValue(FilterType type, std::string& value) const;

    /** Reads a member if the file was read; a date as a CIM datetime string. Traced under the name of the caller. */
    template <class Member, class Value>
    bool stored(const CallSite& site, const Member& member, Value& value) const;

    /** Changes a member; a date from a CIM datetime string. Traced under the name of the caller. */
    template <class Member, class Value>
    static void store(const CallSite& site, Member& member, const Value& value);

    bool _Loaded = false;
    std::wstring _FileName{};
    mutable Instrumentation _ComputerNode{};  ///< mutable: the framework's cursor has no const operations
    mutable Instrumentation _SystemNode{};
    std::string _AssetNumber{};
    std::string _AssetIdTag{};
    std::string _OwnerName{};
    std::string _OwnerPhone{};
    std::string _OwnerPosition{};
    std::string _OwnerDepartment{};
    DateTime _LastInventoried{};
    DateTime _PurchaseDate{};
    std::string _SystemLocation{};
    std::string _ZOPMProfile{};
    DateTime _ZOPMUpdateTime{};
    std::vector<PersonalizedPair> _PersonalizedData{};
    bool _FilterActive = false;
    std::vector<Filter> _Filters{};
};

}  // namespace KO::LeaseWarrantyProvider
