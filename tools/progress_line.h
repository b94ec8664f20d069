#pragma once

#include <cstdint>
#include <cstdio>
#include <functional>
#include <string>

namespace vexmap_host {

/// "frame N, F fps" on one line of a terminal, with the share done and the time left when the
/// length of the run is known, rewritten in place as a long run goes on. Writes nothing when it
/// is not to be shown. Owns nothing; one thread at a time.
class ProgressLine {
public:
    /// Seconds from any fixed start; the steady clock unless a test gives another.
    using Clock = std::function<double()>;
    static constexpr double REDRAW_SECONDS = 0.25;  // often enough to see it move, rarely enough
                                                    // not to cost a fast run its speed

    ProgressLine(FILE* stream, bool shown);
    ProgressLine(FILE* stream, bool shown, Clock clock);
    ProgressLine(ProgressLine const&) = delete;
    ProgressLine& operator=(ProgressLine const&) = delete;
    virtual ~ProgressLine();  // ends the line

    /// `frame` frames are done; `fraction` is the share of the run they are, from 0 to 1, or
    /// negative when the length of the run is not known (a pipe).
    void Show(uint64_t frame, double fraction = -1.0);
    /// Draws the last state and ends the line, so that what follows, an error above all, starts a
    /// line of its own.
    void End();

    /// The line's text for a state: "frame 120, 24.0 fps, 40%, 0:12 left".
    static std::string Text(uint64_t frame, double seconds, double fraction);

private:
    void Draw();

    FILE* stream;
    bool shown;
    Clock clock;
    double start;
    double last_drawn;
    uint64_t frame;
    double fraction;
    std::size_t drawn_length;  // of the text on the line now, to blank what a shorter one leaves
    bool open;                 // a line has been started and not ended
    bool pending;              // a state newer than the one on the line
};

}  // namespace vexmap_host
