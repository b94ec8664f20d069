#include "camera_rules.h"

namespace vexmap_host {
namespace {

constexpr std::size_t LIST_FROM = 3;  // literals from which a description says "one of"

bool StartsWith(std::string const& text, std::string const& literal) {
    return text.compare(0, literal.size(), literal) == 0;
}

bool EndsWith(std::string const& text, std::string const& literal) {
    return text.size() >= literal.size() &&
           text.compare(text.size() - literal.size(), literal.size(), literal) == 0;
}

std::string Joined(std::vector<StringTest> const& tests, char const* separator) {
    std::string text;
    for (StringTest const& test : tests) {
        text += (text.empty() ? "" : separator) + test.Describe();
    }
    return text;
}

StringTest Equals(std::vector<std::string> literals) {
    return {StringTest::EQUALS, std::move(literals)};
}

StringTest StartsWithAny(std::vector<std::string> literals) {
    return {StringTest::STARTS_WITH, std::move(literals)};
}

StringTest EndsWithAny(std::vector<std::string> literals) {
    return {StringTest::ENDS_WITH, std::move(literals)};
}

StringTest ContainsAny(std::vector<std::string> literals) {
    return {StringTest::CONTAINS, std::move(literals)};
}

}  // namespace

bool StringTest::Passes(std::string const& text) const {
    for (std::string const& literal : literals) {
        bool const passes = kind == EQUALS        ? text == literal
                            : kind == STARTS_WITH ? StartsWith(text, literal)
                            : kind == ENDS_WITH   ? EndsWith(text, literal)
                                                  : text.find(literal) != std::string::npos;
        if (passes) {
            return true;
        }
    }
    return false;
}

std::string StringTest::Describe() const {
    static char const* const verbs[] = {"equals", "starts with", "ends with", "contains"};
    std::string text = std::string(verbs[kind]) + (literals.size() >= LIST_FROM ? " one of " : " ");
    for (std::size_t index = 0; index < literals.size(); ++index) {
        char const* const separator = index == 0 ? "" : literals.size() < LIST_FROM ? " or " : ", ";
        text += separator + ("\"" + literals[index] + "\"");
    }
    return text;
}

std::string CameraRule::DescribeMake() const {
    return "make " + Joined(make, " or ");
}

std::string CameraRule::DescribeModel() const {
    return (on_url ? "URL " : "model ") + Joined(model, " and ");
}

std::vector<CameraRule> const& CameraRules::Rows() {
    static std::vector<CameraRule> const rows = {
        {{Equals({"Vivotek"})}, false, {StartsWithAny({"FE", "VC"})}, 3},
        {{Equals({"RTSP"})}, true, {EndsWithAny({"/h264", "/image.mpg"})}, 2},
        {{Equals({"Sentry360"})}, false, {StartsWithAny({"FS"})}, 2},
        {{Equals({"EVOLUTION"}), StartsWithAny({"Oncam"})}, false, {StartsWithAny({"EVO"})}, 4},
        {{Equals({"ACTi"})},
         false,
         {StartsWithAny({"KCM3911", "KCM7911", "B54",  "B55", "B56",  "E96", "E919",
                         "E921",    "E923",    "I51",  "I71", "E98",  "E15", "E16",
                         "E925",    "E927",    "E929", "I73", "Q111", "Q13", "B59",
                         "B74",     "B76",     "B511", "I52", "I72",  "B57", "B77"})},
         5},
        {{Equals({"Inaxsys"})}, false, {StartsWithAny({"IN-D"}), EndsWithAny({"MHEM"})}, 6},
        {{StartsWithAny({"Samsung"})}, false, {StartsWithAny({"SNF", "PNF"})}, 7},
        {{StartsWithAny({"Brenvia"})}, false, {ContainsAny({"Fisheye"})}, 8},
        {{Equals({"Geovision"})}, false, {StartsWithAny({"GV-FE"})}, 9},
        {{Equals({"Panasonic"})},
         false,
         {StartsWithAny({"WV-SF438", "WV-SW458", "WV-SFN480", "WV-SFV481", "WV-S4150", "WV-S4550",
                         "WV-X4170", "WV-X4570"})},
         11},
        {{StartsWithAny({"AXIS"})},
         false,
         {StartsWithAny({"M3007", "M3027", "M3037", "M3047", "M3048", "M3057", "M3058", "F1035"})},
         10},
        {{StartsWithAny({"BOSCH"})}, false, {ContainsAny({"panoramic"})}, 12},
        {{StartsWithAny({"Dahua"})}, false, {StartsWithAny({"IPC-EB", "DH-IPC-EB"})}, 13},
        {{StartsWithAny({"STORM"})}, false, {EndsWithAny({"HEM"})}, 14},
        {{StartsWithAny({"Pelco"})}, false, {StartsWithAny({"IMM"})}, 15},
        {{StartsWithAny({"HikVision", "HIKVISION"})},
         false,
         {EndsWithAny({"F-IV", "F-IW", "F-IS", "F-IVS", "F-IWS", "F-I", "FWD-IVS", "FWD-IV",
                       "FWD-IS", "FWD-I", "-FE", "-FEA"})},
         16},
    };
    return rows;
}

CameraRules::Match CameraRules::Choose(std::string const& make, std::string const& model,
                                       std::string const& url) {
    std::vector<CameraRule> const& rows = Rows();
    for (std::size_t row = 0; row < rows.size(); ++row) {
        CameraRule const& rule = rows[row];
        bool make_passes = false;
        for (StringTest const& test : rule.make) {
            make_passes = make_passes || test.Passes(make);
        }
        if (!make_passes) {
            continue;
        }
        bool model_passes = true;
        for (StringTest const& test : rule.model) {
            model_passes = model_passes && test.Passes(rule.on_url ? url : model);
        }
        return {int(row), model_passes ? rule.mode : 0};
    }
    return {-1, 0};
}

}  // namespace vexmap_host
