// The properties of one kind (integers, texts, relations) of a VPI object, by property number.
// The first few are kept inside the object: an object has a handful of properties at most, and a
// compiled design has many objects to build and destroy.
#pragma once

#include <array>
#include <cstddef>
#include <utility>
#include <vector>

template <class Value, std::size_t kInline>
class Hx_VpiProperties {
 public:
  // Null when `key` is not set.
  const Value* Find(int key) const { return Lookup(*this, key); }

  void Set(int key, Value value) {
    if (Value* current = Lookup(*this, key)) {
      *current = std::move(value);
    } else if (inlineCount_ < kInline) {
      inline_[inlineCount_++] = {key, std::move(value)};
    } else {
      more_.emplace_back(key, std::move(value));
    }
  }

  void Erase(int key) {
    for (std::size_t i = 0; i < inlineCount_; ++i) {
      if (inline_[i].first == key) {
        inline_[i] = std::move(inline_[--inlineCount_]);
        inline_[inlineCount_] = {};
        return;
      }
    }
    std::erase_if(more_, [key](const auto& entry) { return entry.first == key; });
  }

 private:
  // One search for both the const and the changing use.
  template <class Self>
  static auto Lookup(Self& self, int key) -> decltype(&self.inline_[0].second) {
    for (std::size_t i = 0; i < self.inlineCount_; ++i) {
      if (self.inline_[i].first == key) {
        return &self.inline_[i].second;
      }
    }
    for (auto& entry : self.more_) {
      if (entry.first == key) {
        return &entry.second;
      }
    }
    return nullptr;
  }

  std::array<std::pair<int, Value>, kInline> inline_{};
  std::size_t inlineCount_ = 0;
  std::vector<std::pair<int, Value>> more_;
};
