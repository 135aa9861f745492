// PropList: a typed key-value tree for settings and document state.
//
// Each key, a UTF-8 string, names exactly one value of one of the types of
// PropListPropertyType: a string (UTF16String or UTF8String), a bool, a fixed-width
// integer (unsigned 16, unsigned 32, signed 32, signed 64 or unsigned 64 bits), a float,
// a double, an array of one of those, or a nested PropList. Integer widths are the
// widths of the stored data and of its file format on every platform, which is why the
// signatures use the <cstdint> types: SetValue(key, 5) stores a signed 32-bit value,
// SetValue(key, 5u) an unsigned 32-bit one, and a long long (distinct from std::int64_t
// on LP64 systems) must be cast to the width meant; nothing is ever narrowed silently.
//
// Keys. A key is its bytes up to its first NUL (a key holding a NUL is cut there, on
// every operation). Keys are compared byte for byte: no case folding, no normalisation,
// no paths ("a/b" is one key). The entries are ordered by unsigned byte value, so B, a
// and A are listed A, B, a. The empty key is a key like any other.
//
// Values. GetValue returns true only when the entry exists and holds exactly the
// requested type; there is no conversion between types (an int32 is not returned as an
// int64, a UTF8String not as a UTF16String). A miss or a type mismatch returns false and
// leaves the output untouched. The one exception: GetValue(key, double&) on a list of
// version 1 also reads a UTF16String value, as text holding a number, because data of
// that format version stored numbers as text; it returns true even when the text holds
// no number, leaving the output as a classic-locale stream extraction leaves it (0 for
// text that is not a number, unchanged for empty text). Array getters append to the
// caller's list without clearing it. SetValue overwrites a value of the same type in
// place, and otherwise replaces whatever the key held, a nested list included, with a
// new value of the given type; it never fails except by running out of memory.
//
// Ownership. The list owns its values and copies deeply: a copy (copy constructor,
// assignment) shares nothing with its source, nested lists and arrays included. Pointers
// returned by GetSubList and NewSubList do not own; they stay valid until that entry is
// removed or replaced, or the list holding it is cleared, assigned to or destroyed.
//
// Errors. No operation raises an error of its own; absent keys and type mismatches
// give false, null or kPropTypeNone. Memory exhaustion throws std::bad_alloc.
//
// Threads. A PropList is a plain value with no locking: any number of threads may call
// the const operations on one list at the same time, but any modification must not
// overlap with any other use of that list (or of a list nested in it).
//
// Equality. Two lists are equal when they hold the same keys with values of the same
// types and equal values, nested lists compared the same way. Floats and doubles
// compare by bit pattern: a NaN equals a NaN of the same bits, and 0.0 differs from
// -0.0, so equality means "stores and writes the same data". The version is not
// compared (a nested list carries no version of its own in the file format).
//
// Versions. GetVersion is the format version of the data held: 4 (GetCurrentVersion)
// for a new list and for every list made by NewSubList; the XML reader sets it from the
// file it reads. Copies take their source's version; Clear keeps it.
//
// The order of the virtual functions below is part of the interface and must not change.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/proplist/PropListPropertyType.h>
#include <kelcore/proplist/PropNodeBase.h>
#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <cstdint>
#include <iterator>
#include <list>
#include <map>
#include <memory>
#include <string_view>

namespace kelcore::proplist {

class KELCORE_API PropList {
  using KeyView = std::basic_string_view<unsigned char, UTF8CharTraits>;
  struct KeyLess {
    using is_transparent = void;
    bool operator()(KeyView a, KeyView b) const noexcept { return a < b; }
  };
  using Entries = std::map<UTF8String, std::unique_ptr<PropNodeBase>, KeyLess>;

 public:
  // One entry as the iteration shows it; `key` stays valid while the entry exists.
  struct Property {
    const UTF8String& key;
    PropListPropertyType type;
  };
  class const_iterator;

  // An empty list of version GetCurrentVersion().
  PropList();
  // A deep copy: the same version, and a copy of every entry.
  PropList(const PropList& other);
  // Takes `other`'s entries and version; `other` is left empty, of version 4.
  PropList(PropList&& other) noexcept;
  // Copy-and-swap: assigning from an lvalue is a deep copy, from an rvalue a move.
  PropList& operator=(PropList other) noexcept;

  virtual ~PropList();

  virtual bool GetValue(const UTF8String& key, std::list<double>& value) const;
  virtual bool GetValue(const UTF8String& key, double& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<float>& value) const;
  virtual bool GetValue(const UTF8String& key, float& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<std::uint64_t>& value) const;
  virtual bool GetValue(const UTF8String& key, std::uint64_t& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<std::int64_t>& value) const;
  virtual bool GetValue(const UTF8String& key, std::int64_t& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<std::int32_t>& value) const;
  virtual bool GetValue(const UTF8String& key, std::int32_t& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<std::uint32_t>& value) const;
  virtual bool GetValue(const UTF8String& key, std::uint32_t& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<std::uint16_t>& value) const;
  virtual bool GetValue(const UTF8String& key, std::uint16_t& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<bool>& value) const;
  virtual bool GetValue(const UTF8String& key, bool& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<UTF8String>& value) const;
  virtual bool GetValue(const UTF8String& key, UTF8String& value) const;
  virtual bool GetValue(const UTF8String& key, std::list<UTF16String>& value) const;
  virtual bool GetValue(const UTF8String& key, UTF16String& value) const;

