#include "geofisheye_standin.h"

#include <algorithm>
#include <cstring>
#include <map>
#include <memory>
#include <set>

struct geo_fisheye_context {
    int serial;
};

namespace {

constexpr float WIDEST_VIEW = 100.0f;  // degrees: the field of view of a new object

struct StandinObject : geo_fisheye {
    geo_fisheye_source_description source;
    bool initialised;
    float bound_x;
    float bound_y;
    geo_fisheye_controller_info controller;
    float filters[2][3];
    std::vector<uint8_t> image;
};

struct StandinResult : geo_fisheye_render_result {
    std::vector<uint8_t> storage;
};

struct Failure {
    int successes_left;  // calls that still succeed before the failures start
};

struct State {
    std::vector<geofisheye_standin::Call> calls;
    std::map<std::string, Failure> failures;
    std::set<geo_fisheye_context const*> contexts;
    std::vector<std::unique_ptr<StandinObject>> objects;  // in creation order
    std::set<geo_fisheye_render_result*> results;
    int32_t layout_answer = -1;
    float pan_answer = 0.0f;
    float tilt_answer = 0.0f;
    int next_serial = 1;

    void Clear() {
        for (geo_fisheye_context const* context : contexts) {
            delete context;
        }
        contexts.clear();
        objects.clear();
        for (geo_fisheye_render_result* result : results) {
            delete static_cast<StandinResult*>(result);
        }
        results.clear();
        calls.clear();
        failures.clear();
        layout_answer = -1;
        pan_answer = 0.0f;
        tilt_answer = 0.0f;
    }

    ~State() { Clear(); }
};

State& Standin() {
    static State state;
    return state;
}

char const PREFIX[] = "geo_fisheye_";

// Records the call; true when the function is to fail this time.
bool Record(char const* function, void const* object, void const* pointer,
            std::vector<double> numbers = {}) {
    std::string name(function);
    Standin().calls.push_back({name, object, pointer, std::move(numbers)});
    auto const failure = Standin().failures.find(name.substr(sizeof(PREFIX) - 1));
    if (failure == Standin().failures.end()) {
        return false;
    }
    if (failure->second.successes_left > 0) {
        --failure->second.successes_left;
        return false;
    }
    return true;
}

StandinObject* Live(geo_fisheye const* object) {
    for (auto const& live : Standin().objects) {
        if (live.get() == object) {
            return live.get();
        }
    }
    return nullptr;
}

bool LiveContext(geo_fisheye_context const* context) {
    return Standin().contexts.count(context) != 0;
}

std::vector<double> Words(geo_fisheye_controller_info const& info) {
    std::vector<double> words;
    for (int index = 0; index < GEO_FISHEYE_CONTROLLER_WORDS; ++index) {
        bool const integer = index == GEO_FISHEYE_VIEW_MODE || index == GEO_FISHEYE_MOUNT_TYPE;
        words.push_back(integer ? double(info.words[index].integer)
                                : double(info.words[index].value));
    }
    return words;
}

// The controller words of one layout of the object's present view; false for a layout the view
// does not have.
bool LayoutWords(StandinObject const& object, int32_t layout, int& pan, int& tilt, int& zoom) {
    int layouts = 0;
    switch (object.view_mode) {
        case 0:
            layouts = GEO_FISHEYE_VIEW0_LAYOUTS;
            pan = GEO_FISHEYE_VIEW0_PAN;
            tilt = GEO_FISHEYE_VIEW0_TILT;
            zoom = GEO_FISHEYE_VIEW0_ZOOM;
            break;
        case 1:
            layouts = GEO_FISHEYE_VIEW1_LAYOUTS;
            pan = GEO_FISHEYE_VIEW1_PAN;
            tilt = GEO_FISHEYE_VIEW1_TILT;
            zoom = GEO_FISHEYE_VIEW1_ZOOM;
            break;
        case 3:
            layouts = GEO_FISHEYE_VIEW3_LAYOUTS;
            pan = GEO_FISHEYE_VIEW3_PAN;
            tilt = GEO_FISHEYE_VIEW3_TILT;
            zoom = GEO_FISHEYE_VIEW3_ZOOM;
            break;
        default:
            return false;
    }
    if (layout < 0 || layout >= layouts) {
        return false;
    }
    pan += layout;
    tilt += layout;
    zoom += layout;
    return true;
}

void SetViewMode(StandinObject& object, int32_t view_mode) {
    object.view_mode = view_mode;
    object.controller.words[GEO_FISHEYE_VIEW_MODE].integer = view_mode;
}

void SetMountType(StandinObject& object, int32_t mount_type) {
    object.mount_type = mount_type;
    object.controller.words[GEO_FISHEYE_MOUNT_TYPE].integer = mount_type;
}

}  // namespace

