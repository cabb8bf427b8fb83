#pragma once

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_OstrelAgent: the management agent itself. A cursor over exactly one object; filters only
 * check that a key identifies this agent.
 */
class OstrelAgent {
public:
    /** Keys that setFilter() checks. It ignores filters with other values of this type. */
    enum FilterType : int {
        FILTER_NAME = 0,
        FILTER_IDENTIFYING_NUMBER = 1,
        FILTER_PRODUCT_NAME = 2,
        FILTER_VENDOR = 3,
        FILTER_VERSION = 4,
    };

    /** Starts at the agent. */
    OstrelAgent();

    /** Returns whether the cursor is at the agent. */
    operator bool() const;

    /** Moves past the agent. */
    void operator++();

    /**
     * Throws InstrumentationException unless the value is equal to the agent's, byte for byte. Otherwise does nothing.
     */
    void setFilter(FilterType type, std::string value) const;

    /** Returns the display name: the product's name, with a suffix if the marker file is installed. */
    std::string getName() const;
    std::string getProductName() const;  ///< the same string as getName()
    std::string getVersion() const;
    std::string getBuildNumber() const;
    std::string getIdentifyingNumber() const;
    std::string getVendor() const;
    std::string getCaption() const;
    std::string getDescription() const;
    std::string getStatus() const;

private:
    bool _Done = false;
};

}  // namespace KO::LeaseWarrantyProvider
