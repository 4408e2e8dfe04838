#pragma once

#include <cstddef>
#include <memory>
#include <new>
#include <span>

#include <boost/container/small_vector.hpp>

namespace Orvandeil::FileIO::detail {

// Owns the pieces of one format. The first `roomBytes` of them stand in the list itself, so that
// parsing a format of ordinary length takes no memory; the others have blocks of their own.
template <class Piece, std::size_t roomBytes>
class PieceList {
    static constexpr std::size_t aligned = alignof(std::max_align_t);
    template <class Made>
    static constexpr std::size_t alignedSize = (sizeof(Made) + aligned - 1) / aligned* aligned;

public:
    // The pieces of one class that the list itself can hold.
    template <class Made>
    static constexpr std::size_t roomFor = roomBytes / alignedSize<Made>;

    PieceList() = default;
    PieceList(const PieceList&) = delete;
    PieceList& operator=(const PieceList&) = delete;
    ~PieceList() {
        for (Piece* const piece : pieces) {
            if (standsInside(piece)) {
                std::destroy_at(piece);
            } else {
                delete piece;
            }
        }
    }

    template <class Made, class... Arguments>
    Made& emplace(const Arguments&... arguments) {
        static_assert(alignof(Made) <= alignof(std::max_align_t));
        if (pieces.size() == pieces.capacity()) pieces.reserve(2 * pieces.size());
        const bool fits = sizeof(Made) <= roomBytes - used;
        Made* const made = fits ? new (static_cast<void*>(room + used)) Made(arguments...)
                                : new Made(arguments...);
        if (fits) used += alignedSize<Made>;
        pieces.push_back(made);
        return *made;
    }

    std::size_t size() const { return pieces.size(); }
    Piece* operator[](std::size_t index) const { return pieces[index]; }
    std::span<Piece* const> all() const { return {pieces.data(), pieces.size()}; }

private:
    static constexpr std::size_t usualPieces = 16;
    static_assert(roomBytes % aligned == 0);

    bool standsInside(const Piece* piece) const {
        const auto* const place = reinterpret_cast<const std::byte*>(piece);
        return !std::less<>()(place, room) && std::less<>()(place, room + roomBytes);
    }

    boost::container::small_vector<Piece*, usualPieces> pieces;
    std::size_t used = 0;
    alignas(std::max_align_t) std::byte room[roomBytes];
};

}  // namespace Orvandeil::FileIO::detail
