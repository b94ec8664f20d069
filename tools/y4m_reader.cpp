#include "y4m_reader.h"

#include <algorithm>
#include <array>
#include <climits>

#include "tool_error.h"

namespace vexmap_host {
namespace {

constexpr char MAGIC[] = "YUV4MPEG2";
constexpr std::size_t MAGIC_LENGTH = sizeof MAGIC - 1;
constexpr char FRAME_MARK[] = "FRAME";
constexpr std::size_t FRAME_MARK_LENGTH = sizeof FRAME_MARK - 1;
// A frame is read in steps of this many bytes until its storage is grown, so that a header that
// promises a huge frame costs memory only as its bytes really come.
constexpr std::size_t READ_STEP = std::size_t(1) << 20;

// Every 8-bit 4:2:0 layout. They differ only in where a chroma sample sits inside its 2 x 2 block,
// a fraction of a pixel that a dewarped view does not keep anyway, so all are read alike.
constexpr std::array<char const*, 4> ACCEPTED_COLOUR_SPACES{"420jpeg", "420mpeg2", "420paldv",
                                                            "420"};

// Decimal digits only, at most `limit`; anything else gives nothing.
bool ParseCount(std::string const& text, long long limit, long long& value) {
    if (text.empty()) {
        return false;
    }
    value = 0;
    for (char const c : text) {
        if (c < '0' || c > '9') {
            return false;
        }
        value = value * 10 + (c - '0');
        if (value > limit) {
            return false;
        }
    }
    return true;
}

bool ParseRatio(std::string const& text, int& numerator, int& denominator) {
    std::size_t const colon = text.find(':');
    long long top = 0;
    long long bottom = 0;
    if (colon == std::string::npos || !ParseCount(text.substr(0, colon), INT_MAX, top) ||
        !ParseCount(text.substr(colon + 1), INT_MAX, bottom)) {
        return false;
    }
    numerator = int(top);
    denominator = int(bottom);
    return true;
}

}  // namespace

Y4mReader::Y4mReader(std::istream& source, std::string const& source_name)
    : stream(source), name(source_name), header(), frame_bytes(0), frames_read(0) {
    std::array<char, MAGIC_LENGTH + 1> start{};
    stream.read(start.data(), std::streamsize(start.size()));
    if (std::size_t(stream.gcount()) < start.size() ||
        !std::equal(MAGIC, MAGIC + MAGIC_LENGTH, start.begin()) ||
        (start.back() != ' ' && start.back() != '\n')) {
        Fail("is not a YUV4MPEG2 stream");
    }
    std::string const line =
        start.back() == '\n' ? std::string() : ReadLine(MAX_LINE - start.size(), "stream header");
    bool has_width = false;
    bool has_height = false;
    std::size_t begin = 0;
    while (begin <= line.size()) {
        std::size_t const end = std::min(line.find(' ', begin), line.size());
        std::string const tag = line.substr(begin, end - begin);
        has_width = has_width || (!tag.empty() && tag[0] == 'W');
        has_height = has_height || (!tag.empty() && tag[0] == 'H');
        ParseTag(tag);
        begin = end + 1;
    }
    if (!has_width || !has_height) {
        Fail(std::string("has no frame ") + (has_width ? "height (H)" : "width (W)") +
             " in its header");
    }
    frame_bytes = YuvImage::FrameBytes(uint64_t(header.width), uint64_t(header.height));
}

Y4mReader::~Y4mReader() = default;

// Tags other than these are extensions (X) or unknown to the tool, and change nothing it reads.
void Y4mReader::ParseTag(std::string const& tag) {
    if (tag.empty()) {
        return;  // a second space in a row
    }
    std::string const value = tag.substr(1);
    long long count = 0;
    switch (tag[0]) {
        case 'W':
        case 'H':
            if (!ParseCount(value, MAX_SIDE, count) || count == 0) {
                Fail("has a frame " + std::string(tag[0] == 'W' ? "width" : "height") +
                     " that is not a whole number from 1 to " + std::to_string(MAX_SIDE) + ": " +
                     tag.substr(0, 32));
            }
            (tag[0] == 'W' ? header.width : header.height) = int(count);
            break;
        case 'F':
            if (!ParseRatio(value, header.rate_numerator, header.rate_denominator) ||
                header.rate_numerator == 0 || header.rate_denominator == 0) {
                Fail("has a frame rate that is no ratio of two positive numbers: " +
                     tag.substr(0, 32));
            }
            break;
        case 'A':
            if (!ParseRatio(value, header.aspect_numerator, header.aspect_denominator)) {
                Fail("has a pixel aspect that is no ratio: " + tag.substr(0, 32));
            }
            break;
        case 'I':
            if (value.size() != 1 || std::string("ptbm?").find(value[0]) == std::string::npos) {
                Fail("has an unknown interlacing: " + tag.substr(0, 32));
            }
            header.interlacing = value[0];
            break;
        case 'C':
            if (std::find(ACCEPTED_COLOUR_SPACES.begin(), ACCEPTED_COLOUR_SPACES.end(), value) ==
                ACCEPTED_COLOUR_SPACES.end()) {
                Fail("has the colour space " + tag.substr(0, 32) +
                     "; vexmap reads 8-bit 4:2:0 only (C420jpeg, C420mpeg2, C420paldv, C420)");
            }
            header.colour_space = value;
            break;
        default:
            break;
    }
}

bool Y4mReader::ReadFrame(YuvImage& frame) {
    if (stream.peek() == std::istream::traits_type::eof()) {
        if (stream.bad()) {
            Fail("cannot be read after frame " + std::to_string(frames_read));
        }
        return false;
    }
    std::string const what = "FRAME line of frame " + std::to_string(frames_read + 1);
    std::string const line = ReadLine(MAX_LINE, what);
    if (line.compare(0, FRAME_MARK_LENGTH, FRAME_MARK) != 0 ||
        (line.size() > FRAME_MARK_LENGTH && line[FRAME_MARK_LENGTH] != ' ')) {
        Fail("has a bad " + what + ": it does not start with FRAME");
    }
    frame.width = header.width;
    frame.height = header.height;
    std::size_t const total = std::size_t(frame_bytes);
    std::size_t filled = 0;
    while (filled < total) {
        std::size_t const step =
            frame.bytes.capacity() >= total ? total - filled : std::min(total - filled, READ_STEP);
        frame.bytes.resize(filled + step);
        stream.read(reinterpret_cast<char*>(frame.bytes.data() + filled), std::streamsize(step));
        filled += std::size_t(stream.gcount());
        if (filled < frame.bytes.size()) {
            Fail("ends inside frame " + std::to_string(frames_read + 1) + ", after " +
                 std::to_string(filled) + " of its " + std::to_string(total) + " bytes");
        }
    }
    frame.bytes.resize(total);
    ++frames_read;
    return true;
}

// A line without its newline. The limit counts the newline, and a line that reaches it unended
// is refused before more is read.
std::string Y4mReader::ReadLine(std::size_t limit, std::string const& what) {
    std::string line;
    char c = 0;
    while (stream.get(c)) {
        if (c == '\n') {
            return line;
        }
        if (line.size() + 1 >= limit) {
            Fail("has a " + what + " longer than " + std::to_string(MAX_LINE) + " bytes");
        }
        line.push_back(c);
    }
    Fail("ends inside its " + what);
}

void Y4mReader::Fail(std::string const& reason) const {
    throw ToolError(name + " " + reason);
}

}  // namespace vexmap_host
