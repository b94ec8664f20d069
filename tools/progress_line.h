#pragma once

#include <cstdint>
#include <cstdio>

namespace vexmap_host {

/// "frame N" on one line of a terminal, rewritten in place as a long run goes on. Writes nothing
/// when it is not to be shown. Owns nothing; one thread at a time.
class ProgressLine {
public:
    ProgressLine(FILE* stream, bool shown);
    ProgressLine(ProgressLine const&) = delete;
    ProgressLine& operator=(ProgressLine const&) = delete;
    virtual ~ProgressLine();  // ends the line

    void Show(uint64_t frame);
    /// Ends the line, so that what follows, an error above all, starts a line of its own.
    void End();

private:
    FILE* stream;
    bool shown;
    bool open;  // a line has been started and not ended
};

}  // namespace vexmap_host
