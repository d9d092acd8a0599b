#pragma once

#include <functional>
#include <set>
#include <type_traits>

namespace varnel {

/// What the function yields for the elements, each value once.
template <class Elements, class Function>
auto distinctValues(const Elements& elements, Function valueOf) {
  std::set<std::decay_t<std::invoke_result_t<Function, const typename Elements::value_type&>>> values;
  for (const auto& element : elements) values.insert(std::invoke(valueOf, element));
  return values;
}

}  // namespace varnel
