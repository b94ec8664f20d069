#include "SharedLibrary.h"

#include <dlfcn.h>

bool SharedLibrary::Open(char const* fileName) {
    Close();
    if (fileName != nullptr) {
        // Local binding keeps a vendor's symbols away from the host's and from other vendors'.
        handle = dlopen(fileName, RTLD_NOW | RTLD_LOCAL);
    }
    return handle != nullptr;
}

void SharedLibrary::Close() {
    if (handle != nullptr) {
        dlclose(handle);
        handle = nullptr;
    }
}

void* SharedLibrary::Find(char const* symbol) const {
    if (handle == nullptr || symbol == nullptr) {
        return nullptr;
    }
    return dlsym(handle, symbol);
}
