/// @file
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace vantelhost {

/// What the last 1, 2, 4, ... places of an even grid hold together, each window made of two of half
/// its length. Up to 2^overlap places a window ends at each place, a longer one at 2^overlap places
/// of its length: so memory is bounded, and a place costs a constant time for each length.
/// @tparam Part what places hold; by default that of a place without a sample. add() joins another.
template <typename Part>
class DyadicWindows {
    class History;

public:
    /// The longest has 2^31 places: eight years of eight offsets a second.
    static constexpr unsigned lengths = 32;

    /// @param overlap in octaves
    /// @param reach   how many of its lengths a window knows of those before; a power of two
    DyadicWindows(unsigned overlap, std::size_t reach) {
        for (unsigned octave = 0; octave < lengths; ++octave) {
            histories_.emplace_back(octave, overlap, reach);
        }
    }

    /// A window that ends at the last place.
    class Window {
    public:
        Window(const History& history, const Part& part, std::int64_t run)
            : history_(history), part_(part), run_(run) {}

        unsigned octave() const { return history_.octave(); }
        std::int64_t length() const { return history_.length(); }
        const Part& part() const { return part_; }

        /// Whether windows of its length end at each place.
        bool isEverywhere() const { return history_.takes(1); }

        /// The window of the same length that ended so many places ago; null if it would begin
        /// before the first place.
        /// @param places 1 to the reach; where windows do not end at each place, lengths.
        const Part* ago(std::int64_t places) const {
            return run_ - places < length() ? nullptr : &history_.at(run_ - places);
        }

    private:
        const History& history_;
        const Part& part_;
        std::int64_t run_;
    };

    /// The next place is the first one.
    void begin() { run_ = 0; }

    /// @param visit gets each Window that ends at this place, the shortest first.
    template <typename Visit>
    void add(const Part& part, Visit visit) {
        ++run_;
        Part held = part;
        for (auto& history : histories_) {
            if (run_ < history.length() || !history.takes(run_)) {
                return;
            }
            const Window window(history, held, run_);
            visit(window);
            const auto* before = window.ago(history.length());
            Part longer = held;
            if (before != nullptr) {
                longer.add(*before);
            }
            history.put(run_, held);
            held = longer;
        }
    }

private:
    /// The last windows of one length. A window is known by the number of places until its end.
    class History {
    public:
        History(unsigned octave, unsigned overlap, std::size_t reach)
            : octave_(octave),
              zeros_(octave > overlap ? octave - overlap : 0),
              size_(reach << (octave - zeros_)) {}

        unsigned octave() const { return octave_; }
        std::int64_t length() const { return std::int64_t{1} << octave_; }
        bool takes(std::int64_t run) const { return run >> zeros_ << zeros_ == run; }
        const Part& at(std::int64_t run) const { return parts_[indexOf(run)]; }

        /// Takes the place of the one a reach ago. Memory is taken when the first one comes.
        void put(std::int64_t run, const Part& part) {
            parts_.resize(size_);
            parts_[indexOf(run)] = part;
        }

    private:
        std::size_t indexOf(std::int64_t run) const {
            return static_cast<std::size_t>(run >> zeros_) & (size_ - 1);
        }

        unsigned octave_;
        unsigned zeros_;   ///< windows end where the number of places has so many, in binary
        std::size_t size_; ///< a power of two
        std::vector<Part> parts_;
    };

    std::vector<History> histories_;
    std::int64_t run_ = 0; ///< places since the beginning
};

} // namespace vantelhost
