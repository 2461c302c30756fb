// The result a `storagecontainer load` of many containers hands the
// formatters: two arrays of four endpoints per container, shaped as the
// plug-in builds it, with the hints it declares.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/MetaObj.h"
#include "fendle/FormatHints.h"

namespace Bench {

boost::shared_ptr<Fendle::MetaObj::MetaList> LoadResult(int rows);

// The load's hints over result.
Fendle::Format::FormatHints LoadHints(const boost::shared_ptr<Fendle::MetaObj::MetaList>& result);

}  // namespace Bench