  virtual void SetValue(const UTF8String& key, const std::list<double>& value);
  virtual void SetValue(const UTF8String& key, const double& value);
  virtual void SetValue(const UTF8String& key, const std::list<float>& value);
  virtual void SetValue(const UTF8String& key, const float& value);
  virtual void SetValue(const UTF8String& key, const std::list<std::uint64_t>& value);
  virtual void SetValue(const UTF8String& key, const std::uint64_t& value);
  virtual void SetValue(const UTF8String& key, const std::list<std::int64_t>& value);
  virtual void SetValue(const UTF8String& key, const std::int64_t& value);
  virtual void SetValue(const UTF8String& key, const std::list<std::int32_t>& value);
  virtual void SetValue(const UTF8String& key, const std::int32_t& value);
  virtual void SetValue(const UTF8String& key, const std::list<std::uint32_t>& value);
  virtual void SetValue(const UTF8String& key, const std::uint32_t& value);
  virtual void SetValue(const UTF8String& key, const std::list<std::uint16_t>& value);
  virtual void SetValue(const UTF8String& key, const std::uint16_t& value);
  virtual void SetValue(const UTF8String& key, const std::list<bool>& value);
  virtual void SetValue(const UTF8String& key, const bool& value);
  virtual void SetValue(const UTF8String& key, const std::list<UTF8String>& value);
  virtual void SetValue(const UTF8String& key, const UTF8String& value);
  virtual void SetValue(const UTF8String& key, const std::list<UTF16String>& value);
  virtual void SetValue(const UTF8String& key, const UTF16String& value);

  // The nested list stored under `key`, or null when the key is absent or holds another
  // type. The pointer form takes a NUL-terminated key; a null `key` gives null.
  virtual const PropList* GetSubList(const UTF8String& key) const;
  virtual const PropList* GetSubList(const unsigned char* key) const;
  // The nested list under `key`, kept as it is when there is one; otherwise a new empty
  // list of version 4 stored under `key`, replacing a value of another type. The parent
  // owns it.
  virtual PropList* NewSubList(const UTF8String& key);
  // Removes every entry; the version is kept.
  virtual void Clear();
  // Appends the list's XML fragment, "<prop.list>\n" ... "</prop.list>\n", one
  // "<prop.pair>" per entry in key order. Keys and texts are escaped for XML.
  virtual void OutputAsXMLFragment(UTF8String& out) const;
  // Clears `names`, then appends every key in key order.
  virtual void GetPropertyNames(std::list<UTF8String>& names) const;
  // The type of the value under `key`, or kPropTypeNone when there is none.
  virtual PropListPropertyType GetPropertyType(const UTF8String& key) const;

  // A pointer would otherwise convert to bool and store true: SetValue(key, "text") must
  // not compile. Strings are passed as UTF8String or UTF16String.
  template <class T>
  void SetValue(const UTF8String& key, T* value) = delete;

  // The same nested list as the const forms (and through them, so an override of those
  // is honoured), for modification.
  PropList* GetSubList(const UTF8String& key) {
    return const_cast<PropList*>(static_cast<const PropList*>(this)->GetSubList(key));
  }
  PropList* GetSubList(const unsigned char* key) {
    return const_cast<PropList*>(static_cast<const PropList*>(this)->GetSubList(key));
  }

  std::uint16_t GetVersion() const { return version_; }
  // Sets the format version of the data held; the XML reader calls it with the version
  // of the file it reads.
  void SetVersion(std::uint16_t version) { version_ = version; }
  static std::uint16_t GetCurrentVersion() { return 4; }

  bool IsEmpty() const { return entries_.empty(); }
  std::size_t GetPropertyCount() const { return entries_.size(); }
  // Removes the entry under `key`; false when there was none.
  bool RemoveValue(const UTF8String& key);

  // Iteration over the entries in key order. Any modification of the list invalidates
  // iterators to removed or replaced entries only, as for std::map.
  const_iterator begin() const;
  const_iterator end() const;

  bool operator==(const PropList& other) const;

  void swap(PropList& other) noexcept;
  friend void swap(PropList& a, PropList& b) noexcept { a.swap(b); }

 private:
  static KeyView KeyOf(const UTF8String& key);
  const PropNodeBase* FindNode(KeyView key) const;
  // Stores `node` under `key`, replacing the entry's node when the key exists.
  void Store(KeyView key, std::unique_ptr<PropNodeBase> node);
  // GetValue and SetValue for one value type; defined where the node classes are known.
  template <class Value>
  bool GetTyped(const UTF8String& key, Value& value) const;
  template <class Value>
  void SetTyped(const UTF8String& key, const Value& value);

  Entries entries_;
  std::uint16_t version_;
};

class PropList::const_iterator {
 public:
  using iterator_concept = std::forward_iterator_tag;
  using iterator_category = std::input_iterator_tag;
  using value_type = Property;
  using reference = Property;
  using difference_type = std::ptrdiff_t;

  const_iterator() = default;

  Property operator*() const { return Property{it_->first, it_->second->GetType()}; }
  const_iterator& operator++() {
    ++it_;
    return *this;
  }
  const_iterator operator++(int) {
    const_iterator before = *this;
    ++it_;
    return before;
  }
  bool operator==(const const_iterator& other) const { return it_ == other.it_; }

 private:
  friend class PropList;
  explicit const_iterator(Entries::const_iterator it) : it_(it) {}

  Entries::const_iterator it_;
};

inline PropList::const_iterator PropList::begin() const {
  return const_iterator(entries_.begin());
}
inline PropList::const_iterator PropList::end() const {
  return const_iterator(entries_.end());
}

}  // namespace kelcore::proplist
