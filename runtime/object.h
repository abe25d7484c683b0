// Objects of the component. Every public class derives from Object and is held by Ref<T>
// (std::shared_ptr): references are counted as in the original. Back-pointers that must not keep
// their target alive are WeakRef<T>; cycles between documents, proxies and data objects are broken
// by the classes' Destroy methods, not by the pointer types.
#pragma once

#include <memory>

namespace xal {

class ClassInfo;

class Object : public std::enable_shared_from_this<Object> {
 public:
  Object() = default;
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;
  virtual ~Object() = default;

 private:
  // The member table of the dynamic class, found once on the first late-bound call.
  friend const ClassInfo* ClassOf(const Object& obj);
  mutable const ClassInfo* classInfo_ = nullptr;
};

template <class T>
using Ref = std::shared_ptr<T>;
template <class T>
using WeakRef = std::weak_ptr<T>;

template <class T, class... Args>
Ref<T> MakeRef(Args&&... args) {
  return std::make_shared<T>(std::forward<Args>(args)...);
}

// The object as a Ref of its own class; nullptr when it is not owned by a Ref.
template <class T>
Ref<T> RefTo(T& obj) {
  return std::dynamic_pointer_cast<T>(obj.weak_from_this().lock());
}

}  // namespace xal
