// Reading host data that may be missing: a member of an object that is
// Nothing reads as Null (or Nothing), the first item of an empty or
// missing collection is Nothing, and flags and dates that can't be read as
// such count as not set.
//
//   Var ref = Read(carrier, &host::Carrier::AccountRef);   // Null when carrier is Nothing
#pragma once

#include <optional>

#include "frame/host/Host.h"

namespace quendal::host {

template <class T>
Var Read(const Ref<T>& object, Var (T::*member)()) {
  return object ? (object.ptr().get()->*member)() : Var();
}

template <class T, class U>
Ref<U> Read(const Ref<T>& object, Ref<U> (T::*member)()) {
  return object ? (object.ptr().get()->*member)() : Ref<U>();
}

// The first item, or Nothing.
template <class T>
Ref<T> First(const Ref<Collection<T>>& list) {
  return list && list->Count() > 0 ? list->Item(1) : Ref<T>();
}

// True only for a value that reads as True; Null and unreadable text are False.
bool IsTrue(const Var& value);

// The value as a date, or nothing when it is Null or does not read as one.
std::optional<DateTime> DateOf(const Var& value);

// Equal as numbers when both are numeric, else equal as text (Null reads as "").
bool SameValue(const Var& a, const Var& b);

}  // namespace quendal::host
