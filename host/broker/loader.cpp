// How a provider's library comes into the process and becomes its interfaces.
#include "host/broker/provider_call.h"

#include <dlfcn.h>

namespace velkhost::broker {
namespace {

template <class... Slots>
bool all_filled(Slots... slots) {
    return ((slots != nullptr) && ...);
}

// Whether every function of a provider's table is there; a broker calls them without a look.
bool is_complete(const CMPIInstanceMIFT &table) {
    return all_filled(table.cleanup, table.enumerateInstanceNames, table.enumerateInstances,
                      table.getInstance, table.createInstance, table.modifyInstance,
                      table.deleteInstance, table.execQuery);
}
bool is_complete(const CMPIAssociationMIFT &table) {
    return all_filled(table.cleanup, table.associators, table.associatorNames, table.references,
                      table.referenceNames);
}
bool is_complete(const CMPIMethodMIFT &table) {
    return all_filled(table.cleanup, table.invokeMethod);
}
bool is_complete(const CMPIPropertyMIFT &table) {
    return all_filled(table.cleanup);
}
bool is_complete(const CMPIIndicationMIFT &table) {
    return all_filled(table.cleanup, table.authorizeFilter, table.mustPoll, table.activateFilter,
                      table.deActivateFilter, table.enableIndications, table.disableIndications);
}

class Loading {
  public:
    Loading(Core &core, const Registration &registration)
        : core_(core), registration_(registration) {}

    Provider::Loaded run() {
        open_library();
        create(ProviderKind::kInstance, loaded_.interfaces.instance);
        create(ProviderKind::kMethod, loaded_.interfaces.method);
        create(ProviderKind::kAssociation, loaded_.interfaces.association);
        create(ProviderKind::kProperty, loaded_.interfaces.property);
        create(ProviderKind::kIndication, loaded_.interfaces.indication);
        return loaded_;
    }

  private:
    void fail(const std::string &cause) {
        loaded_ = {
            {CMPI_RC_ERR_FAILED, "Provider not loadable: " + registration_.provider + ": " + cause},
            {}};
    }

    void open_library() {
        const std::string file = "lib" + registration_.location + ".so";
        std::string folders;
        for (const std::filesystem::path &folder : core_.provider_folders) {
            std::error_code ignored;
            if (std::filesystem::exists(folder / file, ignored)) {
                library_ = ::dlopen((folder / file).c_str(), RTLD_NOW | RTLD_GLOBAL);
                if (library_ == nullptr) {
                    fail(::dlerror());
                }
                return;
            }
            folders += ' ' + folder.string();
        }
        fail(file + " is in no provider folder:" + folders);
    }

    template <class Interface>
    void create(ProviderKind kind, Interface *&made) {
        if (!loaded_.status.ok() || !registration_.kinds.has(kind)) {
            return;
        }
        const std::string suffix =
            "_Create_" + std::string(kKindNames[static_cast<std::size_t>(kind)]) + "MI";
        const std::string fixed = registration_.provider + suffix;
        CMPIStatus status{};
        ResultSink unused;
        ProviderCall call(core_, {"$$", 0, 0, false}, registration_.parameters, unused);
        Interface *interface = nullptr;
        using Generic =
            Interface *(*)(const CMPIBroker *, const CMPIContext *, const char *, CMPIStatus *);
        using Fixed = Interface *(*)(const CMPIBroker *, const CMPIContext *, CMPIStatus *);
        if (void *symbol = ::dlsym(library_, ("_Generic" + suffix).c_str())) {
            interface = reinterpret_cast<Generic>(symbol)(&core_.face, call.context(),
                                                          registration_.provider.c_str(), &status);
        } else if (void *own = ::dlsym(library_, fixed.c_str())) {
            interface = reinterpret_cast<Fixed>(own)(&core_.face, call.context(), &status);
        } else {
            return fail("neither _Generic" + suffix + " nor " + fixed + " is in lib" +
                        registration_.location + ".so");
        }
        accept(interface, from_cmpi(status), fixed, made);
    }

    template <class Interface>
    void accept(Interface *interface, const Status &status, const std::string &factory,
                Interface *&made) {
        if (interface == nullptr || !status.ok()) {
            return fail(factory + " failed with status " + std::to_string(status.code) +
                        (status.message.empty() ? "" : ": " + status.message));
        }
        if (interface->ft == nullptr || !is_complete(*interface->ft)) {
            return fail("the table of " + factory + " has an empty slot");
        }
        made = interface;
    }

    Core &core_;
    const Registration &registration_;
    void *library_ = nullptr;
    Provider::Loaded loaded_;
};

}  // namespace

Provider::Loaded load_from_library(Core &core, const Registration &registration) {
    return Loading(core, registration).run();
}

}  // namespace velkhost::broker
