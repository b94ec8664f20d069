#include <cctype>
#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "CameraTable.h"

namespace {

constexpr int NO_MODE = 0;

struct Camera {
    char const* name;  // the parameter name of the case
    char const* make;
    char const* model;
    char const* url;
    int mode;
};

std::ostream& operator<<(std::ostream& stream, Camera const& camera) {
    return stream << '"' << camera.make << "\" \"" << camera.model << "\" \"" << camera.url << '"';
}

std::string CameraName(::testing::TestParamInfo<Camera> const& info) {
    return info.param.name;
}

int ModeOf(Camera const& camera) {
    return CameraTable::ModeOf(camera.make, camera.model, camera.url);
}

std::string Lowercase(std::string text) {
    for (char& c : text) {
        c = char(std::tolower(static_cast<unsigned char>(c)));
    }
    return text;
}

// One camera that each row, and each spelling a row accepts, gives its mode to.
Camera const MatchingCameras[] = {
    {"VivotekFe", "Vivotek", "FE8174", "", 3},
    {"VivotekVc", "Vivotek", "VC8101", "", 3},
    {"RtspH264", "RTSP", "", "rtsp://192.168.0.9/h264", 2},
    {"RtspImageMpg", "RTSP", "", "http://192.168.0.9/image.mpg", 2},
    {"Sentry360Fs", "Sentry360", "FS-IP5000", "", 2},
    {"EvolutionEvo", "EVOLUTION", "EVO-05", "", 4},
    {"OncamEvo", "Oncam", "EVO-12", "", 4},
    {"OncamGrandeyeEvo", "Oncam Grandeye", "EVO-05-JXD", "", 4},
    {"ActiB54", "ACTi", "B54", "", 5},
    {"InaxsysInDMhem", "Inaxsys", "IN-DF12MHEM", "", 6},
    {"InaxsysInDMhemAlone", "Inaxsys", "IN-DMHEM", "", 6},
    {"SamsungSnf", "Samsung", "SNF-8010", "", 7},
    {"SamsungTechwinPnf", "Samsung Techwin", "PNF-9010R", "", 7},
    {"BrenviaFisheye", "Brenvia", "BR-418 Fisheye", "", 8},
    {"BrenviaTechFisheyeAlone", "Brenvia Tech", "Fisheye", "", 8},
    {"GeovisionGvFe", "Geovision", "GV-FE5303", "", 9},
    {"PanasonicWvSf438", "Panasonic", "WV-SF438", "", 11},
    {"AxisM3007", "AXIS", "M3007-P", "", 10},
    {"BoschPanoramic", "BOSCH", "FLEXIDOME IP panoramic 7000", "", 12},
    {"BoschPanoramicAlone", "BOSCH", "panoramic", "", 12},
    {"DahuaIpcEb", "Dahua", "IPC-EB5531", "", 13},
    {"DahuaTechnologyDhIpcEb", "Dahua Technology", "DH-IPC-EBW8630", "", 13},
    {"StormHem", "STORM", "ST-5MHEM", "", 14},
    {"PelcoImm", "Pelco", "IMM12027-1S", "", 15},
    {"HikVisionFIv", "HikVision", "DS-2CD63C2F-IV", "", 16},
    {"HikvisionUpperCaseFe", "HIKVISION", "DS-2CD6365G0E-FE", "", 16},
};

// For each row, cameras that fail it by one thing: case, text before or after, a literal found
// elsewhere than where the row looks, a string shorter than the literal, or the wrong URL.
Camera const NearMisses[] = {
    {"VivotekLowerCaseMake", "vivotek", "FE8174", "", NO_MODE},
    {"VivotekMakeWithTrailingBlank", "Vivotek ", "FE8174", "", NO_MODE},
    {"VivotekMakeWithLeadingText", "NVivotek", "FE8174", "", NO_MODE},
    {"VivotekLowerCaseModel", "Vivotek", "fe8174", "", NO_MODE},
    {"VivotekModelWithLeadingBlank", "Vivotek", " FE8174", "", NO_MODE},
    {"VivotekModelWithFeInside", "Vivotek", "IP-FE8174", "", NO_MODE},
    {"VivotekModelShorterThanFe", "Vivotek", "F", "", NO_MODE},

    {"RtspLowerCaseMake", "rtsp", "", "rtsp://192.168.0.9/h264", NO_MODE},
    {"RtspMakeWithTrailingText", "RTSP/1.0", "", "rtsp://192.168.0.9/h264", NO_MODE},
    {"RtspUpperCaseUrl", "RTSP", "", "rtsp://192.168.0.9/H264", NO_MODE},
    {"RtspUrlWithTextAfterH264", "RTSP", "", "rtsp://192.168.0.9/h264/live", NO_MODE},
    {"RtspUrlWithTrailingBlank", "RTSP", "", "rtsp://192.168.0.9/h264 ", NO_MODE},
    {"RtspUrlWithQueryAfterImageMpg", "RTSP", "", "http://192.168.0.9/image.mpg?q=1", NO_MODE},
    {"RtspUrlWithoutTheSlash", "RTSP", "", "rtsp://192.168.0.9/stream.h264", NO_MODE},
    {"RtspUrlShorterThanH264", "RTSP", "", "h264", NO_MODE},
    {"RtspSentry360ModelWithoutUrl", "RTSP", "FS-IP5000", "", NO_MODE},

    {"Sentry360LowerCaseMake", "sentry360", "FS-IP5000", "", NO_MODE},
    {"Sentry360MakeWithTrailingText", "Sentry360 Inc", "FS-IP5000", "", NO_MODE},
    {"Sentry360LowerCaseModel", "Sentry360", "fs-ip5000", "", NO_MODE},
    {"Sentry360ModelWithFsInside", "Sentry360", "IP-FS5000", "", NO_MODE},
    {"Sentry360ModelShorterThanFs", "Sentry360", "F", "", NO_MODE},

    {"EvolutionMixedCaseMake", "Evolution", "EVO-05", "", NO_MODE},
    {"EvolutionMakeWithTrailingText", "EVOLUTION2", "EVO-05", "", NO_MODE},
    {"OncamLowerCaseMake", "oncam", "EVO-05", "", NO_MODE},
    {"OncamMakeWithLeadingText", "The Oncam", "EVO-05", "", NO_MODE},
    {"OncamLowerCaseModel", "Oncam", "evo-05", "", NO_MODE},
    {"OncamModelWithEvoInside", "Oncam", "X-EVO-05", "", NO_MODE},
    {"OncamModelShorterThanEvo", "Oncam", "EV", "", NO_MODE},

    {"ActiUpperCaseMake", "ACTI", "B54", "", NO_MODE},
    {"ActiMakeWithTrailingText", "ACTi Corporation", "B54", "", NO_MODE},
    {"ActiLowerCaseModel", "ACTi", "b54", "", NO_MODE},
    {"ActiModelWithEntryInside", "ACTi", "XB54", "", NO_MODE},

    {"InaxsysLowerCaseMake", "inaxsys", "IN-DF12MHEM", "", NO_MODE},
    {"InaxsysMakeWithTrailingText", "Inaxsys Vision", "IN-DF12MHEM", "", NO_MODE},
    {"InaxsysLowerCaseModel", "Inaxsys", "in-df12mhem", "", NO_MODE},
    {"InaxsysModelWithTextBeforeInD", "Inaxsys", "XIN-DF12MHEM", "", NO_MODE},
    {"InaxsysModelWithTextAfterMhem", "Inaxsys", "IN-DF12MHEM2", "", NO_MODE},
    {"InaxsysModelEndingInHemOnly", "Inaxsys", "IN-DF12HEM", "", NO_MODE},
    {"InaxsysModelEndingInMhemAlone", "Inaxsys", "IPF12MHEM", "", NO_MODE},

    {"SamsungUpperCaseMake", "SAMSUNG", "SNF-8010", "", NO_MODE},
    {"SamsungMakeWithLeadingText", "Hanwha Samsung", "SNF-8010", "", NO_MODE},
    {"SamsungLowerCaseModel", "Samsung", "snf-8010", "", NO_MODE},
    {"SamsungModelWithSnfInside", "Samsung", "X-SNF-8010", "", NO_MODE},
    {"SamsungModelShorterThanSnf", "Samsung", "SN", "", NO_MODE},

    {"BrenviaLowerCaseMake", "brenvia", "BR-418 Fisheye", "", NO_MODE},
    {"BrenviaMakeWithLeadingText", "The Brenvia", "BR-418 Fisheye", "", NO_MODE},
    {"BrenviaModelWithFisheyeSplit", "Brenvia", "BR-418 Fish eye", "", NO_MODE},
    {"BrenviaModelWithFisheyeCutShort", "Brenvia", "BR-418 Fishey", "", NO_MODE},
    {"BrenviaModelShorterThanFisheye", "Brenvia", "Fish", "", NO_MODE},

    {"GeovisionCamelCaseMake", "GeoVision", "GV-FE5303", "", NO_MODE},
    {"GeovisionMakeWithTrailingText", "Geovision Inc.", "GV-FE5303", "", NO_MODE},
    {"GeovisionLowerCaseModel", "Geovision", "gv-fe5303", "", NO_MODE},
    {"GeovisionModelWithGvFeInside", "Geovision", "X-GV-FE5303", "", NO_MODE},
    {"GeovisionModelShorterThanGvFe", "Geovision", "GV-F", "", NO_MODE},

    {"PanasonicUpperCaseMake", "PANASONIC", "WV-SF438", "", NO_MODE},
    {"PanasonicMakeWithTrailingText", "Panasonic i-PRO", "WV-SF438", "", NO_MODE},
    {"PanasonicLowerCaseModel", "Panasonic", "wv-sf438", "", NO_MODE},
    {"PanasonicModelWithEntryInside", "Panasonic", "i-WV-SF438", "", NO_MODE},

    {"AxisCamelCaseMake", "Axis", "M3007-P", "", NO_MODE},
    {"AxisMakeWithLeadingText", "The AXIS", "M3007-P", "", NO_MODE},
    {"AxisLowerCaseModel", "AXIS", "m3007-p", "", NO_MODE},
    {"AxisModelWithEntryInside", "AXIS", "AXIS M3007-P", "", NO_MODE},

    {"BoschCamelCaseMake", "Bosch", "FLEXIDOME IP panoramic 7000", "", NO_MODE},
    {"BoschMakeWithLeadingText", "Robert BOSCH", "FLEXIDOME IP panoramic 7000", "", NO_MODE},
    {"BoschCapitalisedModel", "BOSCH", "FLEXIDOME IP Panoramic 7000", "", NO_MODE},
    {"BoschModelShorterThanPanoramic", "BOSCH", "panorami", "", NO_MODE},

    {"DahuaLowerCaseMake", "dahua", "IPC-EB5531", "", NO_MODE},
    {"DahuaMakeWithLeadingText", "ZDahua", "IPC-EB5531", "", NO_MODE},
    {"DahuaLowerCaseModel", "Dahua", "ipc-eb5531", "", NO_MODE},
    {"DahuaModelWithIpcEbInside", "Dahua", "X-IPC-EB5531", "", NO_MODE},
    {"DahuaModelShorterThanIpcEb", "Dahua", "IPC-E", "", NO_MODE},

    {"StormCamelCaseMake", "Storm", "ST-5MHEM", "", NO_MODE},
    {"StormMakeWithLeadingText", "A STORM", "ST-5MHEM", "", NO_MODE},
    {"StormLowerCaseModel", "STORM", "st-5mhem", "", NO_MODE},
    {"StormModelWithTextAfterHem", "STORM", "ST-HEM5", "", NO_MODE},
    {"StormModelShorterThanHem", "STORM", "HE", "", NO_MODE},

    {"PelcoUpperCaseMake", "PELCO", "IMM12027-1S", "", NO_MODE},
    {"PelcoMakeWithLeadingText", "Schneider Pelco", "IMM12027-1S", "", NO_MODE},
    {"PelcoLowerCaseModel", "Pelco", "imm12027-1s", "", NO_MODE},
    {"PelcoModelWithImmInside", "Pelco", "X-IMM12027", "", NO_MODE},
    {"PelcoModelShorterThanImm", "Pelco", "IM", "", NO_MODE},

    {"HikvisionMixedCaseMake", "Hikvision", "DS-2CD63C2F-IV", "", NO_MODE},
    {"HikvisionMakeWithLeadingText", "The HikVision", "DS-2CD63C2F-IV", "", NO_MODE},
    {"HikvisionLowerCaseModel", "HikVision", "ds-2cd63c2f-iv", "", NO_MODE},
    {"HikvisionModelWithTextAfterEntry", "HikVision", "DS-2CD63C2F-IV2", "", NO_MODE},
    {"HikvisionModelStartingWithEntry", "HikVision", "F-IV-DS", "", NO_MODE},
    {"HikvisionModelShorterThanFe", "HikVision", "FE", "", NO_MODE},

    {"UnknownMake", "Acme", "FE8174", "rtsp://192.168.0.9/h264", NO_MODE},
    {"EmptyStrings", "", "", "", NO_MODE},
};

class CameraTableRowTest : public ::testing::TestWithParam<Camera> {};

TEST_P(CameraTableRowTest, GivesTheModeOfItsRow) {
    EXPECT_EQ(GetParam().mode, ModeOf(GetParam()));
}

INSTANTIATE_TEST_SUITE_P(Rows, CameraTableRowTest, ::testing::ValuesIn(MatchingCameras),
                         CameraName);

class CameraTableNearMissTest : public ::testing::TestWithParam<Camera> {};

TEST_P(CameraTableNearMissTest, GivesNoMode) {
    EXPECT_EQ(NO_MODE, ModeOf(GetParam()));
}

INSTANTIATE_TEST_SUITE_P(Rows, CameraTableNearMissTest, ::testing::ValuesIn(NearMisses),
                         CameraName);

/// One literal of a model list and where the row looks for it.
struct ListEntry {
    char const* make;
    char const* literal;
    int mode;
    bool at_end;  // HikVision tests the end of the model, the other lists its start
};

std::ostream& operator<<(std::ostream& stream, ListEntry const& entry) {
    return stream << entry.make << " \"" << entry.literal << '"';
}

// Letters and digits of the literal, which stay unique within each list ("F-IV" is FIV).
std::string ListEntryName(::testing::TestParamInfo<ListEntry> const& info) {
    std::string name;
    for (char const* c = info.param.literal; *c != '\0'; ++c) {
        if (std::isalnum(static_cast<unsigned char>(*c)) != 0) {
            name += *c;
        }
    }
    return name;
}

class CameraTableListTest : public ::testing::TestWithParam<ListEntry> {
protected:
    int ModeOfModel(std::string const& model) const {
        return CameraTable::ModeOf(GetParam().make, model.c_str(), "");
    }
    // Text on the side the row does not look at; a HikVision model usually starts this way.
    std::string WithTextOnTheFreeSide() const {
        std::string const literal = GetParam().literal;
        return GetParam().at_end ? "DS-2CD6365G0" + literal : literal + "-P2";
    }
    std::string WithTextOnTheTestedSide() const {
        std::string const literal = GetParam().literal;
        return GetParam().at_end ? literal + "X" : "X" + literal;
    }
    // The literal less its character on the side the row looks at.
    std::string CutShort() const {
        std::string const literal = GetParam().literal;
        return GetParam().at_end ? literal.substr(1) : literal.substr(0, literal.size() - 1);
    }
};

TEST_P(CameraTableListTest, EntryAloneGivesTheMode) {
    EXPECT_EQ(GetParam().mode, ModeOfModel(GetParam().literal));
}

TEST_P(CameraTableListTest, EntryWithTextOnItsFreeSideGivesTheMode) {
    EXPECT_EQ(GetParam().mode, ModeOfModel(WithTextOnTheFreeSide()));
}

TEST_P(CameraTableListTest, EntryWithTextOnItsTestedSideGivesNoMode) {
    EXPECT_EQ(NO_MODE, ModeOfModel(WithTextOnTheTestedSide()));
}

TEST_P(CameraTableListTest, EntryInLowerCaseGivesNoMode) {
    EXPECT_EQ(NO_MODE, ModeOfModel(Lowercase(GetParam().literal)));
}

TEST_P(CameraTableListTest, EntryCutShortOnItsTestedSideGivesNoMode) {
    EXPECT_EQ(NO_MODE, ModeOfModel(CutShort()));
}

ListEntry const ActiModels[] = {
    {"ACTi", "KCM3911", 5, false}, {"ACTi", "KCM7911", 5, false}, {"ACTi", "B54", 5, false},
    {"ACTi", "B55", 5, false},     {"ACTi", "B56", 5, false},     {"ACTi", "E96", 5, false},
    {"ACTi", "E919", 5, false},    {"ACTi", "E921", 5, false},    {"ACTi", "E923", 5, false},
    {"ACTi", "I51", 5, false},     {"ACTi", "I71", 5, false},     {"ACTi", "E98", 5, false},
    {"ACTi", "E15", 5, false},     {"ACTi", "E16", 5, false},     {"ACTi", "E925", 5, false},
    {"ACTi", "E927", 5, false},    {"ACTi", "E929", 5, false},    {"ACTi", "I73", 5, false},
    {"ACTi", "Q111", 5, false},    {"ACTi", "Q13", 5, false},     {"ACTi", "B59", 5, false},
    {"ACTi", "B74", 5, false},     {"ACTi", "B76", 5, false},     {"ACTi", "B511", 5, false},
    {"ACTi", "I52", 5, false},     {"ACTi", "I72", 5, false},     {"ACTi", "B57", 5, false},
    {"ACTi", "B77", 5, false},
};

ListEntry const PanasonicModels[] = {
    {"Panasonic", "WV-SF438", 11, false},  {"Panasonic", "WV-SW458", 11, false},
    {"Panasonic", "WV-SFN480", 11, false}, {"Panasonic", "WV-SFV481", 11, false},
    {"Panasonic", "WV-S4150", 11, false},  {"Panasonic", "WV-S4550", 11, false},
    {"Panasonic", "WV-X4170", 11, false},  {"Panasonic", "WV-X4570", 11, false},
};

ListEntry const AxisModels[] = {
    {"AXIS", "M3007", 10, false}, {"AXIS", "M3027", 10, false}, {"AXIS", "M3037", 10, false},
    {"AXIS", "M3047", 10, false}, {"AXIS", "M3048", 10, false}, {"AXIS", "M3057", 10, false},
    {"AXIS", "M3058", 10, false}, {"AXIS", "F1035", 10, false},
};

ListEntry const HikvisionModels[] = {
    {"HikVision", "F-IV", 16, true},    {"HikVision", "F-IW", 16, true},
    {"HikVision", "F-IS", 16, true},    {"HikVision", "F-IVS", 16, true},
    {"HikVision", "F-IWS", 16, true},   {"HikVision", "F-I", 16, true},
    {"HikVision", "FWD-IVS", 16, true}, {"HikVision", "FWD-IV", 16, true},
    {"HikVision", "FWD-IS", 16, true},  {"HikVision", "FWD-I", 16, true},
    {"HikVision", "-FE", 16, true},     {"HikVision", "-FEA", 16, true},
};

INSTANTIATE_TEST_SUITE_P(Acti, CameraTableListTest, ::testing::ValuesIn(ActiModels), ListEntryName);
INSTANTIATE_TEST_SUITE_P(Panasonic, CameraTableListTest, ::testing::ValuesIn(PanasonicModels),
                         ListEntryName);
INSTANTIATE_TEST_SUITE_P(Axis, CameraTableListTest, ::testing::ValuesIn(AxisModels), ListEntryName);
INSTANTIATE_TEST_SUITE_P(Hikvision, CameraTableListTest, ::testing::ValuesIn(HikvisionModels),
                         ListEntryName);

TEST(CameraTable, VivotekModelStartingWithFeGivesThreeAndAnyOtherStartGivesNone) {
    EXPECT_EQ(3, CameraTable::ModeOf("Vivotek", "FE8174", ""));
    EXPECT_EQ(3, CameraTable::ModeOf("Vivotek", "FE", ""));
    for (char const* model : {"FD8174", "EF8174", "IP8174", "VD8174", "", "XFE8174"}) {
        EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Vivotek", model, "")) << model;
    }
}

TEST(CameraTable, LowerCaseMakeGivesNoModeForEveryRow) {
    for (Camera const& camera : MatchingCameras) {
        ASSERT_EQ(camera.mode, ModeOf(camera)) << camera;
        std::string const make = Lowercase(camera.make);
        EXPECT_EQ(NO_MODE, CameraTable::ModeOf(make.c_str(), camera.model, camera.url)) << make;
    }
}

TEST(CameraTable, TextAfterVivotekFailsTheMakeWhileTextAfterAxisPassesIt) {
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Vivotek Inc.", "FE8174", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("VivotekX", "FE8174", ""));
    EXPECT_EQ(10, CameraTable::ModeOf("AXIS Communications AB", "M3007-P", ""));
    EXPECT_EQ(10, CameraTable::ModeOf("AXISX", "M3007", ""));
}

TEST(CameraTable, Sentry360ModelNotStartingWithFsGivesNoneEvenWithAStreamUrl) {
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Sentry360", "IP5000", "rtsp://192.168.0.9/h264"));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Sentry360", "", "http://192.168.0.9/image.mpg"));
}

TEST(CameraTable, RtspWithAnyModelAndAnH264UrlGivesTwo) {
    for (char const* model : {"", " ", "FS-IP5000", "fs", "FE8174", "anything at all"}) {
        EXPECT_EQ(2, CameraTable::ModeOf("RTSP", model, "rtsp://192.168.0.9/h264")) << model;
    }
}

TEST(CameraTable, HikvisionUpperCaseMakeWithModelEndingInFeOrExactlyFIGivesSixteen) {
    EXPECT_EQ(16, CameraTable::ModeOf("HIKVISION", "DS-2CD6365G0E-FE", ""));
    EXPECT_EQ(16, CameraTable::ModeOf("HIKVISION", "-FE", ""));
    EXPECT_EQ(16, CameraTable::ModeOf("HIKVISION", "F-I", ""));
}

TEST(CameraTable, InaxsysModelOfOnlyInDGivesNone) {
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Inaxsys", "IN-D", ""));
    EXPECT_EQ(6, CameraTable::ModeOf("Inaxsys", "IN-DMHEM", ""));
}

TEST(CameraTable, ActiModelShorterThanEveryListEntryGivesNone) {
    // The shortest entries have three characters.
    for (char const* model : {"", "B", "B5", "E9", "I5", "Q1", "KC"}) {
        EXPECT_EQ(NO_MODE, CameraTable::ModeOf("ACTi", model, "")) << model;
    }
}

TEST(CameraTable, BrenviaModelContainingFisheyeGivesEightButNotInLowerCase) {
    EXPECT_EQ(8, CameraTable::ModeOf("Brenvia", "BR-418 Fisheye Camera", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Brenvia", "BR-418 fisheye Camera", ""));
}

TEST(CameraTable, UrlCountsOnlyForTheRtspMake) {
    char const* const stream = "rtsp://192.168.0.9/h264";
    for (Camera const& camera : MatchingCameras) {
        if (std::string(camera.make) == "RTSP") {
            continue;
        }
        EXPECT_EQ(camera.mode, CameraTable::ModeOf(camera.make, camera.model, stream)) << camera;
        EXPECT_EQ(NO_MODE, CameraTable::ModeOf(camera.make, "", stream)) << camera;
    }
}

// No make passes two rows, so a later row can only "match" through its model test: the row of the
// make still decides, and its failed model test gives none.
TEST(CameraTable, FirstMakeThatPassesDecidesEvenWhenALaterRowWouldMatchTheModel) {
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Vivotek", "FS-IP5000", "rtsp://192.168.0.9/h264"));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("RTSP", "FE8174", "rtsp://192.168.0.9/live"));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Sentry360", "EVO-05", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("ACTi", "SNF-8010", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Geovision", "WV-SF438", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Panasonic", "M3007", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("AXIS", "FLEXIDOME IP panoramic 7000", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Pelco", "DS-2CD63C2F-IV", ""));
}

// A null string is outside the host contract; we answer none rather than crash, even when the
// row would not read that string.
TEST(CameraTable, NullStringGivesNoMode) {
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf(nullptr, "FS-IP5000", ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Sentry360", nullptr, ""));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("Sentry360", "FS-IP5000", nullptr));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf("RTSP", nullptr, "rtsp://192.168.0.9/h264"));
    EXPECT_EQ(NO_MODE, CameraTable::ModeOf(nullptr, nullptr, nullptr));
}

}  // namespace
