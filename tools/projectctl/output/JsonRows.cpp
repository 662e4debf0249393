#include "output/JsonRows.hpp"

#include "output/Output.hpp"

namespace projectctl {

void JsonRows::begin() {
    if (isEmpty_) {
        output().text() += "[\n";
    } else {
        end();
        output().text() += ",\n";
    }
    output().flushWhenLarge();
    isEmpty_ = false;
    JsonObject::begin();
}

void JsonRows::finish() {
    if (isEmpty_) {
        output().text() += "[]";
    } else {
        end();
        output().text() += "\n]";
    }
}

void JsonRows::finishOutput() {
    finish();
    output().text() += '\n';
}

} // namespace projectctl
