// The tags that a protocol owns, in the order in which they were made.
#pragma once

#include <list>
#include <map>

#include "platform/ITag.h"

/// A list with an index, so that taking a tag out does not walk past the others. It does not
/// destroy what it lists. Threads: none of its own.
class TagList {
  public:
    TagList() = default;
    TagList(const TagList&) = delete;
    TagList& operator=(const TagList&) = delete;

    /// Appends. Throws std::bad_alloc, with the list as before, when memory is short.
    void add(ITag* tag);
    /// Removes every entry equal to `tag`; there may be none. Takes no memory.
    void remove(const ITag* tag) noexcept;
    void clear() noexcept;

    std::list<ITag*>::const_iterator begin() const { return tags_.begin(); }
    std::list<ITag*>::const_iterator end() const { return tags_.end(); }

  private:
    std::list<ITag*> tags_;
    std::multimap<const ITag*, std::list<ITag*>::const_iterator> places_;
};
