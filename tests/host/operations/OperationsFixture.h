#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "operations/LoadedLibrary.h"
#include "operations/ObjectManager.h"
#include "support/Values.h"

/** An object manager with the test providers registered in root/cimv2. */
class OperationsTest : public testing::Test {
protected:
    OperationsTest() {
        for (const char* className : {"Sample_Thing", "Sample_Throwing", "Sample_ThrowingOdd", "Sample_Failing",
                                      "Sample_WrongKind", "Sample_Context", "Sample_Silent", "Sample_ReturnsInstance",
                                      "Sample_Recursive", "Sample_CallsSample_Thing", "Sample_CallsOther_Thing",
                                      "Sample_CallsMissing", "Sample_CallsSample_Throwing", "Sample_CallsUnloadable"}) {
            add(className, "Sample", "SampleProvider", true, false);
        }
        add("Sample_Link", "Sample", "SampleProvider", true, true);
        add("Sample_OtherLink", "Sample", "SampleProvider", false, true);
        add("Other_Thing", "Anything", "OtherProvider", true, false);
        add("Unloadable", "Absent", "DoesNotExist", true, false);
    }

    void add(const char* className, const char* provider, const char* location, bool instance, bool association) {
        cimhost::ProviderRegistration registration;
        registration.className = className;
        registration.provider = provider;
        registration.location = location;
        registration.instance = instance;
        registration.association = association;
        registration.nameSpaces = {"root/cimv2"};
        registry.add(registration);
    }

    /** The first call creates the manager, with the classes added until then. */
    cimhost::ObjectManager& manager() {
        if (!started) {
            options.libraries.searchPath = {"/nonexistent", TEST_PROVIDERS};
            options.log = [this](const cimhost::LogRecord& record) {
                log.push_back(record.message);
                if (record.message == awaited) {
                    awaited.clear();
                    whenLogged();
                }
            };
            started = std::make_unique<cimhost::ObjectManager>(options, registry);
        }
        return *started;
    }

    static cimhost::ObjectPath classPath(const char* className) {
        return testsupport::objectPath("root/cimv2", className);
    }

    static cimhost::ObjectPath named(const char* className, const char* name) {
        return testsupport::objectPath("root/cimv2", className, {testsupport::named("Name", testsupport::text(name))});
    }

    std::string awaited;               ///< the message at which whenLogged is called, once
    std::function<void()> whenLogged;  ///< called inside the provider's call

    std::vector<std::string> log;  ///< log of the providers; outlives the manager, whose end is logged too
    cimhost::ObjectManagerOptions options;
    cimhost::ProviderRegistry registry;
    std::unique_ptr<cimhost::ObjectManager> started;
};
