#include <kelcore/proplist/PropList.h>

#include "PropListArrayNode.h"
#include "PropListNode.h"
#include "PropNodeEquality.h"
#include "ValuePropNode.h"
#include "XMLValueElements.h"

#include <kelcore/utility/StringStreams.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <algorithm>
#include <iterator>
#include <utility>

namespace kelcore::proplist {
namespace {

static_assert(std::forward_iterator<PropList::const_iterator>);

// The node class that holds a value of type Value: a ValuePropNode for a single value,
// a PropListArrayNode over them for a list.
template <class Value>
struct NodeClassFor {
  using type = ValuePropNode<Value>;
};
template <class Element>
struct NodeClassFor<std::list<Element>> {
  using type = PropListArrayNode<ValuePropNode<Element>>;
};
template <class Value>
using NodeClassOf = typename NodeClassFor<Value>::type;

}  // namespace

PropList::PropList() : version_(GetCurrentVersion()) {}

PropList::PropList(const PropList& other) : version_(other.version_) {
  for (const auto& [key, node] : other.entries_) {
    entries_.emplace_hint(entries_.end(), key, node->Clone());
  }
}

PropList::PropList(PropList&& other) noexcept : version_(GetCurrentVersion()) {
  swap(other);
}

PropList& PropList::operator=(PropList other) noexcept {
  swap(other);
  return *this;
}

PropList::~PropList() = default;

void PropList::swap(PropList& other) noexcept {
  entries_.swap(other.entries_);
  std::swap(version_, other.version_);
}

PropList::KeyView PropList::KeyOf(const UTF8String& key) {
  const std::size_t nul = key.find(static_cast<unsigned char>(0));
  return KeyView(key.data(), nul == UTF8String::npos ? key.size() : nul);
}

const PropNodeBase* PropList::FindNode(KeyView key) const {
  const auto found = entries_.find(key);
  return found == entries_.end() ? nullptr : found->second.get();
}

void PropList::Store(KeyView key, std::unique_ptr<PropNodeBase> node) {
  // A list read from a document receives its keys in order: look at the end first.
  const auto place = entries_.empty() || KeyView(entries_.rbegin()->first) < key
                         ? entries_.end()
                         : entries_.lower_bound(key);
  if (place != entries_.end() && KeyView(place->first) == key) {
    place->second = std::move(node);
  } else {
    entries_.emplace_hint(place, UTF8String(key), std::move(node));
  }
}

template <class Value>
bool PropList::GetTyped(const UTF8String& key, Value& value) const {
  using Node = NodeClassOf<Value>;
  const PropNodeBase* node = FindNode(KeyOf(key));
  if (node == nullptr || node->GetType() != Node::kType) return false;
  static_cast<const Node*>(node)->Get(value);
  return true;
}

template <class Value>
void PropList::SetTyped(const UTF8String& key, const Value& value) {
  using Node = NodeClassOf<Value>;
  const KeyView name = KeyOf(key);
  // A new key after all others (a list read from a document) needs no search.
  if (!entries_.empty() && KeyView(entries_.rbegin()->first) < name) {
    entries_.emplace_hint(entries_.end(), UTF8String(name), std::make_unique<Node>(value));
    return;
  }
  if (PropNodeBase* node = const_cast<PropNodeBase*>(FindNode(name));
      node != nullptr && node->GetType() == Node::kType) {
    static_cast<Node*>(node)->Set(value);
    return;
  }
  // The new node is made before the old one goes, so `value` may live inside it.
  Store(name, std::make_unique<Node>(value));
}

bool PropList::GetValue(const UTF8String& key, std::list<double>& value) const {
  return GetTyped(key, value);
}

// Format version 1 stored numbers as text, so its lists answer a double from a
// UTF16String value too.
bool PropList::GetValue(const UTF8String& key, double& value) const {
  if (GetTyped(key, value)) return true;
  if (version_ != 1) return false;
  const PropNodeBase* node = FindNode(KeyOf(key));
  if (node == nullptr || node->GetType() != kPropTypeUnicodeString) return false;
  utility::iUTF8StringStream text(
      utility::UTF16to8(static_cast<const UnicodeStringPropNode*>(node)->Value()));
  text >> value;
  return true;
}

bool PropList::GetValue(const UTF8String& key, std::list<float>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, float& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<std::uint64_t>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::uint64_t& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<std::int64_t>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::int64_t& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<std::int32_t>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::int32_t& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<std::uint32_t>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::uint32_t& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<std::uint16_t>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::uint16_t& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<bool>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, bool& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<UTF8String>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, UTF8String& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, std::list<UTF16String>& value) const {
  return GetTyped(key, value);
}
bool PropList::GetValue(const UTF8String& key, UTF16String& value) const {
  return GetTyped(key, value);
}

void PropList::SetValue(const UTF8String& key, const std::list<double>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const double& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<float>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const float& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<std::uint64_t>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::uint64_t& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<std::int64_t>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::int64_t& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<std::int32_t>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::int32_t& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<std::uint32_t>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::uint32_t& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<std::uint16_t>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::uint16_t& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<bool>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const bool& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<UTF8String>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const UTF8String& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const std::list<UTF16String>& value) {
  SetTyped(key, value);
}
void PropList::SetValue(const UTF8String& key, const UTF16String& value) {
  SetTyped(key, value);
}

const PropList* PropList::GetSubList(const UTF8String& key) const {
  const PropNodeBase* node = FindNode(KeyOf(key));
  if (node == nullptr || node->GetType() != PropListNode::kType) return nullptr;
  return &static_cast<const PropListNode*>(node)->List();
}

const PropList* PropList::GetSubList(const unsigned char* key) const {
  if (key == nullptr) return nullptr;
  const PropNodeBase* node = FindNode(KeyView(key));
  if (node == nullptr || node->GetType() != PropListNode::kType) return nullptr;
  return &static_cast<const PropListNode*>(node)->List();
}

PropList* PropList::NewSubList(const UTF8String& key) {
  if (PropList* existing = GetSubList(key)) return existing;
  auto node = std::make_unique<PropListNode>();
  PropList* created = &node->List();
  Store(KeyOf(key), std::move(node));
  return created;
}

void PropList::Clear() {
  entries_.clear();
}

void PropList::OutputAsXMLFragment(UTF8String& out) const {
  AppendAscii("<prop.list>\n", out);
  for (const auto& [key, node] : entries_) {
    AppendAscii("<prop.pair>\n<key>", out);
    AppendEscaped(key, out);
    AppendAscii("</key>\n", out);
    node->OutputAsXML(out);
    AppendAscii("</prop.pair>\n", out);
  }
  AppendAscii("</prop.list>\n", out);
}

void PropList::GetPropertyNames(std::list<UTF8String>& names) const {
  names.clear();
  for (const auto& entry : entries_) names.push_back(entry.first);
}

PropListPropertyType PropList::GetPropertyType(const UTF8String& key) const {
  const PropNodeBase* node = FindNode(KeyOf(key));
  return node == nullptr ? kPropTypeNone : node->GetType();
}

bool PropList::RemoveValue(const UTF8String& key) {
  const auto found = entries_.find(KeyOf(key));
  if (found == entries_.end()) return false;
  entries_.erase(found);
  return true;
}

bool PropList::operator==(const PropList& other) const {
  return std::equal(entries_.begin(), entries_.end(), other.entries_.begin(), other.entries_.end(),
                    [](const auto& a, const auto& b) {
                      return a.first == b.first && NodesEqual(*a.second, *b.second);
                    });
}

}  // namespace kelcore::proplist
