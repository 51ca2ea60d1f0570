// A bounded cache of shared items under UTF-16 keys that evicts the entry used least recently.
// Its capacity is counted in the units an item holds (`item->size()`), not in entries, and whole
// entries are evicted. Every operation takes the cache's own mutex, so two threads may call it;
// items must not change size while cached (the character cache keeps them immutable).
#ifndef WAVEFORM_FONTS_LFU_CACHE_H
#define WAVEFORM_FONTS_LFU_CACHE_H

#include <algorithm>
#include <cstdint>
#include <mutex>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

namespace vesk::plugin::lib {

template <typename T>
class LFUCache {
 public:
  explicit LFUCache(int32_t capacity) : capacity_(capacity) {}
  LFUCache(const LFUCache&) = delete;
  LFUCache& operator=(const LFUCache&) = delete;

  // On a hit sets `item`, makes the entry the most recently used and returns true.
  bool get(const std::u16string& key, T& item) {
    std::lock_guard<std::mutex> lock(mutex_);
    return getLocked(key, item);
  }

  // Stores `item` under `key` as the most recently used entry, replacing any entry already
  // there, after evicting the least recently used entries it needs room for. Returns false and
  // stores nothing when the item alone holds more than the capacity.
  bool put(const std::u16string& key, T item) {
    std::lock_guard<std::mutex> lock(mutex_);
    return putLocked(key, std::move(item));
  }

  // Under one lock: `update(current)` with a pointer to the cached item (null when none) gives
  // the item to keep under `key`; it is stored like put unless it is the cached item itself,
  // which is only made the most recently used. Returns the item `update` gave.
  template <typename Update>
  T update(const std::u16string& key, Update update) {
    std::lock_guard<std::mutex> lock(mutex_);
    T current;
    const bool cached = getLocked(key, current);
    T next = update(cached ? &current : nullptr);
    if (!cached || next != current) {
      putLocked(key, next);
    }
    return next;
  }

  // Drops least recently used entries until count() + extra <= capacity().
  void evict(int32_t extra) {
    std::lock_guard<std::mutex> lock(mutex_);
    evictLocked(extra);
  }

  int32_t capacity() const { return capacity_; }
  // Units held, summed over the cached items.
  int32_t count() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return count_;
  }
  // The cached keys, least recently used first.
  std::vector<std::u16string> keys() const {
    std::lock_guard<std::mutex> lock(mutex_);
    std::vector<std::u16string> keys;
    for (const auto& pair : recency_) {
      keys.push_back(pair.first);
    }
    return keys;
  }

 private:
  static int32_t units(const T& item) { return static_cast<int32_t>(item->size()); }

  bool getLocked(const std::u16string& key, T& item) {
    const auto found = entries_.find(key);
    if (found == entries_.end()) {
      return false;
    }
    item = found->second;
    const auto pair = findPair(key);
    if (pair != recency_.end()) {
      std::rotate(pair, pair + 1, recency_.end());
    }
    return true;
  }

  bool putLocked(const std::u16string& key, T item) {
    const int32_t n = units(item);
    if (n > capacity_) {
      return false;
    }
    const auto old = findPair(key);
    if (old != recency_.end()) {
      count_ -= units(old->second);
      recency_.erase(old);
      entries_.erase(key);
    }
    evictLocked(n);
    count_ += n;
    entries_[key] = item;
    recency_.emplace_back(key, std::move(item));
    return true;
  }

  void evictLocked(int32_t extra) {
    while (count_ + extra > capacity_ && !recency_.empty()) {
      count_ -= units(recency_.front().second);
      entries_.erase(recency_.front().first);
      recency_.erase(recency_.begin());
    }
  }

  typename std::vector<std::pair<std::u16string, T>>::iterator findPair(const std::u16string& key) {
    return std::find_if(recency_.begin(), recency_.end(),
                        [&](const auto& pair) { return pair.first == key; });
  }

  mutable std::mutex mutex_;
  std::unordered_map<std::u16string, T> entries_;
  std::vector<std::pair<std::u16string, T>> recency_;  // each entry once, least recent first
  const int32_t capacity_;
  int32_t count_ = 0;
};

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_FONTS_LFU_CACHE_H
