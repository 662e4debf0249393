#include "HostileTexts.hpp"

#include <ctime>
#include <optional>

#include <gtest/gtest.h>

#include "project/stores/StoreError.hpp"
#include "project/stores/TextMerge.hpp"
#include "support/Allocations.hpp"
#include "support/NightlyScale.hpp"
#include "text/ProjectText.hpp"

namespace project::test {
namespace {

using stores::Address;
using stores::ProjectText;

struct Costs {
    std::size_t peak;
    std::size_t total;
    double seconds;
};

std::optional<ProjectText> read(std::string text) {
    try {
        return ProjectText::read(std::move(text), "project.jsonl");
    } catch (stores::StoreError const&) {
        return std::nullopt;
    }
}

std::size_t walk(ProjectText const& text) {
    std::size_t count = 0;
    std::vector<Address> open{Address::root()};
    while (!open.empty()) {
        Address const parent = open.back();
        open.pop_back();
        for (auto const& child : text.children(parent)) {
            ++count;
            if (child.hasChildren) {
                open.push_back(parent.child(child.element));
            }
        }
    }
    return count;
}

double cpuSeconds() {
    timespec time{};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

template <typename Work>
Costs costsOf(std::string const& text, Work const& work) {
    double const before = cpuSeconds();
    Allocations const allocated;
    work(text);
    return {allocated.peak(), allocated.total(), cpuSeconds() - before};
}

/// The operations on a text from an untrusted clone.
struct Work {
    char const* name;
    void (*run)(std::string const& text);
};

void readAndList(std::string const& text) {
    if (auto const whole = read(text)) {
        walk(*whole);
    }
}

void writeAnew(std::string const& text) {
    if (auto const whole = read(text)) {
        auto const tidy = whole->rewrittenWith({});
        EXPECT_TRUE(tidy.faults().empty());
        whole->damagedLines();
        whole->differencesTo(ProjectText::empty());
    }
}

void merge(std::string const& text) {
    try {
        stores::mergeTexts("", text, text);
        stores::mergeTexts(text, ProjectText::empty().body(), text);
    } catch (stores::StoreError const&) {
        // damaged texts are refused, which must not cost more either
    }
}

constexpr Work allWork[] = {{"readAndList", readAndList}, {"writeAnew", writeAnew}, {"merge", merge}};

/// The number of hostile elements in a text. The nightly run uses more.
std::size_t usualCount() {
    constexpr std::size_t forEachSecond = 50;
    return forEachSecond * testSeconds(3);
}

/// Four times the input may take at most ten times as long: far more than linear code needs, and far less
/// than the sixteen times of quadratic code. A noisy machine gets several attempts.
void expectNoMoreTime(Work const& work, std::string const& small, std::string const& large) {
    constexpr double tooShortToTell = 2e-3;
    double growth = 0;
    for (int attempt = 0; attempt < 5; ++attempt) {
        double const many = costsOf(large, work.run).seconds;
        growth = many / costsOf(small, work.run).seconds;
        if (many < tooShortToTell || growth < 10) {
            return;
        }
    }
    ADD_FAILURE() << "four times as much took " << growth << " times as long";
}

class HostileTextTest : public ::testing::TestWithParam<HostileText> {
protected:
    std::string make(std::size_t count) const { return GetParam().make(count); }
};

/// A line of one byte costs most: it is kept with its fault, or while a tail is read.
constexpr std::size_t mostBytesForEach = 100;
constexpr std::size_t anyway = 64 * 1024;

TEST_P(HostileTextTest, takesMemoryInProportionToItself) {
    std::string const text = make(4 * usualCount());
    for (Work const& work : allWork) {
        SCOPED_TRACE(work.name);
        EXPECT_LE(costsOf(text, work.run).peak, mostBytesForEach * text.size() + anyway);
    }
}

TEST_P(HostileTextTest, costsInProportionToItself) {
    std::string const small = make(usualCount());
    std::string const large = make(4 * usualCount());
    for (Work const& work : allWork) {
        SCOPED_TRACE(work.name);
        Costs const few = costsOf(small, work.run);
        Costs const many = costsOf(large, work.run);
        EXPECT_LE(many.total, 6 * few.total + anyway) << "bytes allocated, one after the other";
        expectNoMoreTime(work, small, large);
    }
}

INSTANTIATE_TEST_SUITE_P(, HostileTextTest, ::testing::ValuesIn(hostileTexts()),
                         [](auto const& text) { return std::string(text.param.name); });

} // namespace
} // namespace project::test
