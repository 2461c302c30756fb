// Runs a function when the scope is left, by return or by exception.
//
//   Nestra::Finally release(boost::bind(&TarnLib_Exit));
//   ...  // TarnLib_Exit runs once when release goes out of scope
#pragma once

#include <boost/function.hpp>

namespace Nestra {

class Finally {
 public:
  explicit Finally(const boost::function<void()>& action) : action_(action) {}
  ~Finally() {
    if (!action_.empty()) {
      boost::function<void()> action;
      action.swap(action_);
      action();
    }
  }
  Finally(const Finally&) = delete;
  Finally& operator=(const Finally&) = delete;

 private:
  boost::function<void()> action_;
};

}  // namespace Nestra
