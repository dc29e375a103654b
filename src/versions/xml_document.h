// The XML document behind the tree's handle: parser, building state and the memory of its nodes.
// Private to the tree's own files.
#pragma once

#include <expat.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <new>
#include <vector>

#include "versions/xml_tree.h"

namespace vorlan::xmltree {

// Bump allocator for nodes, attributes and texts: one document makes many small records that
// all die together, so they are carved from large blocks and freed at once.
class Arena {
public:
    void* allocate(size_t bytes) {
        bytes = (bytes + alignof(std::max_align_t) - 1) & ~(alignof(std::max_align_t) - 1);
        if (bytes > left_) {
            if (bytes > kBlockSize / 4) return newBlock(bytes);  // large item: a block of its own
            current_ = static_cast<std::byte*>(newBlock(kBlockSize));
            left_ = kBlockSize;
        }
        void* result = current_;
        current_ += bytes;
        left_ -= bytes;
        return result;
    }

    template <typename T>
    T* make() {
        return new (allocate(sizeof(T))) T{};
    }

private:
    static constexpr size_t kBlockSize = 64 * 1024;

    void* newBlock(size_t bytes) {
        blocks_.emplace_back(new std::byte[bytes]);
        return blocks_.back().get();
    }

    std::vector<std::unique_ptr<std::byte[]>> blocks_;
    std::byte* current_ = nullptr;
    size_t left_ = 0;
};

// The sibling chain being built at one depth.
struct Level {
    _kvXmlNode* first = nullptr;
    _kvXmlNode* last = nullptr;
};

}  // namespace vorlan::xmltree

struct _kvXmlDocument {
    XML_Parser parser = nullptr;
    int32_t lastStartedDepth = -1;                // depth of the element started most recently
    int32_t depth = 0;                            // current depth
    std::vector<vorlan::xmltree::Level> levels;   // one per depth
    vorlan::xmltree::Arena arena;
    uint64_t bytesFed = 0;
    bool failed = false;
    bool outOfMemory = false;
};
