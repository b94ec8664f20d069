#pragma once

#include <map>

#include "DewarpWrapper.h"
#include "OperatingSystemVersion.h"

/// The fixed set of dewarper kinds, registered once when the library is loaded. Owns one record per
/// kind and the hidden dewarpers made to answer `GetLens`. The kinds never change after
/// construction, so the read-only queries may run on any thread; `GetLens`, `IsLoaded` and
/// `Create` through `CreateDewarper` write state and must be serialised by the host.
class DewarperRegistry : public IDewarpRegister {
public:
    /// Everything the registry knows of one kind, and how to build its class.
    class DewarpInfo {
    public:
        DewarpInfo();
        DewarpInfo(DewarpInfo const& other);
        DewarpInfo& operator=(DewarpInfo const& other);
        virtual ~DewarpInfo();

        virtual IDewarper* Create(DewarpParams_t const& params) = 0;
        virtual bool DelayLoad() = 0;
        virtual void DelayUnload() = 0;
        virtual void ForceUnload() = 0;
        virtual int GetDefaultLens(int mode, char const* make, char const* model) = 0;

        char const* dll;  // the vendor library's name; stored, never read again
        char const* name;
        bool hasPosition;
        bool hasLenses;
        bool hasCircle;
        bool cameraSpecific;
        bool loaded;  // caches a successful DelayLoad
    };

    /// The number of modes the host may ask about, registered or not.
    static constexpr int MODE_COUNT = 17;

    /// Registers the kinds that the running system can serve.
    DewarperRegistry();
    /// Registers the kinds that a system of the version `readVersion` tells can serve.
    explicit DewarperRegistry(OperatingSystemVersion (*readVersion)());
    DewarperRegistry(DewarperRegistry const&) = delete;  // owns its records and dewarpers
    DewarperRegistry& operator=(DewarperRegistry const&) = delete;
    ~DewarperRegistry() override;

    bool IsCameraSpecific(int mode) override;
    void GetSupportedFeatures(int mode, bool& hasLenses, bool& hasCircle,
                              bool& hasPosition) override;
    bool IsLoaded(int mode) override;
    char const* GetName(int mode) override;
    int GetLens(int mode, int lens, char* buffer, unsigned long size) override;
    int GetModeCount() override;
    int GetModeByName(char const* name) override;
    int GetModeByCamera(char const* make, char const* model, char const* url) override;
    int GetDefaultLens(int mode, char const* make, char const* model) override;
    IDewarper* Create(DewarperType::DewarperTypes type, DewarpParams_t const& params) override;

    /// The steps of `CreateDewarper`: `Create` with the delayed load in front.
    IDewarper* LoadAndCreate(int type, DewarpParams_t const& params);

private:
    template <typename T>
    void Register(char const* dll, char const* name, bool hasPosition, bool hasLenses,
                  bool hasCircle, bool cameraSpecific, DewarperType::DewarperTypes type);

    DewarpInfo* Find(int mode) const;  // null for a mode without a record

    std::map<int, DewarpInfo*> kinds;
    std::map<int, IDewarper*> lensDewarpers;
};

/// The one registry of the library, built at load and destroyed at unload.
extern DewarperRegistry DewarperRegistryInstance;
