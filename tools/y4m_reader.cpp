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

struct ColourSpace {
    char const* name;
    ChromaLayout layout;
    bool alpha;
};

// Every 8-bit layout. The 4:2:0 ones differ only in where a chroma sample sits inside its 2 x 2
// block, a fraction of a pixel that a dewarped view does not keep anyway, so all are read alike.
constexpr std::array<ColourSpace, 9> COLOUR_SPACES{{{"420jpeg", ChromaLayout::C420, false},
                                                    {"420mpeg2", ChromaLayout::C420, false},
                                                    {"420paldv", ChromaLayout::C420, false},
                                                    {"420", ChromaLayout::C420, false},
                                                    {"422", ChromaLayout::C422, false},
                                                    {"444", ChromaLayout::C444, false},
                                                    {"444alpha", ChromaLayout::C444, true},
                                                    {"411", ChromaLayout::C411, false},
                                                    {"mono", ChromaLayout::MONO, false}}};
constexpr uint8_t NEUTRAL_CHROMA = 128;

// The bits a sample of a deep colour space has: "420p10" and "mono16" give 10 and 16; 0 for
// anything else.
int BitsOf(std::string const& value) {
    std::size_t const digits = value.find_last_not_of("0123456789") + 1;
    if (digits == value.size() || digits == 0 || value.size() - digits > 2) {
        return 0;
    }
    bool const deep =
        value.compare(0, 4, "mono") == 0 ? digits == 4 : digits == 4 && value[3] == 'p';
    return deep ? std::stoi(value.substr(digits)) : 0;
}

// Chroma plane sides of a layout, for a luma of `width` x `height`.
uint64_t ChromaWidth(ChromaLayout layout, uint64_t width) {
    switch (layout) {
        case ChromaLayout::C420:
        case ChromaLayout::C422:
            return (width + 1) / 2;
        case ChromaLayout::C444:
            return width;
        case ChromaLayout::C411:
            return (width + 3) / 4;
        default:
            return 0;
    }
}

uint64_t ChromaHeight(ChromaLayout layout, uint64_t height) {
    return layout == ChromaLayout::C420 ? (height + 1) / 2 : height;
}

// A 4:2:0 sample covers rows 2r and 2r + 1 and columns 2c and 2c + 1 and is the mean of the
// stream's samples over those pixels, rounded half up: (sum + count / 2) / count, what a box filter
// gives. On an odd edge the block has one row or column, and counting it twice gives the same
// rounded mean as counting it once, so the edge needs no loop of its own.

// 4:2:2 and 4:1:1 keep one sample across a 4:2:0 block's columns (4:1:1 across two blocks, so
// column c takes column c >> shift), and only the block's two rows are averaged.
void AverageRows(uint8_t const* in, std::size_t in_width, std::size_t height, unsigned shift,
                 uint8_t* out, std::size_t out_width) {
    for (std::size_t row = 0; 2 * row < height; ++row) {
        uint8_t const* const top = in + 2 * row * in_width;
        uint8_t const* const bottom = 2 * row + 1 < height ? top + in_width : top;
        uint8_t* const destination = out + row * out_width;
        for (std::size_t column = 0; column < out_width; ++column) {
            std::size_t const x = column >> shift;
            destination[column] = uint8_t((unsigned(top[x]) + bottom[x] + 1) / 2);
        }
    }
}

// 4:4:4 has a sample for each pixel, four to a block.
void AverageBlocks(uint8_t const* in, std::size_t width, std::size_t height, uint8_t* out,
                   std::size_t out_width) {
    for (std::size_t row = 0; 2 * row < height; ++row) {
        uint8_t const* const top = in + 2 * row * width;
        uint8_t const* const bottom = 2 * row + 1 < height ? top + width : top;
        uint8_t* const destination = out + row * out_width;
        for (std::size_t column = 0; column < out_width; ++column) {
            std::size_t const left = 2 * column;
            std::size_t const right = left + 1 < width ? left + 1 : left;
            destination[column] =
                uint8_t((unsigned(top[left]) + top[right] + bottom[left] + bottom[right] + 2) / 4);
        }
    }
}

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

Y4mReader::Y4mReader(std::istream& source, std::string const& source_name,
                     PictureLimits const& limits)
    : stream(source), name(source_name), header(), frame_bytes(0), frames_read(0), raw(), line() {
    std::array<char, MAGIC_LENGTH + 1> start{};
    stream.read(start.data(), std::streamsize(start.size()));
    if (std::size_t(stream.gcount()) < start.size() ||
        !std::equal(MAGIC, MAGIC + MAGIC_LENGTH, start.begin()) ||
        (start.back() != ' ' && start.back() != '\n')) {
        Fail("is not a YUV4MPEG2 stream");
    }
    std::string const tags =
        start.back() == '\n' ? std::string() : ReadLine(MAX_LINE - start.size(), 0);
    bool has_width = false;
    bool has_height = false;
    std::size_t begin = 0;
    while (begin <= tags.size()) {
        std::size_t const end = std::min(tags.find(' ', begin), tags.size());
        std::string const tag = tags.substr(begin, end - begin);
        has_width = has_width || (!tag.empty() && tag[0] == 'W');
        has_height = has_height || (!tag.empty() && tag[0] == 'H');
        ParseTag(tag);
        begin = end + 1;
    }
    if (!has_width || !has_height) {
        Fail(std::string("has no frame ") + (has_width ? "height (H)" : "width (W)") +
             " in its header");
    }
    limits.Check(name, uint64_t(header.width), uint64_t(header.height));
    uint64_t const luma = uint64_t(header.width) * uint64_t(header.height);
    frame_bytes =
        luma * (header.alpha ? 2 : 1) + 2 * ChromaWidth(header.layout, uint64_t(header.width)) *
                                            ChromaHeight(header.layout, uint64_t(header.height));
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
            ParseColourSpace(tag);
            break;
        case 'X':
            if (value == "COLORRANGE=FULL") {
                header.range = ColourRange::FULL;
            } else if (value == "COLORRANGE=LIMITED") {
                header.range = ColourRange::LIMITED;
            }
            break;
        default:
            break;
    }
}

