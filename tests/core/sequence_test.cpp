// Sequences against a plain vector, in random operations; and the rules of their blocks. Arrays that
// are permutations, as those that become sequences are.
#include "core/sequence/sequence.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>
#include <random>
#include <utility>
#include <vector>

#include "core/base/permutation.h"
#include "core/sequence/sequence_search.h"

namespace {

using namespace tevpf;
using Items = std::vector<std::int32_t>;

// The first rule that the blocks break; null when they are in order. key_of gives an item's key.
template <class KeyOf>
const char* broken_rule(const SequenceBlocks& blocks, KeyOf key_of) {
  using Key = decltype(key_of(0));
  std::int32_t position = 0, borrowed = 0, borrowed_keys = 0;
  std::vector<std::int32_t> ids;
  for (std::int32_t g = 0; g < blocks.num_groups; ++g) {
    const SequenceGroup& group = *blocks.groups[g];
    if (group.number != g || blocks.starts[g] != position) return "group's number or start";
    if (group.count < 1 || group.count > kGroupRoom) return "blocks of a group";
    for (std::int32_t b = 0; b < group.count; ++b) {
      const SequenceBlock& block = group.block[b];
      const SequenceChunk chunk = group.chunk(b);
      if (blocks.starts[g] + group.start[b] != position) return "start of a block";
      if (chunk.count < (blocks.count > 0) || chunk.count > kBlockRoom) return "size of a block";
      if (chunk.count > 0 && chunk[chunk.count - 1] != group.last[b]) return "last item";
      if (blocks.homes[group.id[b]].group != &group) return "home";
      ids.push_back(group.id[b]);
      if (block.items == nullptr && block.own) return "run with a piece";
      borrowed += block.items != nullptr && !block.own;
      borrowed_keys += block.keys != nullptr && !block.own_keys;
      for (std::int32_t i = 0; i < chunk.count; ++i) {
        if (blocks.map != nullptr && blocks.map[chunk[i]] != group.id[b]) return "map";
        if (block.keys != nullptr && static_cast<Key*>(block.keys)[i] != key_of(chunk[i]))
          return "key";
      }
      Key last;
      std::memcpy(&last, &group.last_key[b], sizeof last);
      if (chunk.count > 0 && group.has_last_keys && last != key_of(group.last[b]))
        return "last key";
      position += chunk.count;
    }
    Key top;
    std::memcpy(&top, &blocks.top_keys[g], sizeof top);
    if (blocks.has_top_keys && blocks.count > 0 && top != key_of(group.last[group.count - 1]))
      return "key of a group's last item";
    for (std::int32_t b = group.count + 1; b <= kGroupRoom; ++b)
      if (group.start[b] != SequenceGroup::kNoStart) return "start of no block";
  }
  for (std::int32_t id = blocks.free_id; id >= 0; id = blocks.homes[id].next_free)
    ids.push_back(id);
  std::sort(ids.begin(), ids.end());
  for (std::size_t i = 0; i < ids.size(); ++i)
    if (ids[i] != static_cast<std::int32_t>(i)) return "id";
  if (static_cast<std::int32_t>(ids.size()) != blocks.num_ids) return "lost id";
  const auto mapped = std::count_if(blocks.map, blocks.map + blocks.map_room,
                                    [](std::int32_t id) { return id >= 0; });
  if (blocks.map != nullptr && mapped != blocks.count) return "map of no item";
  if (borrowed != blocks.borrowed || (borrowed > 0) != (blocks.flat != nullptr)) return "borrowed";
  if (borrowed_keys != blocks.borrowed_keys || (borrowed_keys > 0) != (blocks.flat_keys != nullptr))
    return "borrowed keys";
  return position == blocks.count ? nullptr : "count";
}

// Pieces of the pools, taken and spare: never fewer than before.
std::int64_t pieces(const SequenceBlocks& blocks) {
  std::int64_t all = blocks.num_groups;
  for (const Pool* pool : {&blocks.item_pieces, &blocks.group_pieces, &blocks.key_pieces})
    all += pool->spare;
  for (std::int32_t g = 0; g < blocks.num_groups; ++g)
    for (std::int32_t b = 0; b < blocks.groups[g]->count; ++b)
      all += blocks.groups[g]->block[b].own + blocks.groups[g]->block[b].own_keys;
  return all;
}

// A sequence, what it must hold, and a source of items. In order of value, items are inserted where a
// search leads, else anywhere.
template <class Key>
class Model {
 public:
  Model(unsigned seed, bool by_value) : random_(seed), by_value_(by_value) {}
  Model(const Model&) = delete;
  ~Model() { sequence_.clear(); }

