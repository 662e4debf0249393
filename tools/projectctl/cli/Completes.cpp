#include "cli/Completes.hpp"

namespace projectctl {

namespace {

// The parser has no place for our data in an option. A validator that is not active is one: it is neither run
// nor shown.
constexpr char const* carrier = "completes";

} // namespace

CLI::Option* completes(CLI::Option* option, Completes things) {
    CLI::Validator validator;
    validator.name(carrier).application_index(static_cast<int>(things)).active(false);
    return option->check(validator);
}

Completes completedBy(CLI::Option& option) {
    try {
        return static_cast<Completes>(option.get_validator(carrier)->get_application_index());
    } catch (CLI::OptionNotFound const&) {
        return Completes::Nothing;
    }
}

} // namespace projectctl
