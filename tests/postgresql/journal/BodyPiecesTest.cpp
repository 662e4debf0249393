#include "journal/BodyPieces.hpp"

#include <random>
#include <string>

#include <gtest/gtest.h>

namespace project::postgresql {

namespace {

std::string joined(std::vector<std::string> const& pieces) {
    std::string body;
    for (auto const& piece : pieces) {
        EXPECT_TRUE(appendPiece(body, piece));
    }
    return body;
}

std::string randomBytes(std::size_t length) {
    std::mt19937 random(7);
    std::string bytes(length, '\0');
    for (auto& byte : bytes) {
        byte = static_cast<char>(random());
    }
    return bytes;
}

} // namespace

TEST(BodyPieces, aBodyOfAnyLengthIsTheSameAfterwards) {
    for (std::size_t const length : {0U, 1U, 999'999U, 1'000'000U, 1'000'001U, 3'500'000U}) {
        std::string const body(length, 'x');
        auto const pieces = cutBody(body);
        EXPECT_EQ(pieces.size(), length <= 1'000'000 ? 1 : (length + 999'999) / 1'000'000);
        EXPECT_EQ(joined(pieces), body) << length;
    }
}

TEST(BodyPieces, aPieceHasAtMostOneMebibyteEvenOfBytesThatCannotBeCompressed) {
    auto const body = randomBytes(2'500'000);
    auto const pieces = cutBody(body);
    for (auto const& piece : pieces) {
        EXPECT_LE(piece.size(), std::size_t{1} << 20);
    }
    EXPECT_EQ(joined(pieces), body);
}

TEST(BodyPieces, textIsCompressed) {
    std::string body;
    for (int i = 0; i < 20'000; ++i) {
        body += "\"source/module/file" + std::to_string(i) + ".cpp\"\n";
    }
    EXPECT_LT(cutBody(body)[0].size(), body.size() / 4);
}

TEST(BodyPieces, anUnreadablePieceIsRefused) {
    auto const piece = cutBody(randomBytes(1000))[0];
    std::string body;
    EXPECT_FALSE(appendPiece(body, ""));
    EXPECT_FALSE(appendPiece(body, "not a piece"));
    EXPECT_FALSE(appendPiece(body, std::string_view(piece).substr(0, piece.size() - 1)));
    EXPECT_FALSE(appendPiece(body, piece + "x"));
}

TEST(BodyPieces, aPieceThatClaimsToBeLargeIsRefusedBeforeItTakesMemory) {
    // a frame header that announces 2^40 bytes
    std::string const bomb{"\x28\xB5\x2F\xFD\xC0\x58\x00\x00\x00\x00\x00\x01\x00\x00\x01\x00\x00", 17};
    std::string body;
    EXPECT_FALSE(appendPiece(body, bomb));
}

} // namespace project::postgresql
