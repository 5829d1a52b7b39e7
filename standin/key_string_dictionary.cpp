// The host's key-string dictionary and the translation suites over it.
#include "standin/key_string_dictionary.h"

#include <algorithm>
#include <cstring>
#include <vector>

#include "standin/host.h"

namespace Standin {
namespace {

// Which dictionary serves the suites of which host's registry.
std::map<const SuiteRegistry*, KeyStringDictionary*>& Served() {
  static std::map<const SuiteRegistry*, KeyStringDictionary*> served;
  return served;
}

template <typename Proc>
void* Address(Proc proc) {
  return reinterpret_cast<void*>(proc);
}

// A procedure list with `proc` at `position` (from 1) and nothing elsewhere.
std::vector<void*> ListWith(int position, void* proc) {
  std::vector<void*> list(static_cast<size_t>(position), nullptr);
  list[static_cast<size_t>(position - 1)] = proc;
  return list;
}

}  // namespace

struct DictionaryProcs {
  static KeyStringDictionary* Serving() {
    Host* host = Host::Current();
    if (host == nullptr) return nullptr;
    const auto found = Served().find(&host->Suites());
    return found == Served().end() ? nullptr : found->second;
  }

  static const std::u16string* Find(KeyStringDictionary& dictionary, const std::string& key) {
    ++dictionary.lookups_;
    const auto found = dictionary.entries_.find(key);
    return found == dictionary.entries_.end() ? nullptr : &found->second;
  }

  // Dictionary suite, 3: looks a whole key string up; an object on success.
  static int32_t Lookup(void* /*pluginRef*/, const char* keyString, void** object) {
    KeyStringDictionary* dictionary = Serving();
    if (dictionary == nullptr || keyString == nullptr || object == nullptr) return -1;
    const std::u16string* text = Find(*dictionary, keyString);
    if (text == nullptr) return -1;
    auto copy = std::make_unique<std::u16string>(*text);
    *object = copy.get();
    dictionary->objects_.emplace(copy.get(), std::move(copy));
    return 0;
  }

  static std::u16string* Object(void* object) {
    KeyStringDictionary* dictionary = Serving();
    if (dictionary == nullptr) return nullptr;
    const auto found = dictionary->objects_.find(object);
    return found == dictionary->objects_.end() ? nullptr : found->second.get();
  }

  // KeyString suite, 14: releases an object.
  static void Release(void* object) {
    if (KeyStringDictionary* dictionary = Serving()) dictionary->objects_.erase(object);
  }

  // KeyString suite, 18: length in 16-bit units with the terminator.
  static uint32_t Length(void* object) {
    const std::u16string* text = Object(object);
    return text == nullptr ? 0 : static_cast<uint32_t>(text->size() + 1);
  }

  // KeyString suite, 19: the text and its terminator, at most `units` units.
  static int32_t GetUtf16(void* object, uint16_t* buffer, uint32_t units, uint32_t /*flags*/) {
    const std::u16string* text = Object(object);
    if (text == nullptr || buffer == nullptr || units < text->size() + 1) return -1;
    std::copy(text->begin(), text->end(), buffer);
    buffer[text->size()] = 0;
    return 0;
  }

  // Utilities suite, 5, and SwiftView suite, 17: translates a length-prefixed
  // key string into `buffer`; the count includes the terminator. An unknown key
  // comes back as its default text, as written.
  static int32_t Translate(const uint8_t* key, int32_t capacity, uint16_t* buffer) {
    KeyStringDictionary* dictionary = Serving();
    if (dictionary == nullptr || key == nullptr || buffer == nullptr || capacity < 1) return 0;
    const std::string keyString(reinterpret_cast<const char*>(key + 1), key[0]);
    const std::u16string* found = Find(*dictionary, keyString);
    std::u16string text;
    if (found != nullptr) {
      text = *found;
    } else if (const size_t equals = keyString.find('=', 3); equals != std::string::npos) {
      text.assign(keyString.begin() + static_cast<std::ptrdiff_t>(equals) + 1, keyString.end());
    }
    const auto units = std::min<size_t>(text.size(), static_cast<size_t>(capacity - 1));
    std::copy_n(text.begin(), units, buffer);
    buffer[units] = 0;
    return static_cast<int32_t>(units + 1);
  }
};

KeyStringDictionary::~KeyStringDictionary() {
  if (registry_ != nullptr) Served().erase(registry_);
}

void KeyStringDictionary::Add(const std::string& keyString, const std::u16string& translation) {
  entries_[keyString] = translation;
}

void KeyStringDictionary::OfferThrough(SuiteRegistry& suites, TranslationRoute route) {
  if (registry_ != nullptr) Served().erase(registry_);
  registry_ = &suites;
  Served()[registry_] = this;
  switch (route) {
    case TranslationRoute::KeyStringSuites: {
      std::vector<void*> keyString(19, nullptr);
      keyString[13] = Address(&DictionaryProcs::Release);
      keyString[17] = Address(&DictionaryProcs::Length);
      keyString[18] = Address(&DictionaryProcs::GetUtf16);
      suites.Offer("HS KeyString Suite", 1, keyString);
      suites.Offer("HS KeyString Dictionary Suite", 1,
                   ListWith(3, Address(&DictionaryProcs::Lookup)));
      break;
    }
    case TranslationRoute::Utilities:
      suites.Offer("Rastrix Utilities Suite for Plug-ins", 1,
                   ListWith(5, Address(&DictionaryProcs::Translate)));
      break;
    case TranslationRoute::SwiftView:
      suites.Offer("OS Direct SwiftView Suite", 3,
                   ListWith(17, Address(&DictionaryProcs::Translate)));
      break;
  }
}

}  // namespace Standin
