// fuzz/fuzz_frame.cpp -- the library frame (cbkver, version queries, marker, data item) and
// the platform services it calls (traceback, messages, workspace, copy, fill, sorts, guarded
// contexts), driven by arbitrary bytes.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "frame/frame_api.h"
#include "fuzz_support.h"

namespace {

using fuzz::Call;
using fuzz::Input;

void fuzz_cbkver(Input& in) {
  Call call("cbkver");
  const bool refuse = in.byte() & 1;
  if (refuse) call.refuse(1);
  const std::int32_t r = cbkver();
  call.released();
  FUZZ_CHECK("cbkver", r == (refuse ? 1 : 0));
  const auto fr = fuzz::frames();
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
    for (std::size_t k = 0; k < n; ++k) FUZZ_CHECK("sorr8", fuzz::same(v[k], want[k]));
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
  const auto fr = fuzz::frames();
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
  const auto gf = fuzz::frames();
  FUZZ_CHECK("giufin", gf.size() == (status != 0 ? 1u : 0u));
  if (status != 0) FUZZ_CHECK("giufin", gf[0].code == status && gf[0].name == std::string(name, 8));
  std::memcpy(gmacer, saved, 8);
  orvq7sys_trace_clear();
  orvq7sys_msg_clear();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  switch (in.byte() % 6) {
    case 0: fuzz_cbkver(in); break;
    case 1: fuzz_version(); break;
    case 2: fuzz_workspace(in); break;
    case 3: fuzz_copy_fill(in); break;
    case 4: fuzz_sorts(in); break;
    default: fuzz_trace(in); break;
  }
  return 0;
}