  void step() {
    switch (const int choice = pick(100); choice) {
      case 0:
        while (!sequence_.flatten(count(), count() + pick(3))) compare();
        pieces_ = 0;
        break;
      case 1:
      case 2:
        restart(choice == 1);
        break;
      case 3:
        change_value();
        break;
      default:
        if (pick(60) == 0) growing_ = !growing_;
        if (choice < 15 && count() > 0) {
          move();
        } else if (count() == 0 || pick(10) < (growing_ ? 7 : 3)) {
          insert();
        } else {
          erase();
        }
    }
    compare();
  }

  void compare() {
    if (sequence_.blocks != nullptr) {
      ASSERT_STREQ(broken_rule(*sequence_.blocks, key_of()), nullptr);
      ASSERT_EQ(sequence_.blocks->count, count());
      ASSERT_GE(pieces(*sequence_.blocks), pieces_);
      pieces_ = pieces(*sequence_.blocks);
      ++in_blocks;
    }
    ASSERT_TRUE(sequence_.items == nullptr || sequence_.room >= count());
    Items read;
    for (std::int32_t i = 0; i < count(); ++i) read.push_back(sequence_.at(i));
    ASSERT_EQ(read, items_);
    std::fill(read.begin(), read.end(), -1);
    sequence_.copy_items(count(), read.data());
    ASSERT_EQ(read, items_);
    for (const std::int32_t unknown : {-1, static_cast<std::int32_t>(values_.size()), 1 << 20})
      ASSERT_EQ(sequence_.position_of(count(), unknown), -1);
    if (items_.empty()) return;
    const std::int32_t some = pick(count());
    const std::int32_t item = items_[static_cast<std::size_t>(some)];
    ASSERT_EQ(sequence_.at(some), item);
    ASSERT_EQ(key_at(sequence_, some, key_of()), key_of()(item));
    const SequencePlace found = sequence_.place_of(count(), item), there = sequence_.place_at(some);
    ASSERT_TRUE(found.position == some && found.group == there.group &&
                found.block == there.block && found.offset == there.offset);
    const SequenceChunk chunk = sequence_.chunk_at(count(), some);
    ASSERT_LE(chunk.count, count() - some);
    ASSERT_EQ(chunk[chunk.count - 1], items_[static_cast<std::size_t>(some + chunk.count - 1)]);
    search_without_order();
  }

  int in_blocks = 0;  // comparisons made in that state
  int adoptions = 0;

 private:
  std::int32_t count() const { return static_cast<std::int32_t>(items_.size()); }
  int pick(int below) { return static_cast<int>(random_() % static_cast<unsigned>(below)); }
  auto key_of() {
    return [this](std::int32_t item) { return values_[static_cast<std::size_t>(item)]; };
  }

  // Both searches must find the same place as one through the vector.
  SequencePlace search(Key value) {
    const auto expected =
        std::lower_bound(items_.begin(), items_.end(), value,
                         [&](std::int32_t item, Key wanted) { return key_of()(item) < wanted; });
    const SequencePlace by_item =
        search_items(sequence_, count(), [&](std::int32_t item) { return key_of()(item) < value; });
    const SequencePlace by_key = search_keys(sequence_, count(), key_of(),
                                             [&](Key key, std::int32_t) { return key < value; });
    EXPECT_EQ(by_item.position, expected - items_.begin());
    EXPECT_EQ(by_key.position, by_item.position);
    return by_key;
  }

