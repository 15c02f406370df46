// companions/system/tables.cpp -- growable tables (yutini, yutwri, yutrea, yutinf, yutmnc,
// yuttab, yutcop, yutend): process-wide tables of fixed-size entries named by handles, their
// storage addressed as an index relative to dynar, capacity growing geometrically. One mutex
// guards the registry and every table's contents; accounting and fault injection are per thread.
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <mutex>
#include <vector>

#include "companions/data/data_api.h"
#include "companions/system/system_api.h"

namespace {

constexpr std::int32_t kErrBadArg = 4712;  // bad size, count, entry range, selector or handle
constexpr std::int32_t kErrNoMemory = 36;  // storage refused (too large, no memory, injection)
constexpr std::int64_t kMaxBytes = std::int64_t{1} << 40;  // largest storage of one table
constexpr std::int64_t kMinCapacityBytes = 64;             // first allocation, at least

using Counter = std::shared_ptr<std::atomic<std::int64_t>>;

struct Table {
  std::int64_t esize = 0;         // entry size in bytes, >= 1
  std::int64_t entries = 0;       // current number of entries
  std::int64_t capacity = 0;      // entries the storage holds, >= entries
  unsigned char* data = nullptr;  // malloc'd: 16-byte aligned, like dynar
  Counter owner;                  // the creating thread's live count (may outlive the thread)
};

// Registry: a handle names slot (handle - 1) mod 2^20 with generation (handle - 1) / 2^20, so
// a lookup is an index and a released handle stays unknown until its slot has been reused
// 2048 times. At most 2^20 tables live at once.
constexpr std::int32_t kSlotBits = 20;
constexpr std::int32_t kMaxSlots = std::int32_t{1} << kSlotBits;
constexpr std::int32_t kGenerations = std::int32_t{1} << (31 - kSlotBits);

struct Slot {
  Table table;
  std::int32_t generation = 0;
  bool live = false;
};

std::mutex s_mutex;  // guards s_slots, s_free and the contents of every table
std::vector<Slot> s_slots;
std::vector<std::int32_t> s_free;  // released slots, reused last in, first out
std::atomic<std::int64_t> s_live{0};

// Per-thread accounting: the live count is shared with the thread's tables, since another
// thread may release them after this one has ended.
struct ThreadAccount {
  Counter live = std::make_shared<std::atomic<std::int64_t>>(0);
};
thread_local ThreadAccount s_account;

// Per-thread fault injection, constant-initialised (no initialisation guard on the hot path).
struct Injection {
  std::int32_t pass = 0;    // calls that may allocate to let through before refusing
  std::int32_t refuse = 0;  // calls that may allocate still to be refused after those
};
thread_local Injection s_injection;

// Fault injection: true when this call (one that may allocate) is to be refused.
bool injected_refusal() {
  Injection& in = s_injection;
  if (in.refuse <= 0) return false;
  if (in.pass > 0) {
    --in.pass;
    return false;
  }
  --in.refuse;
  return true;
}

std::int32_t fail(std::int32_t* ierr, std::int32_t code) {
  *ierr = code;
  return 1;
}

// The table of a handle, or nullptr. Caller holds s_mutex.
Table* find(std::int32_t handle) {
  if (handle < 1) return nullptr;
  const std::int32_t slot = (handle - 1) & (kMaxSlots - 1);
  const std::int32_t generation = (handle - 1) >> kSlotBits;
  if (slot >= static_cast<std::int32_t>(s_slots.size())) return nullptr;
  Slot& s = s_slots[static_cast<std::size_t>(slot)];
  return s.live && s.generation == generation ? &s.table : nullptr;
}

// Makes room for `needed` entries: capacity grows to the larger of needed and twice the old
// capacity, so appending one entry at a time costs amortised constant time. New bytes beyond
// the old capacity are not initialised here. Caller holds s_mutex. False when refused.
bool reserve(Table& t, std::int64_t needed) {
  if (needed <= t.capacity) return true;
  if (needed > kMaxBytes / t.esize) return false;
  std::int64_t cap = t.capacity * 2;
  if (cap < needed) cap = needed;
  if (cap > kMaxBytes / t.esize) cap = kMaxBytes / t.esize;
  void* grown = std::realloc(t.data, static_cast<std::size_t>(cap * t.esize));
  if (grown == nullptr) return false;
  t.data = static_cast<unsigned char*>(grown);
  t.capacity = cap;
  return true;
}

// Sets the number of entries; entries added are zero-filled. Caller holds s_mutex.
bool resize(Table& t, std::int64_t entries) {
  if (!reserve(t, entries)) return false;
  if (entries > t.entries) {
    std::memset(t.data + t.entries * t.esize, 0,
                static_cast<std::size_t>((entries - t.entries) * t.esize));
  }
  t.entries = entries;
  return true;
}

// Registers a new table of `entries` zero-filled entries of `esize` bytes. Caller holds
// s_mutex. Returns the handle, or 0 when the storage was refused.
std::int32_t create(std::int64_t esize, std::int64_t entries) {
  if (entries > kMaxBytes / esize) return 0;
  Table t;
  t.esize = esize;
  const std::int64_t min_cap = kMinCapacityBytes / esize;  // 0 for entries above 64 bytes
  t.capacity = entries < min_cap ? min_cap : entries;
  // Never a zero-byte request: the storage always has an address, even when empty.
  const std::int64_t bytes = t.capacity * esize;
  t.data =
      static_cast<unsigned char*>(std::malloc(static_cast<std::size_t>(bytes < 16 ? 16 : bytes)));
  if (t.data == nullptr) return 0;
  std::memset(t.data, 0, static_cast<std::size_t>(entries * esize));
  t.entries = entries;
  t.owner = s_account.live;
  std::int32_t slot;
  if (!s_free.empty()) {
    slot = s_free.back();
    s_free.pop_back();
    Slot& reused = s_slots[static_cast<std::size_t>(slot)];
    reused.generation = (reused.generation + 1) % kGenerations;
  } else if (static_cast<std::int32_t>(s_slots.size()) < kMaxSlots) {
    slot = static_cast<std::int32_t>(s_slots.size());
    s_slots.emplace_back();
  } else {
    std::free(t.data);
    return 0;
  }
  Slot& s = s_slots[static_cast<std::size_t>(slot)];
  s.table = std::move(t);
  s.live = true;
  s_live.fetch_add(1);
  s_account.live->fetch_add(1);
  return (s.generation << kSlotBits) + slot + 1;
}

// Element size in bytes of a selector (the workspace's type codes); 0 when refused.
std::int64_t unit_size(std::int32_t selector) {
  switch (selector) {
    case 1:
      return 1;
    case 2:
      return 4;
    case 3:
      return 8;
    case 4:
      return 16;
    default:
      return 0;
  }
}

}  // namespace

