// Large blocks live apart from the C runtime's heap.
//
// That heap copies a large block whenever it grows, and gives each back to the system at once, so that every page of
// the next one is made and cleared anew, which takes longer than to fill it. Here a large block is a region of the
// address space of its own; it grows where it stands as long as the addresses behind it are free. Regions that were
// freed are kept for the next blocks: at most 32 MB that nobody uses, as much as the heap of other systems holds back.
// They are given back when memory runs short.

#include "qxcore/platform/internal/heap.h"

#include <malloc.h>

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <new>
#include <utility>

#include "qxcore/platform/interlocked.h"
#include "qxcore/platform/win32.h"

namespace platform {
namespace {

constexpr std::size_t kLeastLarge = std::size_t{256} << 10;
constexpr std::size_t kMostSpare = std::size_t{32} << 20;
constexpr std::size_t kRoom = std::size_t{64} << 20;  // free addresses that are looked for behind a block that grows
constexpr std::size_t kGranule = 0x10000;             // where the system lets regions begin
constexpr std::size_t kMostSize = SIZE_MAX / 2;

// The head of a region; its block follows.
struct alignas(64) Region {
  std::size_t bytes;  // all of it
  std::size_t used;   // by this head and the block; 0 while it is kept
  Region* next;       // the one that was kept before it

  char* End() { return reinterpret_cast<char*>(this) + bytes; }
  void* Block() { return this + 1; }
  static Region* Of(void* block) { return static_cast<Region*>(block) - 1; }
};

std::size_t BytesFor(std::size_t size) { return (sizeof(Region) + size + kGranule - 1) / kGranule * kGranule; }

// --- where regions begin, one bit for each place: that tells their blocks from those of the runtime's heap ---

static_assert(sizeof(void*) == 4, "the address space has 65,536 places where a region can begin");
constinit std::atomic<std::uint32_t> g_beginnings[0x10000 / 32] = {};

std::uint32_t PlaceOf(const void* address) { return reinterpret_cast<std::uintptr_t>(address) / kGranule; }

void NoteBeginning(const void* region) {
  g_beginnings[PlaceOf(region) / 32] |= std::uint32_t{1} << PlaceOf(region) % 32;
}

void ForgetBeginning(const void* region) {
  g_beginnings[PlaceOf(region) / 32] &= ~(std::uint32_t{1} << PlaceOf(region) % 32);
}

bool IsLarge(const void* block) {
  if (reinterpret_cast<std::uintptr_t>(block) % kGranule != sizeof(Region)) return false;
  return (g_beginnings[PlaceOf(block) / 32] >> PlaceOf(block) % 32 & 1) != 0;
}

// --- regions and the system ---

void* TakePages(void* place, std::size_t bytes) {
  return VirtualAlloc(place, bytes, MEM_RESERVE | MEM_COMMIT, PAGE_READWRITE);
}

// The beginning of free addresses for that many bytes and more, or null, which lets the system choose.
void* FindRoom(std::size_t bytes) {
  void* place = VirtualAlloc(nullptr, bytes + kRoom, MEM_RESERVE, PAGE_READWRITE);
  if (place != nullptr) VirtualFree(place, 0, MEM_RELEASE);
  return place;
}

Region* Make(std::size_t bytes, bool grows) {
  void* place = grows ? TakePages(FindRoom(bytes), bytes) : nullptr;
  if (place == nullptr) place = TakePages(nullptr, bytes);  // what was free a moment ago may be taken
  if (place == nullptr) return nullptr;
  NoteBeginning(place);
  return new (place) Region{bytes, 0, nullptr};
}

bool GrowInPlace(Region* region, std::size_t bytes) {
  if (bytes <= region->bytes) return true;
  if (TakePages(region->End(), bytes - region->bytes) == nullptr) return false;
  region->bytes = bytes;
  return true;
}

// A region that has grown was taken from the system in pieces, and each goes back by itself.
void Release(Region* region) {
  ForgetBeginning(region);
  char* const end = region->End();
  for (char* at = reinterpret_cast<char*>(region); at != end;) {
    MEMORY_BASIC_INFORMATION piece;
    if (VirtualQuery(at, &piece, sizeof piece) == 0 || !VirtualFree(at, 0, MEM_RELEASE)) return;
    at += piece.RegionSize;
  }
}

// --- what is spare: the regions that are kept, and what blocks leave of theirs ---

class Spare {
 public:
  // A kept region that the bytes fit into, or null: the largest one for a block that grows, else the smallest. The
  // caller says by Use what becomes of it.
  Region* Take(std::size_t bytes, bool grows) {
    std::lock_guard hold(m_lock);
    Region** best = nullptr;
    for (Region** at = &m_kept; *at != nullptr; at = &(*at)->next) {
      if ((*at)->bytes < bytes) continue;
      if (best == nullptr || ((*at)->bytes > (*best)->bytes) == grows) best = at;
    }
    if (best == nullptr) return nullptr;
    Region* region = *best;
    *best = region->next;
    return region;
  }

