#include "progress_line.h"

#include <cinttypes>

namespace vexmap_host {

ProgressLine::ProgressLine(FILE* destination, bool show)
    : stream(destination), shown(show), open(false) {}

ProgressLine::~ProgressLine() {
    End();
}

void ProgressLine::Show(uint64_t frame) {
    if (shown) {
        fprintf(stream, "\rframe %" PRIu64, frame);
        fflush(stream);
        open = true;
    }
}

void ProgressLine::End() {
    if (open) {
        fputc('\n', stream);
        fflush(stream);
        open = false;
    }
}

}  // namespace vexmap_host
