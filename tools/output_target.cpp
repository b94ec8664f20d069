#include "output_target.h"

#include <filesystem>

#include "image_file.h"
#include "output_file.h"
#include "path_text.h"
#include "tool_error.h"

namespace vexmap_host {

OutputTarget::OutputTarget(std::string const& output) : value(output), kind(FOLDER) {
    if (value.empty()) {
        throw UsageError("--output is empty: give a file, a folder or - (standard output)");
    }
    std::error_code error;
    std::string const extension = ExtensionOf(value);
    if (value == "-") {
        kind = STANDARD_OUTPUT;
    } else if (OutputFile::IsDevice(value)) {
        kind = DEVICE;
    } else if (std::filesystem::is_directory(value, error) || value.back() == '/' ||
               extension.empty()) {
        kind = FOLDER;
    } else if (extension == "y4m") {
        kind = STREAM_FILE;
    } else if (IsPictureExtension(value)) {
        kind = PICTURE_FILE;
    } else {
        throw UsageError("--output " + value +
                         ": vexmap writes .png, .jpg and .jpeg pictures, "
                         ".y4m streams, a device, - (standard output) or a folder, not ." +
                         extension + " files");
    }
}

std::string OutputTarget::PicturePath(std::string const& kind_name, std::string const& view,
                                      bool several_views) const {
    if (kind == PICTURE_FILE) {
        if (!several_views) {
            return value;
        }
        std::size_t const dot = value.rfind('.');
        return value.substr(0, dot) + "-" + view + value.substr(dot);
    }
    return (std::filesystem::path(value) / (Lowercase(kind_name) + "-" + view + ".png")).string();
}

std::string OutputTarget::StreamName() const {
    return kind == STANDARD_OUTPUT ? "standard output" : value;
}

}  // namespace vexmap_host
