#include "broker/Profile.h"

#include <algorithm>
#include <iterator>

#include "broker/Tables.h"

namespace cimhost {
namespace {

Profile standardProfile() {
    Profile profile{};
    profile.manager = Manager::standard;
    profile.name = "standard";
    profile.brokerVersion = tableVersion;
    profile.encapsulationVersion = tableVersion;
    profile.fillsAssociationClass = true;
    return profile;
}

Profile sfcbProfile() {
    Profile profile{};
    profile.manager = Manager::sfcb;
    profile.name = "sfcb";
    profile.brokerVersion = 0;
    profile.encapsulationVersion = 1;
    profile.gaps = BrokerGaps::someFunctions;
    profile.thread = RequestThread::ownUnlessNested;
    profile.escape = Escape::endOfProcess;
    profile.created = CreationResult::pathRead;
    profile.completesInstances = true;
    profile.hollowTexts = true;
    profile.keepsReturnedPath = true;
    profile.trimsBlanks = true;
    profile.trimsOutsideAscii = true;
    profile.startsProviderPerClass = true;
    profile.factory = FactoryChoice::genericFirst;
    profile.typing = Typing::numbersPass;
    profile.answerLimit = 10'000'000;
    profile.startsAllInterfaces = true;
    profile.startsAtOnce = true;
    profile.filterHidesKeys = true;
    return profile;
}

Profile openPegasusProfile() {
    Profile profile = standardProfile();
    profile.manager = Manager::openPegasus;
    profile.name = "pegasus";
    profile.gaps = BrokerGaps::memoryTable;
    profile.thread = RequestThread::own;
    profile.escape = Escape::unknownError;
    profile.created = CreationResult::pathOnly;
    profile.completesInstances = true;
    profile.creationKey = CreationKey::unreadable;
    profile.marksElementsNull = true;
    profile.namesAllProperties = true;
    profile.refusesEmptyGet = true;
    profile.emptiesReferences = true;
    profile.factory = FactoryChoice::onlyOne;
    profile.typing = Typing::byClass;
    profile.loadsLazily = true;
    profile.staysIfAllAsk = true;
    profile.trimsBlanks = true;
    return profile;
}

Profile emptyKeyProfile() {
    Profile profile = openPegasusProfile();
    profile.manager = Manager::openPegasusEmptyKey;
    profile.name = "pegasus-empty-key";
    profile.creationKey = CreationKey::empty;
    return profile;
}

void leaveMarksOnly(CMPIBrokerMemFT& memory) {
    memory.cmpiMalloc = nullptr;
    memory.cmpiCalloc = nullptr;
    memory.cmpiRealloc = nullptr;
    memory.cmpiStrDup = nullptr;
    memory.cmpiFree = nullptr;
    memory.freeInstance = nullptr;
    memory.freeObjectPath = nullptr;
    memory.freeArgs = nullptr;
    memory.freeString = nullptr;
    memory.freeArray = nullptr;
    memory.freeDateTime = nullptr;
    memory.freeSelectExp = nullptr;
}

const Profile (&profiles())[4] {
    static const Profile all[] = {standardProfile(), sfcbProfile(), openPegasusProfile(), emptyKeyProfile()};
    return all;
}

}  // namespace

const Profile& profileOf(Manager manager) {
    return profiles()[static_cast<std::size_t>(manager)];
}

std::optional<Manager> managerNamed(std::string_view name) {
    const auto& all = profiles();
    const auto* found =
        std::find_if(std::begin(all), std::end(all), [&](const Profile& profile) { return name == profile.name; });
    return found == std::end(all) ? std::nullopt : std::optional<Manager>(found->manager);
}

void applyGaps(const Profile& profile, FunctionTables& tables) {
    tables.broker.brokerVersion = profile.brokerVersion;
    tables.encapsulation.ftVersion = profile.encapsulationVersion;
    if (profile.filterHidesKeys) {
        tables.instance.setPropertyFilter = filterWithKeys;
    }
    if (profile.gaps != BrokerGaps::someFunctions) {
        return;
    }
    tables.encapsulation.newCMPIError = nullptr;
    tables.encapsulation.openMessageFile = nullptr;
    tables.encapsulation.closeMessageFile = nullptr;
    tables.encapsulation.getMessage2 = nullptr;
    tables.threads.joinThread = nullptr;
    tables.threads.exitThread = nullptr;
    tables.threads.cancelThread = nullptr;
    tables.threads.threadSleep = nullptr;
    tables.threads.signalCondition = nullptr;
    leaveMarksOnly(tables.memory);
}

}  // namespace cimhost
