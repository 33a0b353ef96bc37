// What the stand-in host keeps per session handle: an object made on first use of the handle
// and dropped at the end of its session, so that ended sessions cost nothing.
#pragma once

#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <vector>

namespace OrvSim {

// T is made with new T(handle). Holding the pointer get() returns keeps a dropped object
// alive: a call that began before the session's end completes on it.
template <class T>
class SessionRegistry {
public:
    std::shared_ptr<T> get(uint32_t handle) {
        // Most calls come for the session of the previous call on the same thread.
        struct Last {
            const SessionRegistry* registry = nullptr;
            std::shared_ptr<T> item;
            uint32_t handle = 0;
            uint64_t dropped = 0;
        };
        thread_local Last last;
        if (last.registry == this && last.item != nullptr && last.handle == handle &&
            last.dropped == dropped_.load(std::memory_order_acquire))
            return last.item;
        std::lock_guard<std::mutex> guard(mutex_);
        std::shared_ptr<T>& slot = items_[handle];
        if (!slot) slot.reset(new T(handle));
        last = Last{this, slot, handle, dropped_.load(std::memory_order_relaxed)};
        return slot;
    }

    // Takes the session's object out; null when there is none.
    std::shared_ptr<T> drop(uint32_t handle) {
        std::lock_guard<std::mutex> guard(mutex_);
        auto it = items_.find(handle);
        if (it == items_.end()) return nullptr;
        std::shared_ptr<T> item = std::move(it->second);
        items_.erase(it);
        dropped_.fetch_add(1, std::memory_order_release);
        return item;
    }

    // The handles that have an object, ascending.
    std::vector<uint32_t> handles() {
        std::lock_guard<std::mutex> guard(mutex_);
        std::vector<uint32_t> result;
        result.reserve(items_.size());
        for (const auto& entry : items_) result.push_back(entry.first);
        return result;
    }

private:
    std::mutex mutex_;
    std::map<uint32_t, std::shared_ptr<T>> items_;
    std::atomic<uint64_t> dropped_{0};
};

}  // namespace OrvSim
