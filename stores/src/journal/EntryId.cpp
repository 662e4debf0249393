#include "journal/EntryId.hpp"

#include <array>
#include <cstddef>
#include <cstdint>
#include <random>

namespace project::stores {

std::string newEntryId() {
    std::random_device device;
    std::array<std::uint32_t, 4> words{device(), device(), device(), device()};
    words[1] = (words[1] & 0xFFFF0FFFU) | 0x00004000U; // version 4: random
    words[2] = (words[2] & 0x3FFFFFFFU) | 0x80000000U; // the usual variant
    constexpr char digits[] = "0123456789abcdef";
    std::string id;
    for (std::size_t digit = 0; digit < 32; ++digit) {
        if (digit == 8 || digit == 12 || digit == 16 || digit == 20) {
            id += '-';
        }
        id += digits[(words.at(digit / 8) >> (28 - digit % 8 * 4)) & 0xFU];
    }
    return id;
}

} // namespace project::stores
