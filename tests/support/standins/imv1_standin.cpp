#include "imv1_standin.h"

#include <cstdio>
#include <cstring>
#include <map>

// What the stand-in keeps for one camera object: the two records of the last SetVideoParams.
struct IMV_CameraState {
    IMV_Buffer* input = nullptr;
    IMV_Buffer* output = nullptr;
};

namespace {

std::vector<IMV_LensDescription> DefaultLenses() {
    return {{"A8TRT", nullptr}, {nullptr, nullptr}, {"B5SST", nullptr},
            {"C7SST", nullptr}, {"C8WWT", nullptr}, {"D2SST", nullptr}};
}

struct Recorder {
    std::vector<imv1_standin::Call> calls;
    std::map<std::string, int> results;
    bool writeBack = false;
    float pan = 0.0f;
    float tilt = 0.0f;
    float zoom = 0.0f;
    std::vector<IMV_LensDescription> lenses = DefaultLenses();
    int live = 0;
};

Recorder& State() {
    static Recorder recorder;
    return recorder;
}

imv1_standin::Call& Record(char const* function, void const* object) {
    imv1_standin::Call call;
    call.function = function;
    call.object = object;
    State().calls.push_back(call);
    return State().calls.back();
}

int ResultOf(char const* function) {
    auto const found = State().results.find(function);
    return found == State().results.end() ? 0 : found->second;
}

}  // namespace

namespace imv1_standin {

void Reset() {
    Recorder& state = State();
    state.calls.clear();
    state.results.clear();
    state.writeBack = false;
    state.lenses = DefaultLenses();
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

void SetResult(std::string const& function, int code) {
    State().results[function] = code;
}

void WriteBackPosition(float pan, float tilt, float zoom) {
    Recorder& state = State();
    state.writeBack = true;
    state.pan = pan;
    state.tilt = tilt;
    state.zoom = zoom;
}

void SetLenses(std::vector<char const*> const& rplNumbers) {
    State().lenses.clear();
    for (char const* rpl : rplNumbers) {
        State().lenses.push_back({rpl, nullptr});
    }
}

int LiveObjects() {
    return State().live;
}

}  // namespace imv1_standin

IMV_CameraInterface::IMV_CameraInterface() : state(new IMV_CameraState) {
    Record("IMV_CameraInterface", this);
    ++State().live;
}

IMV_CameraInterface::~IMV_CameraInterface() {
    Record("~IMV_CameraInterface", this);
    delete state;
    --State().live;
}

IMV_LensDescription const* IMV_CameraInterface::StaticGetLensDescription() {
    Record("StaticGetLensDescription", nullptr);
    return State().lenses.data();
}

int IMV_CameraInterface::StaticGetLensDescriptionCount() {
    Record("StaticGetLensDescriptionCount", nullptr);
    return int(State().lenses.size());
}

int IMV_CameraInterface::SetLens(char* rpl) {
    Record("SetLens", this).rpl = rpl;
    return ResultOf("SetLens");
}

int IMV_CameraInterface::SetVideoParams(IMV_Buffer* input, IMV_Buffer* output,
                                        unsigned long colorFormat, unsigned long viewType,
                                        unsigned long position) {
    imv1_standin::Call& call = Record("SetVideoParams", this);
    call.input = *input;
    call.output = *output;
    call.inputAddress = input;
    call.outputAddress = output;
    call.colorFormat = colorFormat;
    call.viewType = viewType;
    call.position = position;
    int const result = ResultOf("SetVideoParams");
    if (result == 0) {
        state->input = input;
        state->output = output;
    }
    return result;
}

int IMV_CameraInterface::SetZoomLimits(float min, float max) {
    imv1_standin::Call& call = Record("SetZoomLimits", this);
    call.min = min;
    call.max = max;
    return ResultOf("SetZoomLimits");
}

int IMV_CameraInterface::SetPosition(float* pan, float* tilt, float* zoom, unsigned long fourth,
                                     unsigned long fifth) {
    imv1_standin::Call& call = Record("SetPosition", this);
    call.pan = *pan;
    call.tilt = *tilt;
    call.zoom = *zoom;
    call.fourth = fourth;
    call.fifth = fifth;
    int const result = ResultOf("SetPosition");
    if (result == 0 && State().writeBack) {
        *pan = State().pan;
        *tilt = State().tilt;
        *zoom = State().zoom;
    }
    return result;
}

// The picture goes through unchanged: the 12-bit frame of the input record, whole.
int IMV_CameraInterface::Update() {
    imv1_standin::Call& call = Record("Update", this);
    if (state->input != nullptr && state->output != nullptr) {
        call.input = *state->input;
        call.output = *state->output;
    }
    int const result = ResultOf("Update");
    if (result == 0 && state->input != nullptr && state->output != nullptr &&
        state->input->data != nullptr && state->output->data != nullptr) {
        std::memcpy(state->output->data, state->input->data,
                    state->input->width * state->input->height * 3 / 2);
    }
    return result;
}

char const* IMV_CameraInterface::GetErrorString(int code) {
    Record("GetErrorString", this).code = code;
    static char text[48];
    std::snprintf(text, sizeof text, "stand-in error %d", code);
    return text;
}
