// Lays a sort body out as the files hold it.
#include "sortbuild.h"

namespace mkdefs {

bool SortBody::bytes(Bytes *out, std::string *err) const {
  Bytes b;
  put8(b, defSec);
  put8(b, defTer);
  put16(b, static_cast<uint16_t>(expansions.size()));
  put16(b, static_cast<uint16_t>(combinations.size()));
  for (const Block &k : blocks) {
    put8(b, k.flags);
    put8(b, k.cls);
    put16(b, k.base);
  }
  const size_t offsets = b.size();
  put16(b, 0);
  put16(b, 0);
  put16(b, 0);
  auto table = [&](size_t slot, bool present) {
    if (present && b.size() <= 0xFFFF) set16(b, offsets + 2 * slot, static_cast<uint16_t>(b.size()));
  };
  table(0, !weights.empty());
  for (const Weight &w : weights) {
    put16(b, w.word);
    put8(b, w.sec);
    put8(b, w.ter);
    put16(b, w.flags);
  }
  table(1, !expansions.empty());
  for (const Expansion &x : expansions) {
    put16(b, x.unit);
    put16(b, x.p1);
    put8(b, x.s1);
    put8(b, x.t1);
    put16(b, x.p2);
    put8(b, x.s2);
    put8(b, x.t2);
    put32(b, 0);
  }
  table(2, !combinations.empty());
  for (const Combination &c : combinations) {
    put16(b, c.u1);
    put16(b, c.u2);
    put16(b, c.word);
    put8(b, c.sec);
    put8(b, c.ter);
    put16(b, c.flags);
  }
  if (b.size() > 0xFFFF) {
    *err = "sort body of " + std::to_string(b.size()) + " bytes (" + std::to_string(weights.size()) + " weights, " + std::to_string(expansions.size()) + " expansions) exceeds a section";
    return false;
  }
  *out = std::move(b);
  return true;
}

}  // namespace mkdefs