  // Of a region that had `before` bytes spare, that many are used from now on.
  void Use(Region* region, std::size_t before, std::size_t used) {
    std::lock_guard hold(m_lock);
    region->used = used;
    m_bytes += region->bytes - used - before;
  }

  // Whether a block may leave that much more.
  bool HasRoomFor(std::size_t bytes) {
    std::lock_guard hold(m_lock);
    return bytes <= m_most && m_bytes <= m_most - bytes;
  }

  // Keeps a region whose block is freed, and gives back those that were kept longest until the limit is met.
  void Keep(Region* region) {
    {
      std::lock_guard hold(m_lock);
      m_bytes += std::exchange(region->used, 0);
      region->next = std::exchange(m_kept, region);
    }
    while (Region* oldest = TakeOldestAboveLimit()) Release(oldest);
  }

  // Gives all kept regions back. Returns whether there were any.
  bool GiveBack() {
    Region* kept;
    {
      std::lock_guard hold(m_lock);
      kept = std::exchange(m_kept, nullptr);
      for (Region* region = kept; region != nullptr; region = region->next) m_bytes -= region->bytes;
    }
    const bool hadAny = kept != nullptr;
    while (kept != nullptr) Release(std::exchange(kept, kept->next));
    return hadAny;
  }

  // Keeps nothing from now on.
  void Close() {
    {
      std::lock_guard hold(m_lock);
      m_most = 0;
    }
    GiveBack();
  }

 private:
  Region* TakeOldestAboveLimit() {
    std::lock_guard hold(m_lock);
    if (m_bytes <= m_most || m_kept == nullptr) return nullptr;
    Region** at = &m_kept;
    while ((*at)->next != nullptr) at = &(*at)->next;
    m_bytes -= (*at)->bytes;
    return std::exchange(*at, nullptr);
  }

  ShortLock m_lock;
  Region* m_kept = nullptr;  // the latest first
  std::size_t m_bytes = 0;
  std::size_t m_most = kMostSpare;
};

constinit Spare g_spare;  // never destroyed: static objects may have blocks longer than this file's

// Leaves nothing behind in a process that unloads the library.
const struct Closer {
  ~Closer() { g_spare.Close(); }
} g_closer;

// --- blocks ---

void* AllocateLarge(std::size_t size, bool grows) {
  if (size > kMostSize) return nullptr;
  const std::size_t bytes = BytesFor(size);
  Region* region = g_spare.Take(bytes, grows);
  if (region != nullptr) {
    g_spare.Use(region, region->bytes, bytes);
    return region->Block();
  }
  region = Make(bytes, grows);
  if (region == nullptr && g_spare.GiveBack()) region = Make(bytes, grows);
  if (region == nullptr) return nullptr;
  region->used = bytes;
  return region->Block();
}

// A block that shrinks by much does not hold its memory.
bool ResizeInPlace(Region* region, std::size_t bytes) {
  if (bytes < region->used && !g_spare.HasRoomFor(region->used - bytes)) return false;
  const std::size_t before = region->bytes - region->used;
  if (!GrowInPlace(region, bytes)) return false;
  g_spare.Use(region, before, bytes);
  return true;
}

void* Move(void* block, std::size_t before, std::size_t size) {
  void* moved = size >= kLeastLarge ? AllocateLarge(size, size > before) : AllocateMemory(size);
  if (moved == nullptr) return nullptr;
  std::memcpy(moved, block, std::min(before, size));
  FreeMemory(block);
  return moved;
}

void* ResizeLarge(void* block, std::size_t size) {
  if (size > kMostSize) return nullptr;
  Region* region = Region::Of(block);
  if (size >= kLeastLarge / 2 && ResizeInPlace(region, BytesFor(size))) return block;
  return Move(block, region->used - sizeof(Region), size);
}

}  // namespace

void* AllocateMemory(std::size_t size) noexcept {
  if (size >= kLeastLarge) return AllocateLarge(size, false);
  void* block = std::malloc(size);
  return block == nullptr && g_spare.GiveBack() ? std::malloc(size) : block;
}

void* ResizeMemory(void* block, std::size_t size) noexcept {
  if (block == nullptr) return AllocateMemory(size);
  if (IsLarge(block)) return ResizeLarge(block, size);
  if (size >= kLeastLarge) return Move(block, _msize(block), size);
  void* resized = std::realloc(block, size);
  return resized == nullptr && g_spare.GiveBack() ? std::realloc(block, size) : resized;
}

void FreeMemory(void* block) noexcept {
  if (IsLarge(block)) return g_spare.Keep(Region::Of(block));
  std::free(block);
}

}  // namespace platform