void Y4mReader::ParseColourSpace(std::string const& tag) {
    std::string const value = tag.substr(1);
    for (ColourSpace const& space : COLOUR_SPACES) {
        if (value == space.name) {
            header.colour_space = value;
            header.layout = space.layout;
            header.alpha = space.alpha;
            return;
        }
    }
    int const bits = BitsOf(value);
    if (bits > 8) {
        Fail("has the colour space " + tag.substr(0, 32) + ", " + std::to_string(bits) +
             " bits a sample; vexmap reads 8-bit streams: convert with ffmpeg's -pix_fmt yuv420p");
    }
    std::string known;
    for (ColourSpace const& space : COLOUR_SPACES) {
        known += (known.empty() ? "C" : ", C") + std::string(space.name);
    }
    Fail("has the colour space " + tag.substr(0, 32) + ", which vexmap does not read (it reads " +
         known + ")");
}

bool Y4mReader::ReadFrame(YuvImage& frame) {
    if (stream.peek() == std::istream::traits_type::eof()) {
        if (stream.bad()) {
            Fail("cannot be read after frame " + std::to_string(frames_read));
        }
        return false;
    }
    std::string const& frame_line = ReadLine(MAX_LINE, frames_read + 1);
    if (frame_line.compare(0, FRAME_MARK_LENGTH, FRAME_MARK) != 0 ||
        (frame_line.size() > FRAME_MARK_LENGTH && frame_line[FRAME_MARK_LENGTH] != ' ')) {
        Fail("has a bad " + LineName(frames_read + 1) + ": it does not start with FRAME");
    }
    frame.width = header.width;
    frame.height = header.height;
    if (header.layout == ChromaLayout::C420 && !header.alpha) {
        ReadBytes(frame.bytes);
    } else {
        ReadBytes(raw);
        ConvertRaw(frame);
    }
    ++frames_read;
    return true;
}

void Y4mReader::ReadBytes(std::vector<uint8_t>& bytes) {
    std::size_t const total = std::size_t(frame_bytes);
    std::size_t filled = 0;
    while (filled < total) {
        std::size_t const step =
            bytes.capacity() >= total ? total - filled : std::min(total - filled, READ_STEP);
        bytes.resize(filled + step);
        stream.read(reinterpret_cast<char*>(bytes.data() + filled), std::streamsize(step));
        filled += std::size_t(stream.gcount());
        if (filled < bytes.size()) {
            Fail("ends inside frame " + std::to_string(frames_read + 1) + ", after " +
                 std::to_string(filled) + " of its " + std::to_string(total) + " bytes");
        }
    }
    bytes.resize(total);
}

void Y4mReader::ConvertRaw(YuvImage& frame) const {
    std::size_t const width = std::size_t(header.width);
    std::size_t const height = std::size_t(header.height);
    std::size_t const luma = width * height;
    std::size_t const out_width = YuvImage::ChromaWidth(width);
    std::size_t const out_plane = out_width * YuvImage::ChromaHeight(height);
    std::size_t const in_width = std::size_t(ChromaWidth(header.layout, width));
    std::size_t const in_plane = in_width * std::size_t(ChromaHeight(header.layout, height));
    frame.bytes.resize(luma + 2 * out_plane);
    std::copy_n(raw.data(), luma, frame.bytes.data());
    for (std::size_t plane = 0; plane < 2; ++plane) {
        uint8_t const* const in = raw.data() + luma + plane * in_plane;
        uint8_t* const out = frame.bytes.data() + luma + plane * out_plane;
        switch (header.layout) {
            case ChromaLayout::C422:
                AverageRows(in, in_width, height, 0, out, out_width);
                break;
            case ChromaLayout::C411:
                AverageRows(in, in_width, height, 1, out, out_width);
                break;
            case ChromaLayout::C444:
                AverageBlocks(in, width, height, out, out_width);
                break;
            default:  // MONO; 4:2:0 without alpha is read straight into the frame
                std::fill_n(out, out_plane, NEUTRAL_CHROMA);
                break;
        }
    }
}

// A line without its newline, in storage kept from line to line, so that a FRAME line costs no
// allocation. The limit counts the newline, and a line that reaches it unended is refused before
// more is read.
std::string const& Y4mReader::ReadLine(std::size_t limit, uint64_t frame) {
    line.clear();
    char c = 0;
    while (stream.get(c)) {
        if (c == '\n') {
            return line;
        }
        if (line.size() + 1 >= limit) {
            Fail("has a " + LineName(frame) + " longer than " + std::to_string(MAX_LINE) +
                 " bytes");
        }
        line.push_back(c);
    }
    Fail("ends inside its " + LineName(frame));
}

std::string Y4mReader::LineName(uint64_t frame) {
    return frame == 0 ? "stream header" : "FRAME line of frame " + std::to_string(frame);
}

void Y4mReader::Fail(std::string const& reason) const {
    throw ToolError(name + " " + reason);
}

}  // namespace vexmap_host
