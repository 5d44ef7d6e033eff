#include "Values/ScalarTable.h"

#include "Values/Arena.h"
#include "Values/YAMLError.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <memory>
#include <new>

namespace ovrin_yaml {

namespace {

constexpr unsigned kTagShift = 48;
constexpr std::uint64_t kAddressMask = (std::uint64_t{1} << kTagShift) - 1;

/// The top bits of a hash choose the shard and the place, so the tag comes from the low ones.
std::uint64_t Tag(std::uint32_t hash) {
    return hash & 0xffffu;
}

std::uint64_t Pack(YAMLScalar* scalar) {
    return Tag(scalar->m_Hash) << kTagShift | reinterpret_cast<std::uint64_t>(scalar);
}

YAMLScalar* Unpack(std::uint64_t slot) {
    return reinterpret_cast<YAMLScalar*>(slot & kAddressMask);
}

} // namespace

// There before any code runs, and never destroyed: scalars are used until the process ends.
constinit ScalarTable ScalarTable::s_Instance;

const ScalarTable::Slot* ScalarTable::SlotOf(std::uint32_t hash) const {
    const Slots* slots = m_Shards[hash >> (32 - kShardBits)].slots.load(std::memory_order_acquire);
    return slots ? slots->SlotOf(hash) : nullptr;
}

void ScalarTable::PrefetchSlot(std::uint32_t hash) const {
    __builtin_prefetch(SlotOf(hash));
}

void ScalarTable::PrefetchScalar(std::uint32_t hash) const {
    const Slot* slot = SlotOf(hash);
    const std::uint64_t held = slot ? slot->load(std::memory_order_relaxed) : 0;
    if (held && held >> kTagShift == Tag(hash)) __builtin_prefetch(Unpack(held));
}

void ScalarTable::Reserve(std::size_t count) {
    // No shard gets exactly its share: with five standard deviations more hardly one has to grow.
    const std::size_t share = count / m_Shards.size() + 1;
    const auto most = share + 5 * static_cast<std::size_t>(std::sqrt(static_cast<double>(share)));
    const std::size_t capacity = most * 3 / 2 + 1;
    if (capacity <= kFirstCapacity) return;
    const auto isSmaller = [capacity](const Shard& shard) {
        const Slots* slots = shard.slots.load(std::memory_order_relaxed);
        return !slots || slots->capacity < capacity;
    };
    // Several files may be on their way into the table at once: one piece of memory is enough for them.
    const std::lock_guard reserveLock(m_ReserveLock);
    if (std::none_of(m_Shards.begin(), m_Shards.end(), isSmaller)) return;
    // One piece for all shards is big enough for huge pages.
    char* memory = static_cast<char*>(AllocateZeroed(m_Shards.size() * Slots::BytesFor(capacity)));
    for (Shard& shard : m_Shards) {
        const std::lock_guard lock(shard.lock);
        if (isSmaller(shard)) Grow(shard, capacity, memory);
        memory += Slots::BytesFor(capacity);
    }
}

// Part of the way of every text.
[[gnu::always_inline]] inline ScalarTable::Place ScalarTable::Find(const Slots& slots, std::string_view text,
                                                                   std::uint32_t hash) {
    Slot* position = slots.SlotOf(hash);
    std::size_t alike = 0;
    for (const Slot* end = position + kMostProbes; position != end; ++position) {
        const std::uint64_t slot = position->load(std::memory_order_acquire);
        if (!slot) return {nullptr, position};
        if (slot >> kTagShift != Tag(hash)) continue;
        YAMLScalar* scalar = Unpack(slot);
        if (scalar->m_Hash == hash && scalar->Value() == text) return {scalar, nullptr};
        if (++alike == kMostAlike) break;
    }
    return {nullptr, nullptr};
}

YAMLScalar* ScalarTable::Intern(std::string_view text, std::uint32_t line) {
    if (text.size() > UINT32_MAX) throw YAMLError("Scalar is too long");
    return Intern(text, HashOf(text), line);
}

YAMLScalar* ScalarTable::Intern(std::string_view text, std::uint32_t hash, std::uint32_t line) {
    Shard& shard = ShardOf(hash);
    const Slots* slots = shard.slots.load(std::memory_order_acquire);
    const Place place = slots ? Find(*slots, text, hash) : Place{};
    return place.scalar ? place.scalar : InternNew(shard, {text, hash, line}, slots, place.slot);
}

/// `empty` was the text's place in `seen`, a moment ago.
YAMLScalar* ScalarTable::InternNew(Shard& shard, const NewScalar& wanted, const Slots* seen, Slot* empty) {
    const std::lock_guard lock(shard.lock);
    const Slots* slots = shard.slots.load(std::memory_order_relaxed);
    const std::size_t capacity = slots ? slots->capacity : 0;
    if (3 * (shard.count + 1) > 2 * capacity) {
        const std::size_t grown = std::max(2 * capacity, kFirstCapacity);
        Grow(shard, grown, AllocateZeroed(Slots::BytesFor(grown)));
        slots = shard.slots.load(std::memory_order_relaxed);
    }
    if (slots != seen || (empty && empty->load(std::memory_order_relaxed))) {
        // Another thread may have made the scalar meanwhile.
        const Place place = Find(*slots, wanted.text, wanted.hash);
        if (place.scalar) return place.scalar;
        empty = place.slot;
    }
    if (!empty) return InternInOverflow(shard, wanted);
    YAMLScalar* scalar = Make(wanted);
    empty->store(Pack(scalar), std::memory_order_release);
    ++shard.count;
    return scalar;
}

YAMLScalar* ScalarTable::InternInOverflow(Shard& shard, const NewScalar& wanted) {
    const auto found = shard.overflow->find(wanted.text);
    return found != shard.overflow->end() ? *found : *shard.overflow->insert(Make(wanted)).first;
}

static_assert(sizeof(YAMLScalar) == 16, "there are millions of them");

YAMLScalar* ScalarTable::Make(const NewScalar& wanted) {
    const std::string_view text = wanted.text;
    char* memory = static_cast<char*>(ArenaAllocate(sizeof(YAMLScalar) + text.size()));
    if (!text.empty()) std::memcpy(memory + sizeof(YAMLScalar), text.data(), text.size());
    return new (memory) YAMLScalar(static_cast<std::uint32_t>(text.size()), wanted.hash, wanted.line);
}

void ScalarTable::Grow(Shard& shard, std::size_t capacity, void* memory) {
    const auto* grown = new (ArenaAllocate(sizeof(Slots))) Slots{capacity, static_cast<Slot*>(memory)};
    auto overflow = std::make_unique<Overflow>();
    std::size_t count = 0;
    const auto place = [&](YAMLScalar* scalar) {
        if (Slot* slot = Find(*grown, scalar->Value(), scalar->m_Hash).slot) {
            slot->store(Pack(scalar), std::memory_order_relaxed);
            ++count;
        } else {
            overflow->insert(scalar);
        }
    };
    if (const Slots* old = shard.slots.load(std::memory_order_relaxed))
        for (std::size_t i = 0; i < old->capacity + kMostProbes; ++i)
            if (const std::uint64_t slot = old->entries[i].load(std::memory_order_relaxed))
                place(Unpack(slot));
    if (shard.overflow) std::for_each(shard.overflow->begin(), shard.overflow->end(), place);
    // The old set was asked under the lock only.
    delete shard.overflow;
    shard.overflow = overflow.release();
    shard.count = count;
    shard.slots.store(grown, std::memory_order_release);
}

} // namespace ovrin_yaml
