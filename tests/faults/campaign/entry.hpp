// SPDX-License-Identifier: Apache-2.0
// Functions of the interface as data: what a campaign has to know to call any of them with any arguments.
#pragma once

#include <lexaro/nls1.h>

#include <string>
#include <type_traits>
#include <vector>

namespace lx::test {

union Value {
  int64_t number;
  double real;
  void* pointer;
};

/*
 * A parameter is described by a letter, "?" where null is an argument like others, and ":" with its good value:
 *
 *   L  the page's locale          t  text (:its characters)      b  room (:so many units, if its size is not passed)
 *   Y  another locale             a  text and a zero behind it   r  size of the room before it
 *   l  a locale of this call's    n  its length                  D  terminated text with room behind it
 *   P  the page  Q  another page  x  its length in characters    B  pointer to a pointer to a room
 *   G  its language, W its sort   N  pointer to its length       R  pointer to the size of it
 *   M  the object manager         T  pointer to a pointer to it  v  number that is read or written (:before)
 *   F  an open file               u  its end                     e  the same, optional  q  optional status
 *   V  a conversion               z  terminated ASCII text       w  time
 *   S  a stream (:r :w :u)        y  terminated text of the page o  options  i  number  I  item  k  constant
 *   K  a catalog (:l loaded)      c  one character               h  shift state  d  floating point
 *
 * "-" behind the letter: the call takes the handle, fills the room to its end, is bound to the shift state. Behind
 * ">": the result is a status (s), or a handle or block (A) that the caller has to release.
 */
struct Role {
  char letter = 0;
  bool optional = false;
  bool bound = false;
  std::string value;
};

// What a parameter points at, perhaps through a pointer.
struct Target {
  size_t unit;
  bool indirect;
};

struct Entry {
  std::string name;
  char result;
  std::vector<Role> roles;
  std::vector<Target> targets;
  Value (*call)(const Value* arguments);

  bool gives_handle() const { return result < 'a'; }
  bool has(char letter) const;
};

template <class T>
constexpr Target target_of() {
  using Pointee = std::remove_pointer_t<T>;
  if constexpr (std::is_pointer_v<Pointee>) return {target_of<Pointee>().unit, true};
  if constexpr (std::is_object_v<Pointee> && requires { sizeof(Pointee); }) return {sizeof(Pointee), false};
  return {1, false};
}

template <class T>
T value_as(const Value& value) {
  if constexpr (std::is_pointer_v<T>) return reinterpret_cast<T>(value.pointer);
  if constexpr (std::is_floating_point_v<T>) return value.real;
  if constexpr (std::is_integral_v<T>) return static_cast<T>(value.number);
}

inline Value value_of(const void* result) { return {.pointer = const_cast<void*>(result)}; }
inline Value value_of(double result) { return {.real = result}; }
template <std::integral T>
Value value_of(T result) {
  return {.number = static_cast<int64_t>(result)};
}

std::vector<Role> roles_of(const char* description);
char result_in(const char* description, char other);
std::string name_in(const char* signature);  // of the function in __PRETTY_FUNCTION__ below

using Table = std::vector<Entry>;

template <auto kFunction, class Result, class... Parameters>
Entry entry_of(const char* description, Result (*)(Parameters...)) {
  auto call = [](const Value* arguments) -> Value {
    auto use = [&]<size_t... kIndexes>(std::index_sequence<kIndexes...>) {
      return kFunction(value_as<Parameters>(arguments[kIndexes])...);
    };
    std::index_sequence_for<Parameters...> indexes;
    if constexpr (!std::is_void_v<Result>) return value_of(use(indexes));
    return use(indexes), Value{0};
  };
  return {name_in(__PRETTY_FUNCTION__),
          result_in(description, std::is_pointer_v<Result> ? 'p' : 'n'),
          roles_of(description),
          {target_of<Parameters>()...},
          call};
}

// Functions with parameters alike.
template <auto... kFunctions>
Table calls(const char* description) {
  return {entry_of<kFunctions>(description, +kFunctions)...};
}
// Functions that need more around them than arguments.
template <auto kUse>
Table use(std::initializer_list<const char*> names, const char* description) {
  Table table(names.size(), entry_of<kUse>(description, +kUse));
  for (size_t i = 0; i < table.size(); ++i) table[i].name = names.begin()[i];
  return table;
}
Table joined(std::initializer_list<Table> tables);

Table text_calls();      // navigation, strings, collation
Table code_calls();      // characters of code pages, conversion
Table format_calls();    // numbers, money, time
Table host_calls();      // host services, paths, files
Table object_calls();    // the library, its objects, locales
Table stream_calls();    // streams, catalogs
Table numbered_calls();  // locales by number

}  // namespace lx::test
