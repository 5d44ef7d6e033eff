#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace ovrin_bench {

/// A small generator of random numbers (splitmix64). Integer arithmetic alone, so that a seed means the same
/// scene on every machine.
class SceneRandom {
public:
    explicit SceneRandom(std::uint64_t seed) : m_State(seed) {}

    std::uint64_t Next() {
        std::uint64_t z = (m_State += 0x9E3779B97F4A7C15u);
        z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9u;
        z = (z ^ (z >> 27)) * 0x94D049BB133111EBu;
        return z ^ (z >> 31);
    }

    /// A number from 0 to `count` - 1; `count` must not be 0.
    std::uint64_t Below(std::uint64_t count) { return Next() % count; }

    /// True in `share` of a million cases.
    bool Chance(std::uint64_t share) { return Below(1000000) < share; }

    template <class T, std::size_t N> const T& Pick(const T (&choices)[N]) { return choices[Below(N)]; }
    template <class T> const T& Pick(const std::vector<T>& choices) { return choices[Below(choices.size())]; }

private:
    std::uint64_t m_State;
};

} // namespace ovrin_bench
