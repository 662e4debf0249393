#include "report/ReportData.hpp"

#include <random>

#include <gmock/gmock.h>

namespace projectctl {
namespace {

using ::testing::HasSubstr;

std::u16string number(std::size_t value) {
    auto const digits = std::to_string(value);
    return {digits.begin(), digits.end()};
}

/// 100,000 files with names, sizes, lines and labels as a project of that size has them.
ReportData largeData() {
    std::mt19937 random(1); // NOLINT(cert-msc51-cpp): the same in each run
    std::lognormal_distribution<double> sizes(8.5, 1.4);
    std::vector<std::u16string> const words{u"pump",       u"valve", u"motor", u"Signal",
                                            u"controller", u"state", u"test"};
    auto const word = [&] { return words[random() % words.size()]; };
    ReportData data;
    for (std::size_t module = 0; module < 5000; ++module) {
        auto const folder =
            u"source/part_" + number(100 + module / 50) + u'/' + word() + number(10 + module % 50);
        data.definition.entries.push_back({folder, Kind::Folder, {}});
        data.measures.emplace_back();
        for (std::size_t file = 0; file < 20; ++file) {
            LabelsOnFile labels;
            if (random() % 3 == 0) {
                labels.emplace_back(u"category", number(random() % 6));
            }
            data.definition.entries.push_back(
                {folder + u'/' + number(10 + file) + word() + word() + u".cpp", Kind::File, labels});
            auto const size = static_cast<std::uint64_t>(sizes(random));
            data.measures.push_back({size, size / 34});
        }
    }
    return data;
}

TEST(ReportData, of100000FilesIsSmallerThan3Megabytes) {
    auto const json = jsonOf(largeData());

    EXPECT_LT(json.size(), 3000000U);
    EXPECT_GT(json.size(), 1000000U);
}

TEST(ReportData, isTheSameForTheSameProject) {
    EXPECT_EQ(jsonOf(largeData()), jsonOf(largeData()));
}

TEST(ReportData, namesLabelsThatTheDefinitionDoesNotHave) {
    ReportData data;
    data.definition.categories[u"c"] = {u"Status", false, {{u"l", u"Open"}}};
    data.definition.entries = {{u"a", Kind::File, {{u"c", u"l"}}}, {u"b", Kind::File, {{u"d", u"m"}}}};
    data.measures.resize(2);

    EXPECT_THAT(
        jsonOf(data),
        HasSubstr(R"("categories":[{"uuid":"c","name":"Status","isDeleted":false},)"
                  R"({"uuid":"d","name":"","isDeleted":true}],)"
                  R"("labels":[{"category":0,"uuid":"l","name":"Open","isDeleted":false},)"
                  R"({"category":1,"uuid":"m","name":"","isDeleted":true}],"labelSets":[[],[0],[1]])"));
}

} // namespace
} // namespace projectctl
