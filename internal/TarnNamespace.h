// The plug-in's entry. The host calls it once with the root of its command
// tree; it hangs the `tarn` subtree under `storage internal`, creating
// `internal` when the host has none.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

// Throws HostCtl::Lib::HostCtlException when `storage` is missing or when
// `storage` or `storage internal` is not a namespace, and passes on the
// exception of a command that cannot open the daemon client library; `tarn`
// is then not registered.
extern "C" void AutoCli_RegisterNamespaces(boost::shared_ptr<Fendle::AutoCli::Namespace>& root);
