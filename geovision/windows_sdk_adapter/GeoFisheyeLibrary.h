#pragma once

#include "VendorLibrary.h"
#include "geo_fisheye.h"

/// The functions of libgeofisheye that the adapter calls, bound at run time. Every pointer is
/// null until `Bind` finds them all.
struct GeoFisheyeFunctions {
    static constexpr char const* FILE_NAME = "libgeofisheye.so.1";

    decltype(&::geo_fisheye_init) geo_fisheye_init;
    decltype(&::geo_fisheye_shutdown) geo_fisheye_shutdown;
    decltype(&::geo_fisheye_create_object) geo_fisheye_create_object;
    decltype(&::geo_fisheye_init_object) geo_fisheye_init_object;
    decltype(&::geo_fisheye_release_object) geo_fisheye_release_object;
    decltype(&::geo_fisheye_update_object_bounds) geo_fisheye_update_object_bounds;
    decltype(&::geo_fisheye_update_object_image) geo_fisheye_update_object_image;
    decltype(&::geo_fisheye_create_render_result) geo_fisheye_create_render_result;
    decltype(&::geo_fisheye_release_render_result) geo_fisheye_release_render_result;
    decltype(&::geo_fisheye_get_object_controller_info) geo_fisheye_get_object_controller_info;
    decltype(&::geo_fisheye_set_object_controller_info) geo_fisheye_set_object_controller_info;
    decltype(&::geo_fisheye_get_object_layout_id) geo_fisheye_get_object_layout_id;
    decltype(&::geo_fisheye_change_object_view_mode) geo_fisheye_change_object_view_mode;
    decltype(&::geo_fisheye_change_object_mount_type) geo_fisheye_change_object_mount_type;
    decltype(&::geo_fisheye_change_object_source_filter) geo_fisheye_change_object_source_filter;
    decltype(&::geo_fisheye_pan_tilt_object) geo_fisheye_pan_tilt_object;
    decltype(&::geo_fisheye_zoom_object) geo_fisheye_zoom_object;
    decltype(&::geo_fisheye_set_object_pan_tilt) geo_fisheye_set_object_pan_tilt;
    decltype(&::geo_fisheye_set_object_zoom) geo_fisheye_set_object_zoom;
    decltype(&::geo_fisheye_calculate_object_pan_tilt) geo_fisheye_calculate_object_pan_tilt;

    /// True when every function was found.
    bool Bind(SharedLibrary const& library);
};

/// The one libgeofisheye of the process, shared by every adapter.
extern VendorLibrary<GeoFisheyeFunctions> GeoFisheyeLibraryInstance;
