#include "progress_line.h"

#include <chrono>
#include <cinttypes>
#include <cmath>

namespace vexmap_host {
namespace {

double SteadySeconds() {
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

// "0:07", "12:34", "1:02:03".
std::string Duration(double seconds) {
    auto const whole = uint64_t(std::llround(std::max(seconds, 0.0)));
    char text[48];
    if (whole >= 3600) {
        snprintf(text, sizeof text, "%" PRIu64 ":%02u:%02u", whole / 3600,
                 unsigned(whole / 60 % 60), unsigned(whole % 60));
    } else {
        snprintf(text, sizeof text, "%u:%02u", unsigned(whole / 60), unsigned(whole % 60));
    }
    return text;
}

}  // namespace

ProgressLine::ProgressLine(FILE* destination, bool show)
    : ProgressLine(destination, show, SteadySeconds) {}

ProgressLine::ProgressLine(FILE* destination, bool show, Clock source)
    : stream(destination),
      shown(show),
      clock(std::move(source)),
      start(shown ? clock() : 0.0),
      last_drawn(start),
      frame(0),
      fraction(-1.0),
      drawn_length(0),
      open(false),
      pending(false) {}

ProgressLine::~ProgressLine() {
    End();
}

std::string ProgressLine::Text(uint64_t frame, double seconds, double fraction) {
    std::string text = "frame " + std::to_string(frame);
    if (seconds > 0.0) {
        char rate[48];
        snprintf(rate, sizeof rate, ", %.1f fps", double(frame) / seconds);
        text += rate;
    }
    if (fraction >= 0.0) {
        double const share = std::min(fraction, 1.0);
        text += ", " + std::to_string(int(std::floor(share * 100.0))) + "%";
        if (share > 0.0 && seconds > 0.0) {
            text += ", " + Duration(seconds * (1.0 - share) / share) + " left";
        }
    }
    return text;
}

void ProgressLine::Show(uint64_t frames_done, double share) {
    if (!shown) {
        return;
    }
    frame = frames_done;
    fraction = share;
    pending = true;
    double const now = clock();
    if (!open || now - last_drawn >= REDRAW_SECONDS) {
        last_drawn = now;
        Draw();
    }
}

void ProgressLine::Draw() {
    std::string const text = Text(frame, clock() - start, fraction);
    std::size_t const blank = drawn_length > text.size() ? drawn_length - text.size() : 0;
    fprintf(stream, "\r%s%*s", text.c_str(), int(blank), "");
    fflush(stream);
    drawn_length = text.size();
    open = true;
    pending = false;
}

void ProgressLine::End() {
    if (pending) {
        Draw();
    }
    if (open) {
        fputc('\n', stream);
        fflush(stream);
        open = false;
        drawn_length = 0;
    }
}

}  // namespace vexmap_host
