#include "output/JsonRows.hpp"

#include "output/Output.hpp"

namespace projectctl {

void JsonRows::open() {
    if (format_ != nullptr) {
        document_.emplace(*format_);
        document_->addKey(key_);
    }
    output().text() += '[';
}

void JsonRows::begin() {
    if (isEmpty_) {
        open();
        output().text() += '\n';
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
        open();
        output().text() += ']';
    } else {
        end();
        output().text() += "\n]";
    }
    if (document_) {
        document_->finish();
    }
}

} // namespace projectctl
