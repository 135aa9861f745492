#include <kelcore/proplist/PropListXMLHandler.h>

#include <kelcore/config/Errors.h>
#include <kelcore/utility/StringStreams.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <algorithm>
#include <string_view>

#include "ValueText.h"

namespace kelcore::proplist {
namespace {

using ValueKind = PropListXMLHandler::ValueKind;
using NameView = std::basic_string_view<UTF16Char>;

constexpr const char* kVersionGreaterThan =
    "$$$/kelcore/proplist/Error/PropListXMLHandler/VersionGreaterThan=Cannot read PropList data; "
    "version greater than expected.";
constexpr unsigned long kPropListComponent = 104;
constexpr long kVersionErrorNumber = 1;

// Compares a UTF-16 name with a 7-bit literal without building a string.
bool Is(const UTF16String& name, std::string_view literal) {
  return name.size() == literal.size() &&
         std::equal(literal.begin(), literal.end(), name.begin(),
                    [](char a, UTF16Char b) { return static_cast<UTF16Char>(a) == b; });
}

// What the element `name` with the given attributes holds when it is a value element:
// `recognised` tells whether it is one, and the kind is written only for a known kind
// (an int of another size leaves `kind` as it was).
template <class AttributeLookup>
bool RecogniseValue(const UTF16String& name, AttributeLookup attribute, ValueKind& kind) {
  if (name.empty()) return false;
  switch (name[0]) {
    case 'u':
      if (!Is(name, "ustring")) return false;
      kind = ValueKind::kUTF16Text;
      return true;
    case 's':
      if (!Is(name, "string")) return false;
      kind = ValueKind::kUTF8Text;
      return true;
    case 'f':
      if (Is(name, "float")) {
        kind = ValueKind::kFloat;
        return true;
      }
      if (!Is(name, "false")) return false;
      kind = ValueKind::kBoolFalse;
      return true;
    case 'd':
      if (!Is(name, "double")) return false;
      kind = ValueKind::kDouble;
      return true;
    case 't':
    case 'b':
      if (!Is(name, "true") && !Is(name, "bool")) return false;
      kind = ValueKind::kBoolTrue;
      return true;
    case 'i': {
      if (!Is(name, "int")) return false;
      const UTF16String* type = attribute("type");
      const UTF16String* size = attribute("size");
      if (type == nullptr || size == nullptr || type->empty() || size->empty()) return false;
      const bool isSigned = Is(*type, "signed");
      if (Is(*size, "16")) {
        kind = ValueKind::kUInt16;
      } else if (Is(*size, "32")) {
        kind = isSigned ? ValueKind::kInt32 : ValueKind::kUInt32;
      } else if (Is(*size, "64")) {
        kind = isSigned ? ValueKind::kInt64 : ValueKind::kUInt64;
      }
      return true;
    }
    default:
      return false;
  }
}

// Calls `store` with the list of values of `kind` read from `texts`.
template <class Store>
void WithArrayOf(ValueKind kind, const std::vector<UTF16String>& texts, UTF8String& scratch,
                 Store store) {
  const auto numbers = [&]<class T>(T*) {
    std::list<T> values;
    for (const UTF16String& text : texts) {
      AssignUTF8(text, scratch);
      values.push_back(ParseNumber<T>(scratch));
    }
    store(values);
  };
  switch (kind) {
    case ValueKind::kNone:
      return;
    case ValueKind::kUTF16Text:
      store(std::list<UTF16String>(texts.begin(), texts.end()));
      return;
    case ValueKind::kUTF8Text: {
      std::list<UTF8String> values;
      for (const UTF16String& text : texts) values.push_back(utility::UTF16to8(text));
      store(values);
      return;
    }
    case ValueKind::kBoolTrue:
    case ValueKind::kBoolFalse: {
      std::list<bool> values;
      for (const UTF16String& text : texts) values.push_back(Is(text, "true"));
      store(values);
      return;
    }
    case ValueKind::kFloat:
      return numbers(static_cast<float*>(nullptr));
    case ValueKind::kDouble:
      return numbers(static_cast<double*>(nullptr));
    case ValueKind::kUInt16:
      return numbers(static_cast<std::uint16_t*>(nullptr));
    case ValueKind::kUInt32:
      return numbers(static_cast<std::uint32_t*>(nullptr));
    case ValueKind::kInt32:
      return numbers(static_cast<std::int32_t*>(nullptr));
    case ValueKind::kInt64:
      return numbers(static_cast<std::int64_t*>(nullptr));
    case ValueKind::kUInt64:
      return numbers(static_cast<std::uint64_t*>(nullptr));
  }
}

// Calls `store` with an empty list of values of `kind`.
template <class Store>
void WithEmptyArrayOf(ValueKind kind, Store store) {
  switch (kind) {
    case ValueKind::kNone:
      return;
    case ValueKind::kUTF16Text:
      return store(std::list<UTF16String>());
    case ValueKind::kUTF8Text:
      return store(std::list<UTF8String>());
    case ValueKind::kBoolTrue:
    case ValueKind::kBoolFalse:
      return store(std::list<bool>());
    case ValueKind::kFloat:
      return store(std::list<float>());
    case ValueKind::kDouble:
      return store(std::list<double>());
    case ValueKind::kUInt16:
      return store(std::list<std::uint16_t>());
    case ValueKind::kUInt32:
      return store(std::list<std::uint32_t>());
    case ValueKind::kInt32:
      return store(std::list<std::int32_t>());
    case ValueKind::kInt64:
      return store(std::list<std::int64_t>());
    case ValueKind::kUInt64:
      return store(std::list<std::uint64_t>());
  }
}

}  // namespace

const char* PropListVersionRefused::what() const noexcept {
  return "property list version greater than expected";
}

PropListXMLHandler::PropListXMLHandler(PropList& target) : target_(&target) {}

PropListXMLHandler::~PropListXMLHandler() = default;

void PropListXMLHandler::StartElement(const UTF16String& name,
                                      const xml::AttributeMap& attributes) {
  OnStart(name, [&attributes](std::string_view attributeName) -> const UTF16String* {
    const auto found = attributes.find(UTF16String(attributeName.begin(), attributeName.end()));
    return found == attributes.end() ? nullptr : &found->second;
  });
}

void PropListXMLHandler::StartElementWithNamespace(const UTF16String& qualifiedName,
                                                   const UTF16String&, const UTF16String&,
                                                   const xml::AttributeVector& attributes) {
  OnStart(qualifiedName, [&attributes](std::string_view attributeName) -> const UTF16String* {
    for (const xml::Attribute& attribute : attributes) {
      if (Is(attribute.qualifiedName, attributeName)) return &attribute.value;
    }
    return nullptr;
  });
}

template <class AttributeLookup>
void PropListXMLHandler::OnStart(const UTF16String& name, AttributeLookup attribute) {
  if (Is(name, "prop.map")) {
    ReadVersion(attribute("version"));
  } else if (Is(name, "prop.list")) {
    if (openLists_.empty()) {
      openLists_.push_back(target_);
    } else {
      openLists_.push_back(current_->NewSubList(KeyUTF8()));
      keyText_.clear();
      collecting_ = Collecting::kIdle;
    }
    current_ = openLists_.back();
  } else if (Is(name, "key")) {
    collecting_ = Collecting::kKey;
  } else if (Is(name, "array")) {
    inArray_ = true;
  } else if (Is(name, "array.type")) {
    inArrayType_ = true;
  } else if (inArrayType_) {
    arrayTypeRecognised_ = RecogniseValue(name, attribute, arrayTypeKind_);
  } else if (RecogniseValue(name, attribute, valueKind_)) {
    collecting_ = Collecting::kValue;
  }
}

void PropListXMLHandler::ReadVersion(const UTF16String* version) {
  if (version == nullptr) return;
  AssignUTF8(*version, scratch_);
  std::uint16_t number = 0;
  utility::iUTF8StringStream stream(scratch_);
  stream >> number;
  if (number > PropList::GetCurrentVersion()) {
    config::ThrowError(config::kErrorLevelNonFatal, kVersionGreaterThan, kPropListComponent,
                       kVersionErrorNumber, true);
    // The error manager deferred the error: the data must still not be read.
    throw PropListVersionRefused();
  }
  target_->SetVersion(number);
}

void PropListXMLHandler::EndElement(const UTF16String& name) {
  if (Is(name, "prop.list")) {
    if (!openLists_.empty()) openLists_.pop_back();
    current_ = openLists_.empty() ? nullptr : openLists_.back();
  } else if (Is(name, "key")) {
    collecting_ = Collecting::kIdle;
  } else if (Is(name, "array")) {
    StoreArray();
    inArray_ = false;
    arrayTypeKind_ = ValueKind::kNone;
    arrayTypeRecognised_ = false;
    inArrayType_ = false;
    collecting_ = Collecting::kIdle;
  } else if (Is(name, "array.type")) {
    inArrayType_ = false;
  } else if (collecting_ == Collecting::kValue) {
    if (inArray_) {
      if (valueKind_ == ValueKind::kBoolTrue) {
        arrayTexts_.push_back(UTF16String(u"true"));
      } else if (valueKind_ == ValueKind::kBoolFalse) {
        arrayTexts_.push_back(UTF16String(u"false"));
      } else {
        arrayTexts_.push_back(valueText_);
        valueText_.clear();
      }
    } else {
      StoreScalar();
    }
    collecting_ = Collecting::kIdle;
  }
}

void PropListXMLHandler::EndElementWithNamespace(const UTF16String& qualifiedName,
                                                 const UTF16String&, const UTF16String&) {
  EndElement(qualifiedName);
}

void PropListXMLHandler::Characters(const UTF16String& text) {
  UTF16String* collected = collecting_ == Collecting::kKey     ? &keyText_
                           : collecting_ == Collecting::kValue ? &valueText_
                                                               : nullptr;
  if (collected == nullptr) return;
  const std::size_t nul = text.find(UTF16Char(0));
  collected->append(text, 0, nul);
}

void PropListXMLHandler::EndDocument() {}

const UTF8String& PropListXMLHandler::KeyUTF8() {
  AssignUTF8(keyText_, scratch_);
  return scratch_;
}

void PropListXMLHandler::StoreScalar() {
  if (valueKind_ == ValueKind::kNone || current_ == nullptr) return;
  const UTF8String& key = KeyUTF8();
  switch (valueKind_) {
    case ValueKind::kNone:
      break;
    case ValueKind::kUTF16Text:
      current_->SetValue(key, valueText_);
      break;
    case ValueKind::kUTF8Text:
      current_->SetValue(key, utility::UTF16to8(valueText_));
      break;
    case ValueKind::kBoolTrue:
      current_->SetValue(key, true);
      break;
    case ValueKind::kBoolFalse:
      current_->SetValue(key, false);
      break;
    default: {
      AssignUTF8(valueText_, number_);
      switch (valueKind_) {
        case ValueKind::kFloat:
          current_->SetValue(key, ParseNumber<float>(number_));
          break;
        case ValueKind::kDouble:
          current_->SetValue(key, ParseNumber<double>(number_));
          break;
        case ValueKind::kUInt16:
          current_->SetValue(key, ParseNumber<std::uint16_t>(number_));
          break;
        case ValueKind::kUInt32:
          current_->SetValue(key, ParseNumber<std::uint32_t>(number_));
          break;
        case ValueKind::kInt32:
          current_->SetValue(key, ParseNumber<std::int32_t>(number_));
          break;
        case ValueKind::kInt64:
          current_->SetValue(key, ParseNumber<std::int64_t>(number_));
          break;
        default:
          current_->SetValue(key, ParseNumber<std::uint64_t>(number_));
          break;
      }
    }
  }
  keyText_.clear();
  valueText_.clear();
}

void PropListXMLHandler::StoreArray() {
  if (current_ == nullptr) return;
  const UTF8String& key = KeyUTF8();
  const auto store = [this, &key](const auto& values) { current_->SetValue(key, values); };
  if (!arrayTexts_.empty()) {
    WithArrayOf(valueKind_, arrayTexts_, number_, store);
  } else if (arrayTypeRecognised_) {
    WithEmptyArrayOf(arrayTypeKind_, store);
  }
  keyText_.clear();
  valueText_.clear();
  arrayTexts_.clear();
}

}  // namespace kelcore::proplist
