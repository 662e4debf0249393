#include "output/JsonDocument.hpp"

#include "output/Output.hpp"

namespace projectctl {

JsonDocument::JsonDocument(JsonFormat const& format) {
    begin();
    addText("format", std::u16string(format.name.begin(), format.name.end()));
    addNumber("version", static_cast<std::size_t>(format.version));
}

void JsonDocument::finish() {
    end();
    output().text() += '\n';
}

} // namespace projectctl
