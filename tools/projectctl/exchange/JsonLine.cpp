#include "exchange/JsonLine.hpp"

#include "line/JsonReader.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

using project::stores::JsonReader;

JsonTexts readJsonLine(std::string_view line) {
    JsonReader reader(line);
    JsonTexts result;
    bool isValid = reader.expect('{');
    while (isValid && !reader.isNext('}')) {
        std::string_view name;
        std::string_view value;
        isValid = (result.empty() || reader.expect(',')) && reader.string(name) && reader.expect(':') &&
                  reader.string(value);
        if (isValid) {
            auto const text = project::stores::decodeJsonContent(name);
            if (!result.emplace(text, project::stores::decodeJsonContent(value)).second) {
                throw Failure(Message("MemberTwice", text));
            }
        }
    }
    if (!isValid || !reader.expect('}') || !reader.end()) {
        throw Failure(Message("NotAnObject", reader.problemText()));
    }
    return result;
}

} // namespace projectctl
