#pragma once

#include "KO/DateTime.h"
#include "KO/Instrumentation.h"
#include "KO/Mutex.h"

#include <string>
#include <utility>
#include <vector>

namespace KO {

class PropertyFile;
struct CallSite;

/** Held around every access to the asset data file: its creation, a whole read, a whole write. */
extern Mutex _fileMutex;

}  // namespace KO

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_AssetIDDetails: the asset identification of this computer, kept in the
 * agent's property file asset.dat, and the computer and product that it belongs to.
 *
 * It is a cursor over the computer nodes of the instrumentation tree, narrowed by filters; the asset
 * data are the same for each. They are read whole when the element is made and are a snapshot from
 * then on; setters change the snapshot, and flushAssetData writes it back whole.
 *
 * Nothing here throws on account of the file or its lock: a failure is logged and swallowed. When the
 * file could not be read, the getters of stored values answer false. What the framework throws otherwise,
 * as when the cursors are made, a node is read or a date converted, is let through.
 */
class AssetIDDetails {
public:
    /** A label and the text that belongs to it. */
    using PersonalizedPair = std::pair<std::string, std::string>;

    /** What a filter compares. A value without a name compares like FILTER_IDENTIFYING_NUMBER. */
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

    /** How many personalized pairs are kept. */
    static constexpr std::size_t pairCount = 5;

    /**
     * Reads the file, which is created, empty, if there is none, and stands on the first computer node.
     * Without a computer or a system node nothing is read.
     */
    AssetIDDetails();
    /** The file is not written. */
    ~AssetIDDetails();
    AssetIDDetails(const AssetIDDetails&) = delete;
    AssetIDDetails& operator=(const AssetIDDetails&) = delete;

    /** Whether the element stands on a computer node. */
    operator bool() const;

    /** Moves to the next computer node that passes the filters. */
    void operator++();

    /** Adds a filter and moves, from the current node on, to the first that passes all. */
    void setFilter(FilterType type, std::string value);

    /** Whether the current node passes all filters. A filter whose value cannot be found out counts as passed. */
    bool evaluate() const;

    /** Writes the snapshot to the file. A failure is only logged. */
    void flushAssetData();

    /** Path of the file, which is created, empty, if there is none; a failure is only logged. */
    std::wstring getFileName();

    /** @name Stored values
     * Answer whether the file was read. Dates are CIM datetime text.
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
    bool getDeploymentProfile(std::string& value) const;  ///< the ZOPM profile under its general name
    bool getLastInventoried(std::string& value) const;
    bool getPurchaseDate(std::string& value) const;
    bool getZOPMUpdateTime(std::string& value) const;
    bool getDeploymentUpdateTime(std::string& value) const;  ///< the ZOPM update time under its general name
    bool getPersonalizedData(std::vector<PersonalizedPair>& value) const;
    ///@}

    /** @name Values of the computer
     * Answer whether the instrumentation has them; where it does not, the argument stays as it was.
     */
    ///@{
    bool getCSName(std::string& value) const;  ///< the computer's name
    bool getName(std::string& value) const;    ///< the same
    bool getVendor(std::string& value) const;

    /**
     * The product's name without its suffix: of "name - suffix", what stands before the blank and the
     * first dash, whatever the character in the blank's place is. A name that begins with the dash is
     * given whole. A name without a dash leaves the argument as it was; the answer is true all the same.
     */
    bool getProductName(std::string& value) const;
    ///@}

    std::string getIdentifyingNumber() const;  ///< text form of the system's place in the instrumentation tree
    std::string getVersion() const;            ///< the agent product's version
    std::string getCaption() const;
    std::string getDescription() const;
    unsigned int getAssetIDStringArea() const;  ///< room for asset texts, in bytes: always 1024
    std::string getLocalDateTime() const;       ///< the present time, as CIM datetime text

    /** @name Changes of the snapshot
     * Dates are CIM datetime text. There is none for the asset tag, which is kept as it was read.
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
    bool stored(const CallSite& site, const std::string& member, std::string& value) const;
    bool stored(const CallSite& site, const DateTime& member, std::string& value) const;
    static void store(const CallSite& site, std::string& member, const std::string& value);
    static void store(const CallSite& site, DateTime& member, const std::string& value);

    bool _Loaded = false;
    std::wstring _FileName{};
    mutable Instrumentation _ComputerNode{};  ///< mutable: the framework's cursor has no operation for constant ones
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
