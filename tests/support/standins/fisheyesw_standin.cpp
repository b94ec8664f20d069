#include "fisheyesw_standin.h"

#include <cstdint>
#include <map>

namespace {

constexpr int NO_OBJECT = -1;  // what the stand-in answers a call without an object

// One object of the library: the last whole setup it was given.
struct FisheyeObject {
    Fisheye_Option setup{};
};

struct Recorder {
    std::vector<fisheyesw_standin::Call> calls;
    std::map<std::string, int> results;
    int live = 0;
};

Recorder& State() {
    static Recorder recorder;
    return recorder;
}

fisheyesw_standin::Call& Record(char const* function, void* handle) {
    fisheyesw_standin::Call call;
    call.function = function;
    call.handle = handle;
    State().calls.push_back(call);
    return State().calls.back();
}

int ResultOf(char const* function) {
    auto const found = State().results.find(function);
    return found == State().results.end() ? 0 : found->second;
}

}  // namespace

namespace fisheyesw_standin {

void Reset() {
    State().calls.clear();
    State().results.clear();
}

void ClearCalls() {
    State().calls.clear();
}

std::vector<Call> const& Calls() {
    return State().calls;
}

std::vector<std::string> CallNames() {
    std::vector<std::string> names;
    for (Call const& call : State().calls) {
        names.push_back(call.function);
    }
    return names;
}

std::vector<Fisheye_Option> Options() {
    std::vector<Fisheye_Option> options;
    for (Call const& call : State().calls) {
        if (call.function == "Fisheye_SetOption") {
            options.push_back(call.option);
        }
    }
    return options;
}

void SetResult(std::string const& function, int code) {
    State().results[function] = code;
}

int LiveObjects() {
    return State().live;
}

}  // namespace fisheyesw_standin

extern "C" {

int Fisheye_Initial(void** handle, unsigned int version) {
    fisheyesw_standin::Call& call = Record("Fisheye_Initial", nullptr);
    call.handleAddress = handle;
    call.version = version;
    if (handle == nullptr) {
        return NO_OBJECT;
    }
    int const result = ResultOf("Fisheye_Initial");
    if (result == 0) {
        *handle = new FisheyeObject;
        call.handle = *handle;
        ++State().live;
    }
    return result;
}

int Fisheye_Release(void** handle) {
    fisheyesw_standin::Call& call =
        Record("Fisheye_Release", handle == nullptr ? nullptr : *handle);
    call.handleAddress = handle;
    if (handle == nullptr) {
        return NO_OBJECT;
    }
    int const result = ResultOf("Fisheye_Release");
    if (result == 0 && *handle != nullptr) {
        delete static_cast<FisheyeObject*>(*handle);
        *handle = nullptr;
        --State().live;
    }
    return result;
}

int Fisheye_SetModelName(void* handle, char const* name) {
    fisheyesw_standin::Call& call = Record("Fisheye_SetModelName", handle);
    call.namePointer = name;
    call.name = name == nullptr ? "" : name;
    return handle == nullptr ? NO_OBJECT : ResultOf("Fisheye_SetModelName");
}

int Fisheye_SetOption(void* handle, void* option) {
    fisheyesw_standin::Call& call = Record("Fisheye_SetOption", handle);
    call.option = *static_cast<Fisheye_Option*>(option);
    if (handle == nullptr) {
        return NO_OBJECT;
    }
    int const result = ResultOf("Fisheye_SetOption");
    if (result == 0 && call.option.flags == FISHEYE_OPTION_SETUP) {
        static_cast<FisheyeObject*>(handle)->setup = call.option;
    }
    return result;
}

}  // extern "C"

#ifndef FISHEYESW_STANDIN_INCOMPLETE

namespace {

// Nearest neighbour from one plane into another, each `width` bytes a row.
void ScalePlane(unsigned char const* from, int fromWidth, int fromHeight, unsigned char* to,
                int toWidth, int toHeight) {
    if (fromWidth <= 0 || fromHeight <= 0) {
        return;
    }
    for (int y = 0; y < toHeight; ++y) {
        int const sourceY = int(int64_t(y) * fromHeight / toHeight);
        for (int x = 0; x < toWidth; ++x) {
            int const sourceX = int(int64_t(x) * fromWidth / toWidth);
            to[int64_t(y) * toWidth + x] = from[int64_t(sourceY) * fromWidth + sourceX];
        }
    }
}

// A planar 4:2:0 frame: the luma plane, then the two chroma planes at half size each way.
void ScaleFrame(Fisheye_Option const& setup) {
    int const inWidth = setup.inputWidth;
    int const inHeight = setup.inputHeight;
    int const outWidth = setup.outputWidth;
    int const outHeight = setup.outputHeight;
    if (setup.input == nullptr || setup.output == nullptr || outWidth <= 0 || outHeight <= 0) {
        return;
    }
    unsigned char const* from = setup.input;
    unsigned char* to = setup.output;
    ScalePlane(from, inWidth, inHeight, to, outWidth, outHeight);
    from += int64_t(inWidth) * inHeight;
    to += int64_t(outWidth) * outHeight;
    for (int chroma = 0; chroma < 2; ++chroma) {
        ScalePlane(from, inWidth / 2, inHeight / 2, to, outWidth / 2, outHeight / 2);
        from += int64_t(inWidth / 2) * (inHeight / 2);
        to += int64_t(outWidth / 2) * (outHeight / 2);
    }
}

}  // namespace

extern "C" int Fisheye_OneFrame(void* handle) {
    Record("Fisheye_OneFrame", handle);
    if (handle == nullptr) {
        return NO_OBJECT;
    }
    int const result = ResultOf("Fisheye_OneFrame");
    if (result == 0) {
        ScaleFrame(static_cast<FisheyeObject*>(handle)->setup);
    }
    return result;
}

#endif