extern "C" {

bool geo_fisheye_init(geo_fisheye_context** context) {
    if (Record(__func__, nullptr, context == nullptr ? nullptr : *context) || context == nullptr) {
        return false;
    }
    geo_fisheye_context* const made = new geo_fisheye_context{Standin().next_serial++};
    Standin().contexts.insert(made);
    *context = made;
    Standin().calls.back().pointer = made;
    return true;
}

void geo_fisheye_shutdown(geo_fisheye_context** context) {
    if (Record(__func__, nullptr, context == nullptr ? nullptr : *context) || context == nullptr ||
        !LiveContext(*context)) {
        return;
    }
    Standin().contexts.erase(*context);
    delete *context;
    *context = nullptr;
}

geo_fisheye* geo_fisheye_create_object(void) {
    if (Record(__func__, nullptr, nullptr)) {
        return nullptr;
    }
    auto object = std::make_unique<StandinObject>();
    object->output_width = 0.0f;
    object->output_height = 0.0f;
    object->source = {};
    object->initialised = false;
    object->bound_x = 0.0f;
    object->bound_y = 0.0f;
    object->controller = {};
    for (int index = GEO_FISHEYE_VIEW0_ZOOM; index < GEO_FISHEYE_VIEW0_ZOOM + 4; ++index) {
        object->controller.words[index].value = WIDEST_VIEW;
    }
    for (int index = GEO_FISHEYE_VIEW1_ZOOM; index < GEO_FISHEYE_VIEW1_ZOOM + 3; ++index) {
        object->controller.words[index].value = WIDEST_VIEW;
    }
    object->controller.words[GEO_FISHEYE_VIEW3_ZOOM].value = WIDEST_VIEW;
    SetViewMode(*object, 3);
    SetMountType(*object, 0);
    std::fill(&object->filters[0][0], &object->filters[0][0] + 6, 0.5f);
    geo_fisheye* const made = object.get();
    Standin().objects.push_back(std::move(object));
    Standin().calls.back().object = made;
    return made;
}

bool geo_fisheye_init_object(geo_fisheye_context* context,
                             geo_fisheye_source_description const* description,
                             geo_fisheye* object) {
    std::vector<double> numbers;
    if (description != nullptr) {
        numbers = {double(description->width), double(description->height),
                   double(description->format), description->enabled ? 1.0 : 0.0};
    }
    if (Record(__func__, object, context, numbers)) {
        return false;
    }
    StandinObject* const live = Live(object);
    if (live == nullptr || !LiveContext(context) || description == nullptr ||
        description->width <= 0 || description->height <= 0 || description->format != 1) {
        return false;
    }
    live->source = *description;
    live->initialised = true;
    live->image.clear();
    return true;
}

void geo_fisheye_release_object(geo_fisheye** object) {
    geo_fisheye* const released = object == nullptr ? nullptr : *object;
    if (Record(__func__, released, nullptr) || Live(released) == nullptr) {
        return;
    }
    auto& objects = Standin().objects;
    objects.erase(std::find_if(objects.begin(), objects.end(),
                               [released](auto const& live) { return live.get() == released; }));
    *object = nullptr;
}

void geo_fisheye_update_object_bounds(geo_fisheye* object, float x, float y, float width,
                                      float height) {
    if (Record(__func__, object, nullptr, {double(x), double(y), double(width), double(height)})) {
        return;
    }
    StandinObject* const live = Live(object);
    if (live == nullptr) {
        return;
    }
    live->bound_x = x;
    live->bound_y = y;
    live->output_width = width;
    live->output_height = height;
}

bool geo_fisheye_update_object_image(geo_fisheye* object, uint8_t const* image) {
    if (Record(__func__, object, image)) {
        return false;
    }
    StandinObject* const live = Live(object);
    if (live == nullptr || !live->initialised || image == nullptr) {
        return false;
    }
    size_t const bytes = size_t(live->source.width) * size_t(live->source.height) * 3u;
    live->image.assign(image, image + bytes);
    return true;
}

// Nearest neighbour from the last picture, R, G, B to R, G, B, 255; black before any picture.
bool geo_fisheye_create_render_result(geo_fisheye_context* context, int32_t width, int32_t height,
                                      geo_fisheye* object, geo_fisheye_render_result** result) {
    if (Record(__func__, object, context, {double(width), double(height)})) {
        return false;
    }
    StandinObject const* const live = Live(object);
    if (live == nullptr || !LiveContext(context) || result == nullptr || width < 0 || height < 0) {
        return false;
    }
    auto* const made = new StandinResult;
    made->storage.assign(size_t(width) * size_t(height) * 4u, 0);
    made->pixels = made->storage.data();
    made->width = width;
    made->height = height;
    int64_t const source_width = live->source.width;
    int64_t const source_height = live->source.height;
    for (int32_t y = 0; y < height; ++y) {
        for (int32_t x = 0; x < width; ++x) {
            uint8_t* const out = made->pixels + (size_t(y) * size_t(width) + size_t(x)) * 4u;
            if (!live->image.empty()) {
                int64_t const source_x = x * source_width / width;
                int64_t const source_y = y * source_height / height;
                std::memcpy(out, &live->image[size_t((source_y * source_width + source_x) * 3)], 3);
            }
            out[3] = 255;
        }
    }
    Standin().results.insert(made);
    *result = made;
    return true;
}

void geo_fisheye_release_render_result(geo_fisheye_render_result** result) {
    geo_fisheye_render_result* const released = result == nullptr ? nullptr : *result;
    if (Record(__func__, nullptr, released) || Standin().results.erase(released) == 0) {
        return;
    }
    delete static_cast<StandinResult*>(released);
    *result = nullptr;
}

void geo_fisheye_get_object_controller_info(geo_fisheye const* object,
                                            geo_fisheye_controller_info* info) {
    StandinObject const* const live = Live(object);
    std::vector<double> numbers = live == nullptr ? std::vector<double>() : Words(live->controller);
    if (Record(__func__, object, info, std::move(numbers)) || live == nullptr || info == nullptr) {
        return;
    }
    *info = live->controller;
}

void geo_fisheye_set_object_controller_info(geo_fisheye_controller_info const* info,
                                            geo_fisheye* object) {
    std::vector<double> numbers = info == nullptr ? std::vector<double>() : Words(*info);
    if (Record(__func__, object, info, std::move(numbers)) || info == nullptr) {
        return;
    }
    StandinObject* const live = Live(object);
    if (live == nullptr) {
        return;
    }
    live->controller = *info;
    live->view_mode = info->words[GEO_FISHEYE_VIEW_MODE].integer;
    live->mount_type = info->words[GEO_FISHEYE_MOUNT_TYPE].integer;
}

int32_t geo_fisheye_get_object_layout_id(geo_fisheye const* object, float x, float y) {
    if (Record(__func__, object, nullptr, {double(x), double(y)}) || Live(object) == nullptr) {
        return -1;
    }
    return Standin().layout_answer;
}

void geo_fisheye_change_object_view_mode(geo_fisheye* object, int32_t view_mode) {
    StandinObject* const live = Live(object);
    if (Record(__func__, object, nullptr, {double(view_mode)}) || live == nullptr) {
        return;
    }
    SetViewMode(*live, view_mode);
}

void geo_fisheye_change_object_mount_type(geo_fisheye* object, int32_t mount_type) {
    StandinObject* const live = Live(object);
    if (Record(__func__, object, nullptr, {double(mount_type)}) || live == nullptr) {
        return;
    }
    SetMountType(*live, mount_type);
}

void geo_fisheye_change_object_source_filter(geo_fisheye* object, int32_t filter, float first,
                                             float second, float third) {
    StandinObject* const live = Live(object);
    if (Record(__func__, object, nullptr,
               {double(filter), double(first), double(second), double(third)}) ||
        live == nullptr || filter < 0 || filter > 1) {
        return;
    }
    live->filters[filter][0] = first;
    live->filters[filter][1] = second;
    live->filters[filter][2] = third;
}

void geo_fisheye_pan_tilt_object(geo_fisheye* object, int32_t layout, float pan, float tilt) {
    StandinObject* const live = Live(object);
    int pan_word = 0;
    int tilt_word = 0;
    int zoom_word = 0;
    if (Record(__func__, object, nullptr, {double(layout), double(pan), double(tilt)}) ||
        live == nullptr || !LayoutWords(*live, layout, pan_word, tilt_word, zoom_word)) {
        return;
    }
    live->controller.words[pan_word].value += pan;
    live->controller.words[tilt_word].value += tilt;
}

void geo_fisheye_zoom_object(geo_fisheye* object, int32_t layout, float factor) {
    StandinObject* const live = Live(object);
    int pan_word = 0;
    int tilt_word = 0;
    int zoom_word = 0;
    if (Record(__func__, object, nullptr, {double(layout), double(factor)}) || live == nullptr ||
        !LayoutWords(*live, layout, pan_word, tilt_word, zoom_word) || !(factor > 0.0f)) {
        return;
    }
    live->controller.words[zoom_word].value /= factor;
}

void geo_fisheye_set_object_pan_tilt(geo_fisheye* object, int32_t layout, float pan, float tilt) {
    StandinObject* const live = Live(object);
    int pan_word = 0;
    int tilt_word = 0;
    int zoom_word = 0;
    if (Record(__func__, object, nullptr, {double(layout), double(pan), double(tilt)}) ||
        live == nullptr || !LayoutWords(*live, layout, pan_word, tilt_word, zoom_word)) {
        return;
    }
    live->controller.words[pan_word].value = pan;
    live->controller.words[tilt_word].value = tilt;
}

void geo_fisheye_set_object_zoom(geo_fisheye* object, int32_t layout, float zoom) {
    StandinObject* const live = Live(object);
    int pan_word = 0;
    int tilt_word = 0;
    int zoom_word = 0;
    if (Record(__func__, object, nullptr, {double(layout), double(zoom)}) || live == nullptr ||
        !LayoutWords(*live, layout, pan_word, tilt_word, zoom_word)) {
        return;
    }
    live->controller.words[zoom_word].value = zoom;
}

void geo_fisheye_calculate_object_pan_tilt(float x, float y, geo_fisheye const* object, float* pan,
                                           float* tilt) {
    if (Record(__func__, object, nullptr, {double(x), double(y)}) || Live(object) == nullptr ||
        pan == nullptr || tilt == nullptr) {
        return;
    }
    *pan = Standin().pan_answer;
    *tilt = Standin().tilt_answer;
}

}  // extern "C"

