#include "completion/TypedPlace.hpp"

#include <algorithm>
#include <cstddef>

#include "cli/VerbTree.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

bool isOption(std::string const& word) {
    return word.size() > 1 && word.front() == '-';
}

class PlaceFinder {
public:
    explicit PlaceFinder(CLI::App& tool) : tool_(tool) { place_.command = &tool; }

    void pass(std::string const& word) {
        if (place_.option != nullptr) {
            takeValue(*place_.option, word);
            place_.option = nullptr;
        } else if (word == "--" && !place_.optionsEnded) {
            place_.optionsEnded = true;
        } else if (isOption(word) && !place_.optionsEnded) {
            passOption(word);
        } else if (hasMembers()) {
            enter(word);
        } else if (auto* const argument = nextArgument()) {
            takeValue(*argument, word);
        }
    }

    TypedPlace end(std::string const& word) {
        place_.word = word;
        std::size_t const equals = word.find('=');
        if (place_.option == nullptr && (place_.optionsEnded || !word.starts_with('-'))) {
            place_.option = hasMembers() ? nullptr : nextArgument();
        } else if (place_.option == nullptr && word.starts_with("--") && equals != std::string::npos) {
            place_.option = known(word.substr(0, equals));
            place_.before = word.substr(0, equals + 1);
            place_.word.erase(0, equals + 1);
        }
        return std::move(place_);
    }

private:
    bool hasMembers() const { return !membersOf(*place_.command).empty(); }

    void enter(std::string const& name) {
        auto const members = membersOf(*place_.command);
        auto const found =
            std::ranges::find_if(members, [&name](auto const* member) { return member->get_name() == name; });
        if (found == members.end()) {
            throw Failure(Message("UnknownVerb", name));
        }
        place_.command = *found;
    }

    void passOption(std::string const& word) {
        if (!word.starts_with("--") || word.find('=') == std::string::npos) {
            auto* const option = known(word);
            bool const hasValue = option->get_items_expected_max() > 0;
            place_.option = hasValue ? option : nullptr;
        }
    }

    CLI::Option* known(std::string const& name) const {
        auto* option = place_.command->get_option_no_throw(name);
        option = option != nullptr ? option : tool_.get_option_no_throw(name);
        if (option == nullptr) {
            throw Failure(Message("UnknownOption", name));
        }
        return option;
    }

    /// The argument to which the next word belongs; null if there are no more.
    CLI::Option* nextArgument() {
        auto const arguments =
            place_.command->get_options([](CLI::Option* option) { return option->get_positional(); });
        auto const next = std::ranges::find_if(arguments, [this](CLI::Option* argument) {
            auto const most = static_cast<std::size_t>(argument->get_items_expected_max());
            return place_.values[argument].size() < most;
        });
        return next != arguments.end() ? *next : nullptr;
    }

    void takeValue(CLI::Option const& option, std::string const& value) {
        place_.values[&option].push_back(value);
    }

    CLI::App& tool_;
    TypedPlace place_;
};

} // namespace

TypedPlace placeOfLast(std::vector<std::string> const& words, CLI::App& tool) {
    PlaceFinder finder(tool);
    std::for_each(words.begin(), words.end() - 1, [&finder](auto const& word) { finder.pass(word); });
    return finder.end(words.back());
}

} // namespace projectctl