  // Whatever the answers, a search ends at an item or at the end of all.
  void search_without_order() {
    const std::int32_t wanted = pick(3);
    const auto is_less = [&](std::int32_t item) { return (item * 7 + wanted) % 3 != 0; };
    for (const SequencePlace& place :
         {search_items(sequence_, count(), is_less),
          search_keys(sequence_, count(), key_of(),
                      [&](Key, std::int32_t item) { return is_less(item); })}) {
      ASSERT_TRUE(place.position >= 0 && place.position <= count());
      if (place.position == count()) continue;
      if (place.group >= 0) {
        const SequenceGroup& group = *sequence_.blocks->groups[place.group];
        ASSERT_LT(place.offset, group.items_of(place.block));
      }
      const std::int32_t item = items_[static_cast<std::size_t>(place.position)];
      ASSERT_EQ(sequence_.at(place), item);
      ASSERT_EQ(key_at(sequence_, place, key_of()), key_of()(item));
    }
  }

  // A sequence that has just become blocks may take over the keys of all items.
  void maybe_adopt_keys(const Sequence& before) {
    if (before.blocks != nullptr || sequence_.blocks == nullptr || pick(2) == 0) return;
    auto keys = new_array<Key>(items_.size());
    for (std::size_t i = 0; keys && i < items_.size(); ++i) keys[i] = key_of()(items_[i]);
    if (keys) sequence_.blocks->adopt_keys(keys.release(), sizeof(Key));
    ++adoptions;
  }

  // For changes at the end.
  void expect_same_state(const Sequence& before) const {
    EXPECT_EQ(sequence_.is_identity(), before.is_identity());
    EXPECT_EQ(sequence_.blocks, before.blocks);
  }

  SequencePlace some_place() {
    const int kind = pick(8);
    const std::int32_t position = kind == 0 ? 0 : kind < 3 ? count() : pick(count() + 1);
    return pick(2) != 0 ? sequence_.place_at(position) : SequencePlace{position};
  }

  void insert() {
    const bool fresh = free_.empty() || pick(4) == 0;
    const std::int32_t item = fresh ? static_cast<std::int32_t>(values_.size()) : free_.back();
    const Key value = static_cast<Key>(pick(50) - 25);
    SequencePlace place = by_value_ ? search(value) : some_place();
    const Sequence before = sequence_;
    while (!sequence_.make_ready_to_insert(count(), place.position, item)) compare();
    maybe_adopt_keys(before);
    if (place.position == count() && (!before.is_identity() || item == count()))
      expect_same_state(before);
    if (fresh) {
      values_.push_back(value);
    } else {
      values_[static_cast<std::size_t>(item)] = value;
      free_.pop_back();
    }
    sequence_.insert(count(), place, item, pick(8) == 0 ? nullptr : &value);
    items_.insert(items_.begin() + place.position, item);
  }

  void erase() {
    const int kind = pick(8);
    const std::int32_t position = kind == 0 ? 0 : kind < 3 ? count() - 1 : pick(count());
    const std::int32_t item = items_[static_cast<std::size_t>(position)];
    const SequencePlace place =
        pick(2) != 0 ? sequence_.place_of(count(), item) : SequencePlace{position};
    const Sequence before = sequence_;
    while (!sequence_.make_ready_to_erase(count(), position)) compare();
    maybe_adopt_keys(before);
    if (position == count() - 1) expect_same_state(before);
    sequence_.erase(count(), place);
    items_.erase(items_.begin() + position);
    free_.push_back(item);
  }

  // Within items of equal value where these are in order.
  void move() {
    const std::int32_t from = pick(count());
    const std::int32_t item = items_[static_cast<std::size_t>(from)];
    std::int32_t to = pick(count());
    if (by_value_) to = std::min(from, search(key_of()(item)).position);
    while (!sequence_.make_ready_to_move(count(), from, to)) compare();
    const Key key = key_of()(item);
    sequence_.move(from, to, &key);
    items_.erase(items_.begin() + from);
    items_.insert(items_.begin() + to, item);
  }

