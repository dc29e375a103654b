// A run's page list, shared between copies until one of them changes it.
#include <algorithm>

#include "vorlan/LD_Records.h"

// The shared storage; `sorted` remembers whether the pages are in ascending order (unknown until
// asked), which holds as long as the storage is shared, since shared storage never changes.
struct LD_PageList::Pages {
    std::vector<int32_t> pages;
    enum class Order { Unknown, Sorted, Unsorted } order = Order::Unknown;
};

LD_PageList::LD_PageList(std::vector<int32_t> pages) {
    if (!pages.empty()) shared_ = std::make_shared<Pages>(Pages{std::move(pages)});
}

const std::vector<int32_t>& LD_PageList::values() const {
    static const std::vector<int32_t> none;  // immutable: shared safely by every thread
    return shared_ ? shared_->pages : none;
}

std::vector<int32_t>& LD_PageList::own() {
    if (!shared_) shared_ = std::make_shared<Pages>();
    else if (shared_.use_count() > 1) shared_ = std::make_shared<Pages>(Pages{shared_->pages});
    shared_->order = Pages::Order::Unknown;
    return shared_->pages;
}

void LD_PageList::push_back(int32_t page) { own().push_back(page); }

void LD_PageList::sort() {
    if (!shared_) return;
    if (shared_->order == Pages::Order::Unknown)
        shared_->order = std::is_sorted(shared_->pages.begin(), shared_->pages.end()) ? Pages::Order::Sorted
                                                                                      : Pages::Order::Unsorted;
    if (shared_->order == Pages::Order::Sorted) return;
    std::vector<int32_t>& pages = own();
    std::sort(pages.begin(), pages.end());
    shared_->order = Pages::Order::Sorted;
}

bool LD_PageList::operator==(const LD_PageList& other) const {
    return shared_ == other.shared_ || values() == other.values();
}
