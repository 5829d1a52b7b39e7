// A small dictionary of key-string translations that the host offers a module
// through one of its three translation routes: the KeyString and KeyString
// Dictionary suites together, the utilities suite, or the SwiftView suite.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>

#include "standin/suites.h"

namespace Standin {

enum class TranslationRoute { KeyStringSuites, Utilities, SwiftView };

class KeyStringDictionary {
 public:
  KeyStringDictionary() = default;
  ~KeyStringDictionary();
  KeyStringDictionary(const KeyStringDictionary&) = delete;
  KeyStringDictionary& operator=(const KeyStringDictionary&) = delete;

  // Whole key strings ("$$$/Key=Default") and what they translate to.
  void Add(const std::string& keyString, const std::u16string& translation);

  // Offers the suites of the route in the registry of a host; a registry serves
  // one dictionary at a time.
  void OfferThrough(SuiteRegistry& suites, TranslationRoute route);

  // Key strings the module asked about, found or not.
  int32_t Lookups() const { return lookups_; }
  // Translated-string objects handed out by the dictionary suite and not yet
  // released.
  int32_t LiveObjects() const { return static_cast<int32_t>(objects_.size()); }

 private:
  friend struct DictionaryProcs;

  std::map<std::string, std::u16string> entries_;
  std::map<void*, std::unique_ptr<std::u16string>> objects_;
  int32_t lookups_ = 0;
  SuiteRegistry* registry_ = nullptr;
};

}  // namespace Standin
