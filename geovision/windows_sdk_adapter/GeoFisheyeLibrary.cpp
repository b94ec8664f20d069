#include "GeoFisheyeLibrary.h"

VendorLibrary<GeoFisheyeFunctions> GeoFisheyeLibraryInstance;

bool GeoFisheyeFunctions::Bind(SharedLibrary const& library) {
    return library.Bind("geo_fisheye_init", geo_fisheye_init) &&
           library.Bind("geo_fisheye_shutdown", geo_fisheye_shutdown) &&
           library.Bind("geo_fisheye_create_object", geo_fisheye_create_object) &&
           library.Bind("geo_fisheye_init_object", geo_fisheye_init_object) &&
           library.Bind("geo_fisheye_release_object", geo_fisheye_release_object) &&
           library.Bind("geo_fisheye_update_object_bounds", geo_fisheye_update_object_bounds) &&
           library.Bind("geo_fisheye_update_object_image", geo_fisheye_update_object_image) &&
           library.Bind("geo_fisheye_create_render_result", geo_fisheye_create_render_result) &&
           library.Bind("geo_fisheye_release_render_result", geo_fisheye_release_render_result) &&
           library.Bind("geo_fisheye_get_object_controller_info",
                        geo_fisheye_get_object_controller_info) &&
           library.Bind("geo_fisheye_set_object_controller_info",
                        geo_fisheye_set_object_controller_info) &&
           library.Bind("geo_fisheye_get_object_layout_id", geo_fisheye_get_object_layout_id) &&
           library.Bind("geo_fisheye_change_object_view_mode",
                        geo_fisheye_change_object_view_mode) &&
           library.Bind("geo_fisheye_change_object_mount_type",
                        geo_fisheye_change_object_mount_type) &&
           library.Bind("geo_fisheye_change_object_source_filter",
                        geo_fisheye_change_object_source_filter) &&
           library.Bind("geo_fisheye_pan_tilt_object", geo_fisheye_pan_tilt_object) &&
           library.Bind("geo_fisheye_zoom_object", geo_fisheye_zoom_object) &&
           library.Bind("geo_fisheye_set_object_pan_tilt", geo_fisheye_set_object_pan_tilt) &&
           library.Bind("geo_fisheye_set_object_zoom", geo_fisheye_set_object_zoom) &&
           library.Bind("geo_fisheye_calculate_object_pan_tilt",
                        geo_fisheye_calculate_object_pan_tilt);
}
