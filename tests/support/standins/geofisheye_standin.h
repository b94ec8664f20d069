#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "geo_fisheye.h"

/// Control of the libgeofisheye stand-in, for the tests that link it. The stand-in records every
/// call, can be told to fail any function, keeps each object's state (source size, bounds, view,
/// mount, controller record, filters, last picture) and renders by nearest-neighbour scaling of
/// the last picture. Not locked: one test thread.
namespace geofisheye_standin {

/// One call into the library. `object` is the object argument (null when the function has none);
/// `pointer` the other pointer that matters: the context for init, shutdown, init_object and
/// create_render_result, the picture for update_object_image, the result for
/// release_render_result. `numbers` are the numeric arguments in order, bools as 0 and 1; the
/// controller calls carry the 31 words of the record, the integer words as their integers.
struct Call {
    std::string function;
    void const* object;
    void const* pointer;
    std::vector<double> numbers;
};

/// What the stand-in knows of one live object.
struct ObjectState {
    geo_fisheye_source_description source;  // as init_object last gave it; zero before
    bool initialised;
    float boundX;
    float boundY;
    float boundWidth;
    float boundHeight;
    int viewMode;
    int mountType;
    geo_fisheye_controller_info controller;
    float filters[2][3];         // source filters 0 and 1
    std::vector<uint8_t> image;  // the last picture, 3 bytes a pixel; empty before the first
};

/// Frees every live context, object and result, forgets the calls, failures and answers.
void Reset();

/// Forgets the calls recorded so far and nothing else.
void ForgetCalls();
std::vector<Call> Calls();
/// The functions called, in order, without the "geo_fisheye_" prefix.
std::vector<std::string> CallNames();
/// The calls of one function (named without the prefix), in order.
std::vector<Call> CallsOf(std::string const& function);

/// Makes `function` (named without the prefix) fail once `after` more calls of it have succeeded,
/// and from then on until `Succeed` or `Reset`: false, null or -1, and no effect for a function
/// without a result.
void Fail(std::string const& function, int after = 0);
void Succeed(std::string const& function);

/// The answer of get_object_layout_id; -1 until told.
void AnswerLayoutId(int32_t layout);
/// The answer of calculate_object_pan_tilt; 0, 0 until told.
void AnswerPanTilt(float pan, float tilt);

int LiveContexts();
int LiveObjects();
int LiveResults();
/// Live objects in the order they were made.
std::vector<geo_fisheye*> Objects();
/// False for an object that is not live.
bool StateOf(geo_fisheye const* object, ObjectState& state);

}  // namespace geofisheye_standin
