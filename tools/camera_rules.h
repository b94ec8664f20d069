#pragma once

#include <string>
#include <vector>

namespace vexmap_host {

/// One test on a camera string as the plug-in makes it: case-sensitive, blanks kept. Passes when
/// the string passes it for any of the literals.
struct StringTest {
    enum Kind { EQUALS, STARTS_WITH, ENDS_WITH, CONTAINS };

    Kind kind;
    std::vector<std::string> literals;

    bool Passes(std::string const& text) const;
    /// `equals "Vivotek"`, `starts with "FE" or "VC"`, `ends with one of "F-IV", "F-IW", ...`.
    std::string Describe() const;
};

/// A row of the camera table: a make test (any of its tests), then a test on the model or, for a
/// generic stream, the URL (all of its tests), which decides the mode.
struct CameraRule {
    std::vector<StringTest> make;
    bool on_url;  // the second test looks at the URL, not the model
    std::vector<StringTest> model;
    int mode;

    std::string DescribeMake() const;   // `make equals "EVOLUTION" or starts with "Oncam"`
    std::string DescribeModel() const;  // `model starts with "IN-D" and ends with "MHEM"`
};

/// The plug-in's table from camera strings to a dewarper kind, written out so that the tool can
/// show it and tell which row chose a kind. The plug-in keeps it as code and answers through
/// GetModeByCamera, which stays the authority; the tool's tests hold the two in step.
class CameraRules {
public:
    /// Walks the rows as the plug-in does: the first row whose make test passes is the only one
    /// tried.
    struct Match {
        int row;   // index into Rows(); -1 when no make test passes
        int mode;  // the row's mode when its model test passes, else 0
    };

    CameraRules() = default;
    CameraRules(CameraRules const&) = default;
    CameraRules& operator=(CameraRules const&) = default;
    virtual ~CameraRules() = default;

    static std::vector<CameraRule> const& Rows();
    static Match Choose(std::string const& make, std::string const& model, std::string const& url);
};

}  // namespace vexmap_host
