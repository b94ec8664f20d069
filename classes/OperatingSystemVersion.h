#pragma once

/// The version of the running system as the registry's gate reads it: on Linux, the kernel's
/// release, the one version a process can learn without reading a file. A version that cannot be
/// read is 0.0, which no gate lets through.
struct OperatingSystemVersion {
    int major;
    int minor;

    /// The running kernel's "major.minor" from `uname`.
    static OperatingSystemVersion Running();
    /// Reads the leading "major.minor" of a release text such as "6.1.0-18-amd64"; 0.0 for null
    /// or a text that does not start with it.
    static OperatingSystemVersion Parse(char const* release);

    bool AtLeast(int wantedMajor, int wantedMinor) const;
};