extern "C" {

std::int32_t yutini(const std::int32_t* esize, const std::int32_t* entries, std::int32_t* handle,
                    std::int32_t* ierr) {
  if (*esize < 1 || *entries < 0) return fail(ierr, kErrBadArg);
  if (injected_refusal()) return fail(ierr, kErrNoMemory);
  std::lock_guard<std::mutex> lock(s_mutex);
  const std::int32_t h = create(*esize, *entries);
  if (h == 0) return fail(ierr, kErrNoMemory);
  *handle = h;
  *ierr = 0;
  return 0;
}

std::int32_t yutwri(const std::int32_t* handle, const std::int32_t* first,
                    const std::int32_t* count, const void* values, std::int32_t* ierr) {
  if (injected_refusal()) return fail(ierr, kErrNoMemory);
  std::lock_guard<std::mutex> lock(s_mutex);
  Table* t = find(*handle);
  // The entries written must start within the table or right after its last entry.
  if (t == nullptr || *first < 1 || *count < 0 || *first > t->entries + 1) {
    return fail(ierr, kErrBadArg);
  }
  const std::int64_t last = std::int64_t{*first} + *count - 1;
  if (last > t->entries && !resize(*t, last)) return fail(ierr, kErrNoMemory);
  if (*count > 0) {
    std::memcpy(t->data + (*first - 1) * t->esize, values,
                static_cast<std::size_t>(*count * t->esize));
  }
  *ierr = 0;
  return 0;
}

std::int32_t yutrea(const std::int32_t* handle, const std::int32_t* first,
                    const std::int32_t* count, void* values, std::int32_t* ierr) {
  std::lock_guard<std::mutex> lock(s_mutex);
  const Table* t = find(*handle);
  if (t == nullptr || *first < 1 || *count < 0 || std::int64_t{*first} + *count - 1 > t->entries) {
    return fail(ierr, kErrBadArg);
  }
  if (*count > 0) {
    std::memcpy(values, t->data + (*first - 1) * t->esize,
                static_cast<std::size_t>(*count * t->esize));
  }
  *ierr = 0;
  return 0;
}

std::int32_t yutinf(const std::int32_t* handle, std::int32_t* esize, std::int32_t* entries,
                    std::int32_t* ierr) {
  std::lock_guard<std::mutex> lock(s_mutex);
  const Table* t = find(*handle);
  if (t == nullptr) return fail(ierr, kErrBadArg);
  *esize = static_cast<std::int32_t>(t->esize);
  *entries = static_cast<std::int32_t>(t->entries);
  *ierr = 0;
  return 0;
}

std::int32_t yutmnc(const std::int32_t* handle, const std::int32_t* entries, std::int32_t* ierr) {
  if (injected_refusal()) return fail(ierr, kErrNoMemory);
  std::lock_guard<std::mutex> lock(s_mutex);
  Table* t = find(*handle);
  if (t == nullptr || *entries < 0) return fail(ierr, kErrBadArg);
  if (!resize(*t, *entries)) return fail(ierr, kErrNoMemory);
  *ierr = 0;
  return 0;
}

std::int32_t yuttab(const std::int32_t* handle, const std::int32_t* selector, std::int64_t* index,
                    std::int32_t* entries, std::int32_t* ierr) {
  const std::int64_t unit = unit_size(*selector);
  std::lock_guard<std::mutex> lock(s_mutex);
  const Table* t = find(*handle);
  if (t == nullptr || unit == 0) return fail(ierr, kErrBadArg);
  // Both dynar and the storage are 16-byte aligned, so the distance is a whole number of
  // units. Unsigned arithmetic wraps, so a storage below dynar gives a negative index.
  const std::uintptr_t distance =
      reinterpret_cast<std::uintptr_t>(t->data) - reinterpret_cast<std::uintptr_t>(dynar);
  *index = static_cast<std::int64_t>(distance) / unit + 1;
  *entries = static_cast<std::int32_t>(t->entries);
  *ierr = 0;
  return 0;
}

std::int32_t yutcop(const std::int32_t* handle, std::int32_t* copy, std::int32_t* ierr) {
  if (injected_refusal()) return fail(ierr, kErrNoMemory);
  std::lock_guard<std::mutex> lock(s_mutex);
  const Table* t = find(*handle);
  if (t == nullptr) return fail(ierr, kErrBadArg);
  const std::int64_t esize = t->esize, entries = t->entries;
  const std::int32_t h = create(esize, entries);  // may move the slots: t is not used after
  if (h == 0) return fail(ierr, kErrNoMemory);
  const Table* from = find(*handle);
  Table* to = find(h);
  if (entries > 0) std::memcpy(to->data, from->data, static_cast<std::size_t>(entries * esize));
  *copy = h;
  *ierr = 0;
  return 0;
}

std::int32_t yutend(const std::int32_t* handle, std::int32_t* ierr) {
  Table t;
  {
    std::lock_guard<std::mutex> lock(s_mutex);
    Table* found = find(*handle);
    if (found == nullptr) return fail(ierr, kErrBadArg);
    t = std::move(*found);
    *found = Table{};
    const std::int32_t slot = (*handle - 1) & (kMaxSlots - 1);
    s_slots[static_cast<std::size_t>(slot)].live = false;
    s_free.push_back(slot);
  }
  std::free(t.data);
  s_live.fetch_sub(1);
  t.owner->fetch_sub(1);
  *ierr = 0;
  return 0;
}

std::int64_t orvq7sys_table_live(void) { return s_live.load(); }

std::int64_t orvq7sys_table_live_thread(void) { return s_account.live->load(); }

std::int64_t orvq7sys_table_capacity(std::int32_t handle) {
  std::lock_guard<std::mutex> lock(s_mutex);
  const Table* t = find(handle);
  return t == nullptr ? -1 : t->capacity;
}

void orvq7sys_table_refuse(std::int32_t skip, std::int32_t n) {
  s_injection.pass = skip > 0 ? skip : 0;
  s_injection.refuse = n > 0 ? n : 0;
}

}  // extern "C"
