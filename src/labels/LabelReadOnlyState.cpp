#include "project/labels/LabelReadOnlyState.hpp"

#include <map>
#include <stdexcept>

#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::management {

using ZEPHRA::project::management::LabelReadOnlyStateUndefined;

namespace {

using TextsByState = std::map<LabelReadOnlyState, std::u16string>;
using StatesByText = std::map<std::u16string, LabelReadOnlyState>;

TextsByState const& textsByState() {
    static TextsByState const texts{{LabelReadOnlyState::READ_ONLY, u"READ_ONLY"},
                                    {LabelReadOnlyState::WRITABLE, u"WRITABLE"},
                                    {LabelReadOnlyState::INHERITED, u"INHERITED"}};
    return texts;
}

StatesByText invert(TextsByState const& texts) {
    StatesByText states;
    for (auto const& [state, text] : texts) {
        states.emplace(text, state);
    }
    return states;
}

StatesByText const& statesByText() {
    static StatesByText const states = invert(textsByState());
    return states;
}

} // namespace

std::u16string const& labelTypeToString(LabelReadOnlyState state) {
    return textsByState().at(state);
}

LabelReadOnlyState getLabelStateFromName(std::u16string const& text) {
    if (text.empty()) {
        return LabelReadOnlyState::INHERITED;
    }
    try {
        return statesByText().at(text);
    } catch (std::out_of_range const&) {
        exception::raise(LabelReadOnlyStateUndefined(text));
    }
}

} // namespace project::management
