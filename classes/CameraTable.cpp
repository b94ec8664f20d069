#include "CameraTable.h"

#include <initializer_list>
#include <string>

#include "DewarpWrapper.h"

namespace {

using DewarperType::DewarperTypes;

bool StartsWith(std::string const& text, char const* literal) {
    return text.compare(0, std::char_traits<char>::length(literal), literal) == 0;
}

bool EndsWith(std::string const& text, char const* literal) {
    std::size_t const length = std::char_traits<char>::length(literal);
    return text.size() >= length && text.compare(text.size() - length, length, literal) == 0;
}

bool Contains(std::string const& text, char const* literal) {
    return text.find(literal) != std::string::npos;
}

bool StartsWithAny(std::string const& text, std::initializer_list<char const*> literals) {
    for (char const* literal : literals) {
        if (StartsWith(text, literal)) {
            return true;
        }
    }
    return false;
}

bool EndsWithAny(std::string const& text, std::initializer_list<char const*> literals) {
    for (char const* literal : literals) {
        if (EndsWith(text, literal)) {
            return true;
        }
    }
    return false;
}

int ModeIf(bool model_passes, DewarperTypes mode) {
    return model_passes ? mode : DewarperType::DewarperNone;
}

}  // namespace

CameraTable::CameraTable() = default;

CameraTable::CameraTable(CameraTable const&) = default;

CameraTable& CameraTable::operator=(CameraTable const&) = default;

CameraTable::~CameraTable() = default;

// A new camera is a new line in this chain. The make "RTSP" is a generic stream whose model says
// nothing, so only the path of its URL tells a Sentry360 stream.
int CameraTable::ModeOf(char const* make_text, char const* model_text, char const* url_text) {
    if (make_text == nullptr || model_text == nullptr || url_text == nullptr) {
        return DewarperType::DewarperNone;
    }
    std::string const make(make_text);
    std::string const model(model_text);
    std::string const url(url_text);
    using namespace DewarperType;
    if (make == "Vivotek") {
        return ModeIf(StartsWithAny(model, {"FE", "VC"}), DewarperVivotek);
    }
    if (make == "RTSP") {
        return ModeIf(EndsWithAny(url, {"/h264", "/image.mpg"}), DewarperSentry360);
    }
    if (make == "Sentry360") {
        return ModeIf(StartsWith(model, "FS"), DewarperSentry360);
    }
    if (make == "EVOLUTION" || StartsWith(make, "Oncam")) {
        return ModeIf(StartsWith(model, "EVO"), DewarperOncam);
    }
    if (make == "ACTi") {
        return ModeIf(
            StartsWithAny(model, {"KCM3911", "KCM7911", "B54",  "B55", "B56",  "E96", "E919",
                                  "E921",    "E923",    "I51",  "I71", "E98",  "E15", "E16",
                                  "E925",    "E927",    "E929", "I73", "Q111", "Q13", "B59",
                                  "B74",     "B76",     "B511", "I52", "I72",  "B57", "B77"}),
            DewarperActi);
    }
    if (make == "Inaxsys") {
        return ModeIf(StartsWith(model, "IN-D") && EndsWith(model, "MHEM"), DewarperInaxsys);
    }
    if (StartsWith(make, "Samsung")) {
        return ModeIf(StartsWithAny(model, {"SNF", "PNF"}), DewarperSamsung);
    }
    if (StartsWith(make, "Brenvia")) {
        return ModeIf(Contains(model, "Fisheye"), DewarperBrenvia);
    }
    if (make == "Geovision") {
        return ModeIf(StartsWith(model, "GV-FE"), DewarperGeovision);
    }
    if (make == "Panasonic") {
        return ModeIf(StartsWithAny(model, {"WV-SF438", "WV-SW458", "WV-SFN480", "WV-SFV481",
                                            "WV-S4150", "WV-S4550", "WV-X4170", "WV-X4570"}),
                      DewarperPanasonic);
    }
    if (StartsWith(make, "AXIS")) {
        return ModeIf(StartsWithAny(model, {"M3007", "M3027", "M3037", "M3047", "M3048", "M3057",
                                            "M3058", "F1035"}),
                      DewarperAxis);
    }
    if (StartsWith(make, "BOSCH")) {
        return ModeIf(Contains(model, "panoramic"), DewarperBosch);
    }
    if (StartsWith(make, "Dahua")) {
        return ModeIf(StartsWithAny(model, {"IPC-EB", "DH-IPC-EB"}), DewarperDahua);
    }
    if (StartsWith(make, "STORM")) {
        return ModeIf(EndsWith(model, "HEM"), DewarperStorm);
    }
    if (StartsWith(make, "Pelco")) {
        return ModeIf(StartsWith(model, "IMM"), DewarperPelco);
    }
    if (StartsWith(make, "HikVision") || StartsWith(make, "HIKVISION")) {
        return ModeIf(EndsWithAny(model, {"F-IV", "F-IW", "F-IS", "F-IVS", "F-IWS", "F-I",
                                          "FWD-IVS", "FWD-IV", "FWD-IS", "FWD-I", "-FE", "-FEA"}),
                      DewarperHikvision);
    }
    return DewarperNone;
}
