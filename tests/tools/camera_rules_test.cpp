#include "camera_rules.h"

#include <algorithm>
#include <cctype>
#include <set>
#include <string>

#include <gtest/gtest.h>

#include "path_text.h"
#include "plugin_host.h"

namespace vexmap_host {
namespace {

// Each literal alone, with text before and after it, in lower case, every row's tests put
// together (start, middle, end), and nothing.
std::set<std::string> Candidates(bool makes) {
    std::set<std::string> candidates = {""};
    for (CameraRule const& rule : CameraRules::Rows()) {
        std::string starts;
        std::string middles;
        std::string ends;
        for (StringTest const& test : makes ? rule.make : rule.model) {
            for (std::string const& literal : test.literals) {
                candidates.insert({literal, literal + "x9", "Q" + literal, Lowercase(literal)});
            }
            std::string const& first = test.literals.front();
            (test.kind == StringTest::STARTS_WITH ? starts
             : test.kind == StringTest::ENDS_WITH ? ends
                                                  : middles) += first;
        }
        candidates.insert(starts + middles + ends);
    }
    return candidates;
}

TEST(CameraRules, ChooseTheModeThePluginChoosesForEveryLiteralAndNearMiss) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    std::set<std::string> const makes = Candidates(true);
    std::set<std::string> const models = Candidates(false);
    int passing = 0;
    for (std::string const& make : makes) {
        for (std::string const& model : models) {
            // The URL is tried with what passes the generic stream's row and with the model.
            for (std::string const& url : {std::string("rtsp://camera/h264"), model}) {
                int const expected =
                    host.Register().GetModeByCamera(make.c_str(), model.c_str(), url.c_str());
                CameraRules::Match const match = CameraRules::Choose(make, model, url);
                ASSERT_EQ(expected, match.mode)
                    << "make \"" << make << "\", model \"" << model << "\", URL \"" << url << "\"";
                passing += expected != 0 ? 1 : 0;
            }
        }
    }
    EXPECT_GT(passing, 100);  // the grid reaches every row, not only refusals
}

TEST(CameraRules, EveryRowChoosesItsModeForItsOwnLiterals) {
    std::vector<CameraRule> const& rows = CameraRules::Rows();
    ASSERT_EQ(16u, rows.size());
    std::set<int> modes;
    for (std::size_t row = 0; row < rows.size(); ++row) {
        CameraRule const& rule = rows[row];
        for (StringTest const& make : rule.make) {
            std::string const model = rule.model.size() == 2
                                          ? rule.model[0].literals[0] + rule.model[1].literals[0]
                                          : rule.model[0].literals.back();
            CameraRules::Match const match =
                CameraRules::Choose(make.literals.back(), model, rule.on_url ? model : "");
            EXPECT_EQ(int(row), match.row) << make.literals.back();
            EXPECT_EQ(rule.mode, match.mode) << make.literals.back();
        }
        modes.insert(rule.mode);
    }
    EXPECT_EQ(15u, modes.size());  // every mode but 0 has a row; Sentry360 has two
}

TEST(CameraRules, FirstRowWhoseMakePassesDecidesEvenWhenItsModelFails) {
    CameraRules::Match const match = CameraRules::Choose("Sentry360", "XY", "rtsp://a/h264");
    EXPECT_EQ(2, match.row);
    EXPECT_EQ(0, match.mode);
}

TEST(CameraRules, MakeThatNoRowTakesHasNoRow) {
    EXPECT_EQ(-1, CameraRules::Choose("vivotek", "FE8181", "").row);
}

TEST(CameraRules, DescribesEachTestInWords) {
    std::vector<CameraRule> const& rows = CameraRules::Rows();
    EXPECT_EQ("make equals \"Vivotek\"", rows[0].DescribeMake());
    EXPECT_EQ("model starts with \"FE\" or \"VC\"", rows[0].DescribeModel());
    EXPECT_EQ("URL ends with \"/h264\" or \"/image.mpg\"", rows[1].DescribeModel());
    EXPECT_EQ("make equals \"EVOLUTION\" or starts with \"Oncam\"", rows[3].DescribeMake());
    EXPECT_EQ("model starts with \"IN-D\" and ends with \"MHEM\"", rows[5].DescribeModel());
    EXPECT_EQ("model contains \"Fisheye\"", rows[7].DescribeModel());
    EXPECT_EQ(
        "model starts with one of \"M3007\", \"M3027\", \"M3037\", \"M3047\", \"M3048\", "
        "\"M3057\", \"M3058\", \"F1035\"",
        rows[10].DescribeModel());
}

}  // namespace
}  // namespace vexmap_host
