#pragma once

#include <dlfcn.h>

#include <gtest/gtest.h>

#include "host_side_interfaces.h"

// The plug-in opened as a client opens it, with its four exports resolved by name.
class PluginLibraryTest : public ::testing::Test {
protected:
    void SetUp() override {
        library = dlopen(VEXMAP_PLUGIN_PATH, RTLD_NOW | RTLD_LOCAL);
        ASSERT_NE(nullptr, library) << dlerror();
        getRegister = reinterpret_cast<host_side::Registry* (*)()>(dlsym(library, "GetRegister"));
        createDewarper =
            reinterpret_cast<host_side::Dewarper* (*)(int, host_side::CameraRecord const&)>(
                dlsym(library, "CreateDewarper"));
        dewarperLoaded = reinterpret_cast<bool (*)(int)>(dlsym(library, "DewarperLoaded"));
        deleteDewarper =
            reinterpret_cast<void (*)(host_side::Dewarper*)>(dlsym(library, "DeleteDewarper"));
        ASSERT_NE(nullptr, getRegister);
        ASSERT_NE(nullptr, createDewarper);
        ASSERT_NE(nullptr, dewarperLoaded);
        ASSERT_NE(nullptr, deleteDewarper);
    }

    void TearDown() override {
        if (library != nullptr) {
            dlclose(library);
        }
    }

    /// What a dewarper just made by the exported `CreateDewarper` answers to `GetPosition`.
    struct NewPosition {
        bool made = false;
        float pan = -1.0f;
        float tilt = -1.0f;
        float zoom = -1.0f;
    };

    NewPosition PositionOfANewDewarper(int mode) {
        NewPosition position;
        host_side::CameraRecord const record{};
        host_side::Dewarper* dewarper = createDewarper(mode, record);
        if (dewarper != nullptr) {
            position.made = true;
            dewarper->GetPosition(position.pan, position.tilt, position.zoom);
            deleteDewarper(dewarper);
        }
        return position;
    }

    void* library = nullptr;
    host_side::Registry* (*getRegister)() = nullptr;
    host_side::Dewarper* (*createDewarper)(int, host_side::CameraRecord const&) = nullptr;
    bool (*dewarperLoaded)(int) = nullptr;
    void (*deleteDewarper)(host_side::Dewarper*) = nullptr;
};
