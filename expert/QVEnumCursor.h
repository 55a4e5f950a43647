#ifndef QV_EXPERT_QVENUMCURSOR_H
#define QV_EXPERT_QVENUMCURSOR_H

#include <optional>
#include <type_traits>
#include <utility>

// An enumerator's position in its container.
//
// For a container whose elements never change while it is walked (a list that the
// enumerator owns): an iterator.
template <class Container, class = void>
class QVEnumCursor {
  public:
    void reset(const Container& container) { at_ = container.begin(); }
    bool atEnd(const Container& container) const { return at_ == container.end(); }
    const typename Container::value_type& current(const Container&) const { return *at_; }
    void advance(const Container&) { ++at_; }

  private:
    typename Container::const_iterator at_{};
};

// For an ordered set or map that its owner may change meanwhile (a bag's tags): the key
// last delivered, looked up again at each step, so that no iterator can be left dangling
// by an insertion or a removal. The walk goes on after that key.
template <class Container>
class QVEnumCursor<Container, std::void_t<typename Container::key_compare>> {
  public:
    void reset(const Container&) { last_.reset(); }
    bool atEnd(const Container& container) const { return next(container) == container.end(); }
    const typename Container::value_type& current(const Container& container) const {
        return *next(container);
    }
    void advance(const Container& container) { last_ = keyOf(*next(container)); }

  private:
    using Key = typename Container::key_type;

    typename Container::const_iterator next(const Container& container) const {
        return last_ ? container.upper_bound(*last_) : container.begin();
    }
    static const Key& keyOf(const Key& key) { return key; }
    template <class Value>
    static const Key& keyOf(const std::pair<const Key, Value>& entry) {
        return entry.first;
    }

    std::optional<Key> last_;
};

#endif