  // In order of value, to that of the item in front.
  void change_value() {
    if (items_.empty() || sequence_.blocks == nullptr) return;
    const auto position = static_cast<std::size_t>(pick(count()));
    const Key value =
        by_value_ ? key_of()(items_[position - (position > 0)]) : static_cast<Key>(pick(1000));
    values_[static_cast<std::size_t>(items_[position])] = value;
    if (pick(4) != 0)
      return sequence_.blocks->set_key({static_cast<std::int32_t>(position)}, &value);
    sequence_.blocks->drop_all_keys();
    pieces_ = 0;
  }

  // From an identity, or an array that comes from elsewhere, made of a copy.
  void restart(bool identity) {
    if (pick(8) != 0) return;
    pieces_ = 0;
    if (identity) {
      sequence_.clear();
      items_.resize(static_cast<std::size_t>(pick(2) != 0 ? pick(80) : pick(8)));
      std::iota(items_.begin(), items_.end(), 0);
      values_.resize(items_.size());
      std::iota(values_.begin(), values_.end(), Key{-30});
      free_.clear();
      return;
    }
    Sequence copy{};
    while (!sequence_.copy_to(count(), copy)) compare();
    const std::int32_t room = copy.room;
    if (Owned<std::int32_t> array = copy.hand_over()) sequence_.adopt(std::move(array), room);
    if (!by_value_) std::shuffle(items_.begin(), items_.end(), random_);
    if (sequence_.items != nullptr) std::copy(items_.begin(), items_.end(), sequence_.items);
    if (sequence_.is_identity()) std::sort(items_.begin(), items_.end());
    copy.clear();
  }

  std::mt19937 random_;
  bool by_value_;
  bool growing_ = true;
  Sequence sequence_{};
  std::int64_t pieces_ = 0;
  Items items_;
  std::vector<Key> values_;
  Items free_;
};

template <class Key>
class SequenceTest : public testing::Test {};
using Keys = testing::Types<std::int16_t, std::int32_t, double>;
TYPED_TEST_SUITE(SequenceTest, Keys);

TYPED_TEST(SequenceTest, HoldsWhatAVectorHolds) {
  for (const bool by_value : {false, true}) {
    SCOPED_TRACE(by_value);
    Model<TypeParam> model(1, by_value);
    for (int i = 0; i < 8'000 && !this->HasFailure(); ++i) {
      SCOPED_TRACE(i);
      model.step();
    }
    EXPECT_GT(model.in_blocks, 4'000);
    EXPECT_GT(model.adoptions, 20);
  }
}

// Each request for memory fails once; what cannot go on without is tried again.
TYPED_TEST(SequenceTest, StaysTheSameWhereMemoryRunsOut) {
  for (const bool by_value : {false, true}) {
    bool failed = true;
    for (int n = 0; failed && !this->HasFailure(); ++n) {
      SCOPED_TRACE(n);
      Model<TypeParam> model(2, by_value);
      heap_fail_at(n);
      for (int i = 0; i < 250 && !this->HasFailure(); ++i) model.step();
      failed = heap_fail_off();
    }
  }
}

// Whichever number is replaced, and by whichever.
TEST(PermutationTest, HasEveryNumberOnce) {
  std::mt19937 random(3);
  for (const std::int32_t count : {0, 1, 2, 63, 64, 65, 200}) {
    SCOPED_TRACE(count);
    Items items(static_cast<std::size_t>(count));
    std::iota(items.begin(), items.end(), 0);
    std::shuffle(items.begin(), items.end(), random);
    EXPECT_EQ(is_permutation(items.data(), count), true);
    for (std::int32_t& item : items) {
      for (const std::int32_t other : {0, count / 2, count - 1, count, -1, INT32_MIN, INT32_MAX}) {
        const std::int32_t before = std::exchange(item, other);
        EXPECT_EQ(is_permutation(items.data(), count), before == other) << before << ' ' << other;
        item = before;
      }
    }
  }
}

}  // namespace
