// fuzz/fuzz_frame.cpp -- the library frame (cbkver, version queries, marker, data item) and
// the platform services (traceback, messages, workspace, copy, fill, sorts, guarded contexts,
// growable tables against a plain model, the query interface, registration, the data areas),
// driven by arbitrary bytes.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "companions/framework/framework_api.h"
#include "frame/frame_api.h"
#include "fuzz_support.h"

namespace fuzz {
namespace {

void fuzz_cbkver(Input& in) {
  Call call("cbkver");
  const bool refuse = in.byte() & 1;
  if (refuse) call.refuse(1);
  const std::int32_t r = cbkver();
  call.released();
  FUZZ_CHECK("cbkver", r == (refuse ? 1 : 0));
  const auto fr = frames();
  if (refuse) {
    FUZZ_CHECK("cbkver", fr.size() == 1 && fr[0].code == 1036 && fr[0].name == "CBKVER  ");
  } else {
    FUZZ_CHECK("cbkver", fr.empty());
  }
  // The version record is issued before the request, on both paths.
  std::int32_t code = -1, severity = -1;
  FUZZ_CHECK("cbkver", orvq7sys_msg_count() == 1 && orvq7sys_msg_get(1, &code, &severity) == 0);
  FUZZ_CHECK("cbkver", code == 0 && severity == 0);
}

void fuzz_version() {
  Call call("orvq7_version");
  std::int32_t major = -1, minor = -1, patch = -1;
  const std::int32_t r = orvq7_version(&major, &minor, &patch);
  FUZZ_CHECK("orvq7_version", r == major * 10000 + minor * 100 + patch);
  FUZZ_CHECK("orvq7_version", major == ORVQ7_VERSION_MAJOR && minor == ORVQ7_VERSION_MINOR &&
                                  patch == ORVQ7_VERSION_PATCH);
  const char* text = orvq7_version_text();
  FUZZ_CHECK("orvq7_version_text", text != nullptr);
  char want[40];
  std::snprintf(want, sizeof want, "%d.%d.%d", major, minor, patch);
  FUZZ_CHECK("orvq7_version_text", std::strcmp(text, want) == 0);
  FUZZ_CHECK("OrvZelInternalOrvQ7Maths", OrvZelInternalOrvQ7Maths() == 1);
  FUZZ_CHECK("OrvZelLibrary", OrvZelLibrary == 1);
  call.quiet();
}

// A sequence of takes and releases on a few handles, with arbitrary types, counts and bases;
// every granted block is written over its whole extent (the sanitizer checks the extent).
void fuzz_workspace(Input& in) {
  Call call("altes");
  alignas(16) static double local[8];
  void* const bases[4] = {dynar, data, toler, local};
  struct Held {
    std::int32_t handle = 0;
    std::int32_t type = 0, count = 0;
    void* base = nullptr;
    std::int64_t index = 0;
  } held[4];
  const std::int64_t sizes[5] = {0, 1, 4, 8, 16};
  const int ops = in.pick(1, 24);
  for (int op = 0; op < ops; ++op) {
    Held& h = held[in.byte() & 3];
    const std::uint8_t what = in.byte();
    if (what & 1) {
      const std::int32_t type = in.count(1, 4);
      const std::int32_t count = in.count(0, 300);
      void* base = bases[(what >> 1) & 3];
      const bool refuse = (what & 0x30) == 0x30;
      if (refuse) call.refuse(1);
      std::int64_t index = 77;
      std::int32_t handle = h.handle;
      const std::int32_t r = altes(base, &type, &count, &index, &handle);
      const bool ok = !refuse && type >= 1 && type <= 4 && count >= 0 && h.handle == 0;
      FUZZ_CHECK("altes", r == (ok ? 0 : 1));
      if (r == 0) {
        FUZZ_CHECK("altes", handle != 0);
        const std::int64_t es = sizes[type];
        const auto start = reinterpret_cast<std::uintptr_t>(base) +
                           static_cast<std::uintptr_t>(index - 1) * static_cast<std::uintptr_t>(es);
        std::memset(reinterpret_cast<void*>(start), 0xa5, static_cast<std::size_t>(count * es));
        h = {handle, type, count, base, index};
      } else {
        FUZZ_CHECK("altes", handle == h.handle && index == 77);
      }
    } else {
      const std::int32_t handle = (what & 2) ? h.handle : 0;
      const std::int32_t r = detes(&handle);
      FUZZ_CHECK("detes", r == 0);
      if (handle != 0) {
        FUZZ_CHECK("detes", detes(&handle) == 1);  // released once only
        h = Held{};
      }
    }
    call.refuse(0);
  }
  for (Held& h : held) FUZZ_CHECK("detes", detes(&h.handle) == 0);
  call.quiet();
}

void fuzz_copy_fill(Input& in) {
  Call call("crccop");
  std::uint8_t buf[64], want[64];
  for (auto& b : buf) b = in.byte();
  std::memcpy(want, buf, sizeof buf);
  const int from = in.pick(0, 63), to = in.pick(0, 63);
  const std::int32_t count = in.pick(-2, 64 - std::max(from, to));
  if (in.byte() & 1) {
    FUZZ_CHECK("crccop", crccop(buf + from, &count, buf + to) == 0);
    if (count > 0) std::memmove(want + to, want + from, static_cast<std::size_t>(count));
  } else {
    const std::int32_t fill = in.int32();
    FUZZ_CHECK("crcmac", crcmac(buf + to, &count, &fill) == 0);
    if (count > 0) std::memset(want + to, fill & 0xff, static_cast<std::size_t>(count));
  }
  FUZZ_CHECK("crccop", std::memcmp(buf, want, sizeof buf) == 0);
  call.quiet();
}

void fuzz_sorts(Input& in) {
  Call call("sori4");
  if (in.byte() & 1) {
    const std::int32_t rowlen = in.count(1, 5), nrows = in.count(1, 24), key = in.count(1, 5);
    const int rl = std::clamp(rowlen, 0, 6), nr = std::clamp(nrows, 0, 25);
    std::vector<std::int32_t> table(static_cast<std::size_t>(rl * nr) + 1);
    for (auto& v : table) v = static_cast<std::int8_t>(in.byte());
    std::vector<std::int32_t> want = table, work(table.size());
    if (rowlen >= 1 && nrows >= 1 && key >= 1 && key <= rowlen) {
      std::vector<int> order(static_cast<std::size_t>(nr));
      for (int r = 0; r < nr; ++r) order[static_cast<std::size_t>(r)] = r;
      std::stable_sort(order.begin(), order.end(), [&](int x, int y) {
        return table[static_cast<std::size_t>(x * rl + key - 1)] <
               table[static_cast<std::size_t>(y * rl + key - 1)];
      });
      for (int r = 0; r < nr; ++r)
        for (int c = 0; c < rl; ++c)
          want[static_cast<std::size_t>(r * rl + c)] =
              table[static_cast<std::size_t>(order[static_cast<std::size_t>(r)] * rl + c)];
    }
    FUZZ_CHECK("sori4", sori4(table.data(), &rowlen, &nrows, &key, work.data()) == 0);
    FUZZ_CHECK("sori4", table == want);
  } else {
    const std::int32_t count = in.count(0, 40);
    const std::size_t n = static_cast<std::size_t>(std::clamp(count, 0, 41));
    std::vector<double> v(n), want;
    for (auto& x : v) x = in.real();
    want = v;
    if (count >= 2)
      std::stable_sort(want.begin(), want.end(), [](double x, double y) {
        if (std::isnan(y)) return !std::isnan(x);
        return x < y;
      });
    FUZZ_CHECK("sorr8", sorr8(v.data(), &count) == 0);
    for (std::size_t k = 0; k < n; ++k) FUZZ_CHECK("sorr8", same(v[k], want[k]));
  }
  call.quiet();
}

// Traceback and message services, and the guarded contexts, with arbitrary names, lengths
// and codes.
void fuzz_trace(Input& in) {
  orvq7sys_trace_clear();
  orvq7sys_msg_clear();
  char name[48];
  for (auto& c : name) c = static_cast<char>(in.byte());
  const int len = in.pick(-3, 44);
  const std::int32_t code = in.int32(), severity = in.int32();
  bftier(&code, name, len);
  errmsg(&code, &severity);
  const auto fr = frames();
  const std::size_t kept = static_cast<std::size_t>(std::clamp(len, 0, ORVQ7SYS_NAME_MAX));
  FUZZ_CHECK("bftier", fr.size() == 1 && fr[0].code == code);
  FUZZ_CHECK("bftier", fr[0].name == std::string(name, kept));
  std::int32_t c = 0, s = 0;
  FUZZ_CHECK("errmsg", orvq7sys_msg_count() == 1 && orvq7sys_msg_get(1, &c, &s) == 0);
  FUZZ_CHECK("errmsg", c == code && s == severity);
  // Guarded context: a non-zero status records gmacer's first 8 bytes as one frame.
  orvq7sys_trace_clear();
  const std::int32_t status = (in.byte() & 1) ? code : 0;
  char saved[8];
  std::memcpy(saved, gmacer, 8);
  std::memcpy(gmacer, name, 8);
  giuope(nullptr, nullptr, nullptr, nullptr);
  const std::int32_t r = giufin(&status, nullptr);
  const std::int32_t flag = 1;
  giuclo(&flag);
  giuclo(&flag);  // a close without an open context does nothing
  FUZZ_CHECK("giufin", r == (status != 0 ? 1 : 0));
  const auto gf = frames();
  FUZZ_CHECK("giufin", gf.size() == (status != 0 ? 1u : 0u));
  if (status != 0) FUZZ_CHECK("giufin", gf[0].code == status && gf[0].name == std::string(name, 8));
  std::memcpy(gmacer, saved, 8);
  orvq7sys_trace_clear();
  orvq7sys_msg_clear();
}


// ---- Growable tables: a sequence of operations on a few tables, against a plain model --------

// The model of one table: its entry size and the bytes of its entries.
struct ModelTable {
  std::int32_t handle = 0;
  std::int32_t esize = 0;
  std::vector<std::uint8_t> bytes;
  std::int32_t entries() const { return static_cast<std::int32_t>(bytes.size() / std::size_t(esize)); }
};

// Every service on a handle the model does not hold fails with 4712 and writes nothing.
void check_unknown(std::int32_t h) {
  std::int32_t e = kSentinelInt, es = kSentinelInt, ent = kSentinelInt;
  const std::int32_t one = 1, zero = 0, sel = 3;
  std::int64_t index = -77;
  std::uint8_t buf[4] = {1, 2, 3, 4};
  FUZZ_CHECK("yutinf", yutinf(&h, &es, &ent, &e) == 1 && e == 4712);
  FUZZ_CHECK("yutinf", es == kSentinelInt && ent == kSentinelInt);
  FUZZ_CHECK("yutrea", yutrea(&h, &one, &zero, buf, &e) == 1 && e == 4712);
  FUZZ_CHECK("yutwri", yutwri(&h, &one, &zero, buf, &e) == 1 && e == 4712);
  FUZZ_CHECK("yutmnc", yutmnc(&h, &zero, &e) == 1 && e == 4712);
  FUZZ_CHECK("yuttab", yuttab(&h, &sel, &index, &ent, &e) == 1 && e == 4712 && index == -77);
  std::int32_t copy = kSentinelInt;
  FUZZ_CHECK("yutcop", yutcop(&h, &copy, &e) == 1 && e == 4712 && copy == kSentinelInt);
  FUZZ_CHECK("yutend", yutend(&h, &e) == 1 && e == 4712);
  FUZZ_CHECK("orvq7sys_table_capacity", orvq7sys_table_capacity(h) == -1);
}

void fuzz_tables(Input& in) {
  Call call("yutini");
  const std::int64_t live0 = orvq7sys_table_live(), thread0 = orvq7sys_table_live_thread();
  ModelTable t[3];
  std::vector<std::int32_t> released;
  auto held = [&] {
    std::int64_t k = 0;
    for (const auto& m : t) k += m.handle != 0;
    return k;
  };
  const int ops = in.pick(1, 30);
  for (int op = 0; op < ops; ++op) {
    ModelTable& m = t[in.byte() % 3];
    const std::uint8_t what = in.byte();
    // A refusal is injected only for a call whose arguments are valid: 36 and nothing changed.
    const bool refuse = (what & 0xe0) == 0xe0;
    std::int32_t e = kSentinelInt;
    // Runs a call that may be refused (only with valid arguments); true when it succeeded,
    // else checks the code (36 refused, 4712 invalid).
    auto granted = [&](const char* name, bool valid, auto run) {
      if (refuse && valid) orvq7sys_table_refuse(0, 1);
      const std::int32_t r = run();
      orvq7sys_table_refuse(0, 0);
      if (!valid || refuse) FUZZ_CHECK(name, r == 1 && e == (valid ? 36 : 4712));
      else FUZZ_CHECK(name, r == 0 && e == 0);
      return valid && !refuse;
    };
    // Every operation but creation and unknown handles works on a table the slot holds.
    if (m.handle == 0 && what % 9 != 0 && what % 9 != 7) continue;
    switch (what % 9) {
      case 0: {  // create (over a slot the model holds, the old table is released first)
        if (m.handle != 0) {
          FUZZ_CHECK("yutend", yutend(&m.handle, &e) == 0 && e == 0);
          released.push_back(m.handle);
          m = ModelTable{};
        }
        const std::int32_t esize = in.count(1, 24), entries = in.count(0, 40);
        const bool valid = esize >= 1 && entries >= 0;
        std::int32_t h = kSentinelInt;
        if (!granted("yutini", valid, [&] { return yutini(&esize, &entries, &h, &e); })) {
          FUZZ_CHECK("yutini", h == kSentinelInt);
        } else {
          FUZZ_CHECK("yutini", h > 0);
          for (std::int32_t old : released) FUZZ_CHECK("yutini", h != old);
          m.handle = h;
          m.esize = esize;
          m.bytes.assign(std::size_t(esize) * std::size_t(entries), 0);
        }
        break;
      }
      case 1: {  // write, possibly past the end
        const std::int32_t first = in.count(1, m.entries() + 1), count = in.count(0, 20);
        const bool valid = first >= 1 && first <= m.entries() + 1 && count >= 0;
        std::vector<std::uint8_t> values(std::size_t(std::max(count, 0)) * std::size_t(m.esize));
        for (auto& b : values) b = in.byte();
        if (!granted("yutwri", valid, [&] { return yutwri(&m.handle, &first, &count, values.data(), &e); })) break;
        const std::size_t at = std::size_t(first - 1) * std::size_t(m.esize);
        if (at + values.size() > m.bytes.size()) m.bytes.resize(at + values.size(), 0);
        std::copy(values.begin(), values.end(), m.bytes.begin() + std::ptrdiff_t(at));
        break;
      }
      case 2: {  // read, inside and outside the table
        const std::int32_t first = in.count(1, m.entries() + 1), count = in.count(0, 20);
        const bool valid = first >= 1 && count >= 0 &&
                           std::int64_t(first) + count - 1 <= std::int64_t(m.entries());
        const std::size_t nb = std::size_t(std::clamp(count, 0, 21)) * std::size_t(m.esize);
        std::vector<std::uint8_t> out(nb + 8, 0xc5);
        const std::int32_t r = yutrea(&m.handle, &first, &count, out.data(), &e);
        if (!valid) {
          FUZZ_CHECK("yutrea", r == 1 && e == 4712);
          for (auto b : out) FUZZ_CHECK("yutrea", b == 0xc5);
          break;
        }
        FUZZ_CHECK("yutrea", r == 0 && e == 0);
        const std::size_t at = std::size_t(first - 1) * std::size_t(m.esize);
        if (nb > 0) FUZZ_CHECK("yutrea", std::memcmp(out.data(), m.bytes.data() + at, nb) == 0);
        for (std::size_t k = nb; k < out.size(); ++k) FUZZ_CHECK("yutrea", out[k] == 0xc5);
        break;
      }
      case 3: {  // set the number of entries
        const std::int32_t entries = in.count(0, 60);
        const bool valid = entries >= 0;
        if (!granted("yutmnc", valid, [&] { return yutmnc(&m.handle, &entries, &e); })) break;
        m.bytes.resize(std::size_t(entries) * std::size_t(m.esize), 0);
        break;
      }
      case 4: {  // direct access: the storage seen through dynar holds the entries
        const std::int32_t sel = in.count(1, 4);
        std::int64_t index = -77;
        std::int32_t entries = kSentinelInt;
        const std::int32_t r = yuttab(&m.handle, &sel, &index, &entries, &e);
        if (sel < 1 || sel > 4) {
          FUZZ_CHECK("yuttab", r == 1 && e == 4712 && index == -77 && entries == kSentinelInt);
          break;
        }
        FUZZ_CHECK("yuttab", r == 0 && e == 0 && entries == m.entries());
        const std::uintptr_t unit = sel == 1 ? 1 : sel == 2 ? 4 : sel == 3 ? 8 : 16;
        const std::uintptr_t at = reinterpret_cast<std::uintptr_t>(dynar) +
                                  static_cast<std::uintptr_t>(index - 1) * unit;
        FUZZ_CHECK("yuttab", at % 16 == 0);
        if (!m.bytes.empty())
          FUZZ_CHECK("yuttab", std::memcmp(reinterpret_cast<const void*>(at), m.bytes.data(), m.bytes.size()) == 0);
        break;
      }
      case 5: {  // copy into another slot the model does not hold
        ModelTable* free_slot = nullptr;
        for (auto& c : t) if (c.handle == 0) free_slot = &c;
        if (free_slot == nullptr) break;
        std::int32_t copy = kSentinelInt;
        if (!granted("yutcop", true, [&] { return yutcop(&m.handle, &copy, &e); })) {
          FUZZ_CHECK("yutcop", copy == kSentinelInt);
          break;
        }
        FUZZ_CHECK("yutcop", copy > 0 && copy != m.handle);
        *free_slot = m;
        free_slot->handle = copy;
        break;
      }
      case 6: {  // release
        FUZZ_CHECK("yutend", yutend(&m.handle, &e) == 0 && e == 0);
        released.push_back(m.handle);
        m = ModelTable{};
        break;
      }
      case 7: {  // handles the model does not hold: 0, arbitrary, released ones
        check_unknown(0);
        const std::int32_t h = in.int32();
        bool ours = false;
        for (const auto& c : t) ours = ours || (c.handle != 0 && c.handle == h);
        if (!ours && orvq7sys_table_capacity(h) == -1) check_unknown(h);
        if (!released.empty()) check_unknown(released[in.byte() % released.size()]);
        break;
      }
      default: {  // description
        std::int32_t es = 0, ent = 0;
        FUZZ_CHECK("yutinf", yutinf(&m.handle, &es, &ent, &e) == 0 && e == 0);
        FUZZ_CHECK("yutinf", es == m.esize && ent == m.entries());
        break;
      }
    }
    for (const auto& c : t)
      if (c.handle != 0) FUZZ_CHECK("orvq7sys_table_capacity", orvq7sys_table_capacity(c.handle) >= c.entries());
    FUZZ_CHECK("orvq7sys_table_live", orvq7sys_table_live() == live0 + held());
    FUZZ_CHECK("orvq7sys_table_live_thread", orvq7sys_table_live_thread() == thread0 + held());
  }
  for (auto& c : t) {
    std::int32_t e = 0;
    if (c.handle != 0) FUZZ_CHECK("yutend", yutend(&c.handle, &e) == 0);
  }
  FUZZ_CHECK("yutend", orvq7sys_table_live() == live0 && orvq7sys_table_live_thread() == thread0);
  call.quiet();  // the table services record no frame and take no workspace block
}

// ---- Queries, the version record, a full traceback, registration, the data areas ------------

void fuzz_queries(Input& in) {
  Call call("altver");
  altver();
  std::int32_t code = -1, severity = -1;
  FUZZ_CHECK("altver", orvq7sys_msg_count() == 1 && orvq7sys_msg_get(1, &code, &severity) == 0);
  FUZZ_CHECK("altver", code == 0 && severity == 0);
  const char* v = orvq7sys_version_text();
  FUZZ_CHECK("orvq7sys_version_text", v != nullptr && v[0] != '\0');
  orvq7sys_msg_clear();
  // Any code has a text; the shared codes have texts of their own.
  const std::int32_t any = in.int32();
  const char* text = orvq7sys_code_text(any);
  FUZZ_CHECK("orvq7sys_code_text", text != nullptr && text[0] != '\0');
  for (std::int32_t c : {0, 36, 4701, 4702, 4703, 4704, 4707, 4709, 4710, 4712, 4713, 4715, 4716,
                         4717, 4718, 4720, 4721, 4722})
    FUZZ_CHECK("orvq7sys_code_text", std::strcmp(orvq7sys_code_text(c), "unknown code") != 0);
  // More frames than the traceback holds: the most recent kept, the others counted as dropped.
  const int pushed = in.pick(0, 3 * ORVQ7SYS_TRACE_MAX);
  for (std::int32_t k = 0; k < pushed; ++k) bftier(&k, "QUERY   ", 8);
  const int kept = std::min(pushed, ORVQ7SYS_TRACE_MAX);
  FUZZ_CHECK("orvq7sys_trace_dropped", orvq7sys_trace_count() == kept &&
                                           orvq7sys_trace_dropped() == pushed - kept);
  if (kept > 0) {
    std::int32_t c = -1, len = -1;
    char name[ORVQ7SYS_NAME_MAX];
    FUZZ_CHECK("orvq7sys_trace_frame", orvq7sys_trace_frame(1, &c, name, &len) == 0 && c == pushed - kept);
    FUZZ_CHECK("orvq7sys_trace_frame", orvq7sys_trace_frame(kept + 1, &c, name, &len) == 1);
  }
  orvq7sys_trace_clear();
  FUZZ_CHECK("orvq7sys_trace_clear", orvq7sys_trace_count() == 0 && orvq7sys_trace_dropped() == 0);
  // Registration: the library registered itself once at load; a host call counts one more.
  const std::int32_t id = in.int32();
  FUZZ_CHECK("orvzel_loading_count", (id >= 0 && id <= 255) || orvzel_loading_count(id) == 0);
  const std::int32_t before = orvzel_loading_count(OrvZelLibrary_OrvQ7Maths);
  FUZZ_CHECK("orvzel_loading_count", before >= 1);
  if (in.byte() & 1) {
    const int now = OrvZelDeclareLibraryLoading(OrvZelLibrary_OrvQ7Maths);
    FUZZ_CHECK("OrvZelDeclareLibraryLoading", now == before + 1 && orvzel_loading_count(OrvZelLibrary_OrvQ7Maths) == now);
  }
  // The scratch areas are as large as declared: a host may use all of them.
  double* const areas[4] = {utili1, utili2, utili4, utili5};
  const std::size_t sizes[4] = {ORVQ7DATA_UTILI1_SIZE, ORVQ7DATA_UTILI_SIZE, ORVQ7DATA_UTILI_SIZE, ORVQ7DATA_UTILI_SIZE};
  const int a = in.byte() & 3;
  const std::size_t k = static_cast<std::size_t>(in.pick(0, 0x7fff)) % sizes[a];
  const double saved = areas[a][k], saved_last = areas[a][sizes[a] - 1];
  areas[a][k] = in.real();
  areas[a][sizes[a] - 1] = areas[a][k];
  areas[a][sizes[a] - 1] = saved_last;
  areas[a][k] = saved;
  FUZZ_CHECK("orvq7sys_ws_outstanding_thread", orvq7sys_ws_outstanding_thread() == 0);
  call.quiet();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  const std::uint8_t selector = in.byte();
  if (selector >= 192) {  // the table services and the queries
    if ((selector & 3) == 3) fuzz_queries(in);
    else fuzz_tables(in);
    return 0;
  }
  switch (selector % 6) {
    case 0: fuzz_cbkver(in); break;
    case 1: fuzz_version(); break;
    case 2: fuzz_workspace(in); break;
    case 3: fuzz_copy_fill(in); break;
    case 4: fuzz_sorts(in); break;
    default: fuzz_trace(in); break;
  }
  return 0;
}

}  // namespace fuzz
