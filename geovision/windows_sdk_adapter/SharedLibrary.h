#pragma once

/// A library opened by name at run time, and the addresses of its functions. Not copied: the one
/// handle is closed once. Constant-initialised, so that an object of static storage is usable
/// from any other static initialiser and needs no destruction.
class SharedLibrary {
public:
    constexpr SharedLibrary() noexcept : handle(nullptr) {}
    SharedLibrary(SharedLibrary const&) = delete;
    SharedLibrary& operator=(SharedLibrary const&) = delete;

    /// Opens `fileName` through the dynamic loader's search (or the path it names) and binds every
    /// symbol at once, so that a library with an unresolved dependency fails here and not in a
    /// call. False, and nothing open, when it cannot be loaded; an open library is closed first.
    bool Open(char const* fileName);
    void Close();
    bool IsOpen() const { return handle != nullptr; }

    /// The address of `symbol` in the open library, or null when it has none or nothing is open.
    void* Find(char const* symbol) const;

    /// Sets `function` to the symbol's address, typed; true when the symbol was found.
    template <typename Function>
    bool Bind(char const* symbol, Function*& function) const {
        // Converting an object pointer to a function pointer is what the loader's interface
        // needs, and is defined on every platform with a dynamic loader.
        function = reinterpret_cast<Function*>(Find(symbol));
        return function != nullptr;
    }

private:
    void* handle;
};
