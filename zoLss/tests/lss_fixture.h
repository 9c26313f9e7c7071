#pragma once
// Helpers shared by the zoLss tests: a store over a FaultDisk, committing from a model, and
// reading a whole store back into a model.
#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <set>
#include <string>

#include "fault_file.h"
#include "log_store.h"
#include "zoLss/lss.h"

namespace norv {

using Model = std::map<std::uint64_t, std::string>;  // Seid value -> bytes

inline void WriteElement(ILssTransaction* txn, Seid seid, const std::string& bytes) {
  ICloseableOutputStream* s = txn->WriteSerialElement(seid);
  s->WriteStream(bytes.data(), static_cast<ssize_t>(bytes.size()));
  s->Close();
}

// The bytes of `seid`, or "<none>" when it does not exist.
inline std::string ReadElement(ILogStructuredStore* lss, Seid seid) {
  IContiguousSerialElement* e = lss->OpenSerialElement(seid);
  if (e == nullptr) return "<none>";
  auto [p, n] = e->GetBuffer();
  std::string r(static_cast<const char*>(p), static_cast<std::size_t>(n));
  e->Close();
  return r;
}

// Reads back every id of `ids`; returns the present ones.
template <class Ids>
Model ReadAll(ILogStructuredStore* lss, const Ids& ids) {
  Model m;
  for (std::uint64_t v : ids) {
    std::string b = ReadElement(lss, Seid::FromValue(v));
    if (b != "<none>") m[v] = b;
  }
  return m;
}

inline LssSettings TestSettings() {
  LssSettings s;
  s.flushTimeMilliSec = 1000000;  // only explicit flushes sync, so crash images are exact
  return s;
}

inline ILogStructuredStore* OpenOnDisk(const std::shared_ptr<FaultDisk>& disk,
                                       bool readOnly = false) {
  bool created = false;
  return OpenLssOnFile(std::make_unique<FaultFile>(disk), readOnly, false, TestSettings(), created);
}

inline std::shared_ptr<FaultDisk> DiskWith(const std::string& image) {
  auto d = std::make_shared<FaultDisk>();
  d->current = image;
  d->durable = image;
  return d;
}

}  // namespace norv
