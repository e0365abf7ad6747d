// The fields of a teaming policy, described once: every reader and writer
// of a policy (the stored form, the trace, the dump, `tarnhost show`)
// visits them through VisitTeamingFields in declaration order.
//
// A visitor has
//   void Number(const char* key, T& value)        for each integer field
//   void Names(const char* key, std::vector<std::string>& value)
//   void Group(const char* key, F visitInside)     for linkCriteria; calls
//                                                  visitInside(visitor)
// and is called with const or non-const policies alike.
//
// ReadTeamingPolicy reads the fields out of a JSON object; each JSON
// library it reads from gives it a node (below), so the rules a policy's
// text is held to and the words of each refusal are the same whichever
// library parsed it.
#pragma once

#include <cstdint>
#include <limits>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "hostctl/records.h"

namespace TarnCtl::Store {

enum class PolicyForm {
  kStored,  // zero fields left out; unknown keys ignored when reading
  kFull,    // every field present; no other key when reading
};

template <typename Policy, typename Visitor>
requires std::is_same_v<std::remove_const_t<Policy>, HostCtl::Network::NicTeamingPolicy>
void VisitTeamingFields(Policy& policy, Visitor& visitor) {
  visitor.Number("flags", policy.flags);
  visitor.Number("balancing", policy.balancing);
  visitor.Number("failback", policy.failback);
  visitor.Group("linkCriteria", [&](auto& inside) {
    auto& criteria = policy.linkCriteria;
    inside.Number("checkMask", criteria.checkMask);
    inside.Number("minSpeed", criteria.minSpeed);
    inside.Number("errorPercent", criteria.errorPercent);
    inside.Number("fullDuplex", criteria.fullDuplex);
  });
  visitor.Names("uplinkOrder", policy.uplinkOrder);
  visitor.Number("maxActive", policy.maxActive);
}

// Reads the fields of a policy from a JSON value through `Node`, a value
// of one JSON library, default-constructed as an empty object, with
//   bool Object(size_t& fields)                whether it is an object; its size
//   bool Field(const char* key, Node& field)   false when the key is absent
//   bool Int64(int64_t&), bool Uint64(uint64_t&)  false when not one
//   bool Names(std::vector<std::string>&)      false when not a list of names
//   [[noreturn]] void Fail(const std::string& why)
template <typename Node>
class TeamingReader {
 public:
  // `where` names the group being read ("linkCriteria."), for refusals.
  TeamingReader(Node node, PolicyForm form, std::string where = "")
      : node_(std::move(node)), form_(form), where_(std::move(where)) {
    if (!node_.Object(fields_)) Fail("must be an object");
  }

  template <typename T>
  void Number(const char* key, T& value) {
    value = 0;
    Node field;
    if (!Find(key, field)) return;
    bool fits = false;
    if constexpr (std::is_signed_v<T>) {
      int64_t number = 0;
      fits = field.Int64(number) && number >= std::numeric_limits<T>::min() &&
             number <= std::numeric_limits<T>::max();
      value = static_cast<T>(number);
    } else {
      uint64_t number = 0;
      fits = field.Uint64(number) && number <= std::numeric_limits<T>::max();
      value = static_cast<T>(number);
    }
    if (!fits) {
      Fail(std::string(key) + " must be an integer from " +
           std::to_string(std::numeric_limits<T>::min()) + " to " +
           std::to_string(std::numeric_limits<T>::max()));
    }
  }
  void Names(const char* key, std::vector<std::string>& names) {
    names.clear();
    Node field;
    if (Find(key, field) && !field.Names(names))
      Fail(std::string(key) + " must be an array of names");
  }
  template <typename Inside>
  void Group(const char* key, Inside inside) {
    Node field;
    Find(key, field);
    TeamingReader reader(std::move(field), form_, where_ + key + ".");
    inside(reader);
    reader.Finish();
  }

  // After the visit: in the full form, the object holds no other key.
  void Finish() {
    if (form_ == PolicyForm::kFull && fields_ != asked_) {
      Fail("holds a key that is not a field, or one twice");
    }
  }

 private:
  bool Find(const char* key, Node& field) {
    ++asked_;
    if (node_.Field(key, field)) return true;
    if (form_ == PolicyForm::kFull) Fail(std::string(key) + " is missing");
    return false;
  }
  [[noreturn]] void Fail(const std::string& why) { node_.Fail(where_ + why); }

  Node node_;
  PolicyForm form_;
  std::string where_;
  size_t fields_ = 0;
  size_t asked_ = 0;
};

template <typename Node>
HostCtl::Network::NicTeamingPolicy ReadTeamingPolicy(Node node, PolicyForm form) {
  HostCtl::Network::NicTeamingPolicy policy;
  TeamingReader<Node> reader(std::move(node), form);
  VisitTeamingFields(policy, reader);
  reader.Finish();
  return policy;
}

}  // namespace TarnCtl::Store
