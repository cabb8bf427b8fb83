#pragma once

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_OstrelAgent: the management agent itself, of which there is always
 * exactly one. A one-step cursor; a filter only checks that a key describes this agent.
 */
class OstrelAgent {
public:
    /** The keys that setFilter checks. Other values are accepted and ignored. */
    enum FilterType : int {
        FILTER_NAME = 0,
        FILTER_IDENTIFYING_NUMBER = 1,
        FILTER_PRODUCT_NAME = 2,
        FILTER_VENDOR = 3,
        FILTER_VERSION = 4,
    };

    /** Stands on the agent. */
    OstrelAgent();

    /** Whether the element still stands on the agent. */
    operator bool() const;

    /** Moves past the agent, for good. */
    void operator++();

    /** Changes nothing, but throws InstrumentationException when the value, byte for byte, is not this agent's. */
    void setFilter(FilterType type, std::string value) const;

    /** Display name: the product's name, with a suffix where the installation carries the marker file. */
    std::string getName() const;
    std::string getProductName() const;  ///< the same text
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
