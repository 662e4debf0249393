#include "disk/QueuePlace.hpp"

#include <algorithm>
#include <limits>

#include <fcntl.h>
#include <unistd.h>

namespace project::stores {

namespace {

constexpr off_t unlimited = std::numeric_limits<off_t>::max();

/// The bytes [begin, end) of a folder.
struct Places {
    off_t begin;
    off_t end;
};

struct flock lockOf(Places places, short kind) {
    struct flock lock {};

    lock.l_type = kind;
    lock.l_whence = SEEK_SET;
    lock.l_start = places.begin;
    lock.l_len = places.end == unlimited ? 0 : places.end - places.begin;
    return lock;
}

/// Places in this range that another open folder holds: the first ones that the system finds.
/// @return empty also if the system cannot say.
std::optional<Places> findHeld(int folder, Places places) noexcept {
    auto asked = lockOf(places, F_WRLCK); // the kind that conflicts with every other lock
    if (places.begin >= places.end || ::fcntl(folder, F_OFD_GETLK, &asked) != 0 || asked.l_type == F_UNLCK) {
        return std::nullopt;
    }
    return Places{asked.l_start, asked.l_len == 0 ? unlimited : asked.l_start + asked.l_len};
}

} // namespace

bool QueuePlace::isOccupied(int folder) noexcept {
    return findHeld(folder, {0, unlimited}).has_value();
}

void QueuePlace::take() noexcept {
    off_t behindLast = 0;
    while (auto const held = findHeld(folder_, {behindLast, unlimited})) {
        behindLast = held->end;
    }
    if (behindLast < unlimited) {
        auto own = lockOf({behindLast, behindLast + 1}, F_RDLCK);
        if (::fcntl(folder_, F_OFD_SETLK, &own) == 0) {
            place_ = behindLast;
        }
    }
}

void QueuePlace::release() noexcept {
    if (place_) {
        auto own = lockOf({*place_, *place_ + 1}, F_UNLCK);
        ::fcntl(folder_, F_OFD_SETLK, &own);
        place_.reset();
    }
}

std::optional<off_t> QueuePlace::firstInFront() const noexcept {
    std::optional<off_t> first;
    auto held = findHeld(folder_, {0, place_.value_or(0)});
    while (held) {
        first = std::max<off_t>(held->begin, 0);
        held = findHeld(folder_, {0, *first});
    }
    return first;
}

} // namespace project::stores
