#include "OperatingSystemVersion.h"

#include <cctype>

#include <sys/utsname.h>

namespace {

// Digits at `text`, advancing past them; false when there are none or they overflow an int.
bool ReadNumber(char const*& text, int& number) {
    constexpr int LARGEST_BEFORE_A_DIGIT = 214748363;
    if (!isdigit(static_cast<unsigned char>(*text))) {
        return false;
    }
    number = 0;
    while (isdigit(static_cast<unsigned char>(*text))) {
        if (number > LARGEST_BEFORE_A_DIGIT) {
            return false;
        }
        number = number * 10 + (*text - '0');
        ++text;
    }
    return true;
}

}  // namespace

OperatingSystemVersion OperatingSystemVersion::Running() {
    utsname names{};
    if (uname(&names) != 0) {
        return {0, 0};
    }
    return Parse(names.release);
}

OperatingSystemVersion OperatingSystemVersion::Parse(char const* release) {
    if (release == nullptr) {
        return {0, 0};
    }
    int major = 0;
    int minor = 0;
    if (!ReadNumber(release, major) || *release != '.' || !ReadNumber(++release, minor)) {
        return {0, 0};
    }
    return {major, minor};
}

bool OperatingSystemVersion::AtLeast(int wantedMajor, int wantedMinor) const {
    return major > wantedMajor || (major == wantedMajor && minor >= wantedMinor);
}
