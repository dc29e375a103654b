// Position of the first element with a given key in one of the model's lists.
//
// The model's lists are plain public vectors, searched by a key field ("the first row with that
// ordinal"). The index answers that question without a linear search and keeps its meaning:
// it is rebuilt whenever the list shrank (or is another list of the same size), or when a
// remembered position no longer holds its key; elements appended since it was built are
// indexed on their own, so lists that grow one element at a time stay linear. Code that changes
// keys in place must call invalidate() (the table operations do).
#pragma once

#include <cstddef>
#include <cstdint>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace vorlan::jdf {

// KeyOf()(element) gives the element's key, or kNoKey for an element that has none (null).
inline constexpr int64_t kNoKey = INT64_MIN;

template <typename E, typename KeyOf>
class PositionIndex {
public:
    static constexpr size_t npos = static_cast<size_t>(-1);

    // Position of the first element whose key equals key, or npos.
    size_t find(const std::vector<E>& list, int32_t key) {
        if (builtSize_ == npos || list.size() < builtSize_ || (list.size() == builtSize_ && list.data() != builtData_))
            rebuild(list);
        else if (list.size() > builtSize_)
            extend(list);
        for (int attempt = 0; attempt < 2; ++attempt) {
            auto it = first_.find(key);
            if (it == first_.end()) return npos;
            size_t pos = it->second;
            if (pos < list.size() && KeyOf()(list[pos]) == key) return pos;
            rebuild(list);  // stale: something changed a key in place
        }
        return npos;
    }
    // True when more than one element carried key when the index was last built.
    bool repeated(int32_t key) const { return repeated_.count(key) != 0; }
    void invalidate() { builtSize_ = npos; }

private:
    void rebuild(const std::vector<E>& list) {
        first_.clear();
        repeated_.clear();
        first_.reserve(list.size());
        builtSize_ = 0;
        extend(list);
    }
    // Indexes the elements from the built size on; earlier positions keep their first place.
    void extend(const std::vector<E>& list) {
        for (size_t i = builtSize_; i < list.size(); ++i) {
            int64_t key = KeyOf()(list[i]);
            if (key == kNoKey) continue;
            if (!first_.emplace(static_cast<int32_t>(key), i).second) repeated_.insert(static_cast<int32_t>(key));
        }
        builtSize_ = list.size();
        builtData_ = list.data();
    }

    std::unordered_map<int32_t, size_t> first_;
    std::unordered_set<int32_t> repeated_;
    size_t builtSize_ = npos;
    const void* builtData_ = nullptr;
};

}  // namespace vorlan::jdf
