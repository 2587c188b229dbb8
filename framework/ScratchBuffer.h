// A zero-filled working buffer: local up to a limit, on the heap above it.
#pragma once

#include <cstddef>
#include <memory>
#include <new>

/// Lives on the stack of one call. Never throws.
template <int LocalBytes>
class ScratchBuffer {
  public:
    /// @param size  Bytes; 0 and negative sizes give the local buffer.
    explicit ScratchBuffer(int size) {
        if (size <= LocalBytes) return;
        heap_.reset(new (std::nothrow) unsigned char[static_cast<std::size_t>(size)]());
        data_ = heap_.get();
    }
    ScratchBuffer(const ScratchBuffer&) = delete;
    ScratchBuffer& operator=(const ScratchBuffer&) = delete;

    /// @return the bytes, or null when there was no memory for them.
    unsigned char* data() { return data_; }

  private:
    unsigned char local_[LocalBytes] = {};
    std::unique_ptr<unsigned char[]> heap_;
    unsigned char* data_ = local_;
};