namespace geofisheye_standin {

void Reset() {
    Standin().Clear();
}

void ForgetCalls() {
    Standin().calls.clear();
}

std::vector<Call> Calls() {
    return Standin().calls;
}

std::vector<std::string> CallNames() {
    std::vector<std::string> names;
    for (Call const& call : Standin().calls) {
        names.push_back(call.function.substr(sizeof(PREFIX) - 1));
    }
    return names;
}

std::vector<Call> CallsOf(std::string const& function) {
    std::vector<Call> found;
    for (Call const& call : Standin().calls) {
        if (call.function == PREFIX + function) {
            found.push_back(call);
        }
    }
    return found;
}

void Fail(std::string const& function, int after) {
    Standin().failures[function] = Failure{after};
}

void Succeed(std::string const& function) {
    Standin().failures.erase(function);
}

void AnswerLayoutId(int32_t layout) {
    Standin().layout_answer = layout;
}

void AnswerPanTilt(float pan, float tilt) {
    Standin().pan_answer = pan;
    Standin().tilt_answer = tilt;
}

int LiveContexts() {
    return int(Standin().contexts.size());
}

int LiveObjects() {
    return int(Standin().objects.size());
}

int LiveResults() {
    return int(Standin().results.size());
}

std::vector<geo_fisheye*> Objects() {
    std::vector<geo_fisheye*> objects;
    for (auto const& live : Standin().objects) {
        objects.push_back(live.get());
    }
    return objects;
}

bool StateOf(geo_fisheye const* object, ObjectState& state) {
    StandinObject const* const live = Live(object);
    if (live == nullptr) {
        return false;
    }
    state.source = live->source;
    state.initialised = live->initialised;
    state.boundX = live->bound_x;
    state.boundY = live->bound_y;
    state.boundWidth = live->output_width;
    state.boundHeight = live->output_height;
    state.viewMode = live->view_mode;
    state.mountType = live->mount_type;
    state.controller = live->controller;
    std::memcpy(state.filters, live->filters, sizeof(state.filters));
    state.image = live->image;
    return true;
}

}  // namespace geofisheye_standin
