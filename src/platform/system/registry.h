// What the process holds, by key: the objects behind handles, views by address, reservations by base.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_REGISTRY_H
#define BASALT_SRC_PLATFORM_SYSTEM_REGISTRY_H

#include <iterator>
#include <map>
#include <mutex>
#include <utility>

#include "src/platform/system/lock.h"

namespace basalt::platform {

// A map whose entries are made in two steps: make_entry() may run out of memory; add(), called after
// everything else that can fail, cannot. Owns no memory while it is empty. Threads: thread-safe.
template <class Key, class Value>
class Registry {
public:
    // An entry outside the registry, empty or with a value in mapped().
    using Entry = typename std::map<Key, Value>::node_type;

    static Entry make_entry(Value value) {
        std::map<Key, Value> single;
        single.emplace(Key{}, std::move(value));
        return single.extract(single.begin());
    }

    // False when the key is taken; the entry stays with the caller then.
    bool add(Key key, Entry& entry) noexcept {
        entry.key() = key;
        const std::lock_guard guard(m_lock);
        auto result = m_entries.insert(std::move(entry));
        entry = std::move(result.node);
        return result.inserted;
    }

    // Removes an entry; empty when there is none.
    Entry take(Key key) noexcept {
        const std::lock_guard guard(m_lock);
        return m_entries.extract(key);
    }

    // A copy of the value, or a default one when there is none.
    Value find(Key key) noexcept {
        const std::lock_guard guard(m_lock);
        const auto found = m_entries.find(key);
        return found != m_entries.end() ? found->second : Value{};
    }

    // The same for the last key up to and including this one.
    Value find_last_up_to(Key key) noexcept {
        const std::lock_guard guard(m_lock);
        const auto after = m_entries.upper_bound(key);
        return after != m_entries.begin() ? std::prev(after)->second : Value{};
    }

    // Calls visit(value) for every entry with the lock held.
    template <class Visit>
    void for_each(Visit visit) noexcept {
        const std::lock_guard guard(m_lock);
        for (auto& [key, value] : m_entries) {
            visit(value);
        }
    }

private:
    Lock m_lock;
    std::map<Key, Value> m_entries;
};

}  // namespace basalt::platform

#endif
