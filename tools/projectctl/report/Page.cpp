#include "report/Page.hpp"

#include <array>
#include <cstdint>
#include <map>

#include <nettle/base64.h>
#include <nettle/sha2.h>

#include "report/PageSources.hpp"
#include "report/PageTexts.hpp"

namespace projectctl {

namespace {

/// The source expression of an element's content in a policy.
std::string hashSource(std::string_view content) {
    sha256_ctx context;
    sha256_init(&context);
    sha256_update(&context, content.size(), reinterpret_cast<std::uint8_t const*>(content.data()));
    std::array<std::uint8_t, SHA256_DIGEST_SIZE> sum{};
    sha256_digest(&context, sum.size(), sum.data());
    std::array<char, BASE64_ENCODE_RAW_LENGTH(SHA256_DIGEST_SIZE)> text{};
    base64_encode_raw(text.data(), sum.size(), sum.data());
    return "'sha256-" + std::string(text.data(), text.size()) + '\'';
}

std::string policy() {
    return "default-src 'none'; script-src " + hashSource(page::libraries) + ' ' + hashSource(page::script) +
           "; style-src " + hashSource(page::style) + "; base-uri 'none'; form-action 'none'";
}

} // namespace

std::string assemblePage(std::string_view data) {
    std::string const policyText = policy();
    std::string const language = pageText("Language");
    std::string const title = pageText("ProjectReport");
    std::string const noScript = pageText("NoScript");
    std::map<std::string_view, std::string_view> const contents{
        {"language", language},   {"policy", policyText}, {"title", title},
        {"noscript", noScript},   {"style", page::style}, {"libraries", page::libraries},
        {"script", page::script}, {"data", data}};
    constexpr std::string_view open = "{{";
    constexpr std::string_view close = "}}";
    std::string result;
    std::string_view rest = page::html;
    for (auto at = rest.find(open); at != std::string_view::npos; at = rest.find(open)) {
        auto const end = rest.find(close, at);
        result += rest.substr(0, at);
        result += contents.at(rest.substr(at + open.size(), end - at - open.size()));
        rest.remove_prefix(end + close.size());
    }
    return result.append(rest);
}

} // namespace projectctl
