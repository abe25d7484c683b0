// The whole public interface of the component in one include: values and late-bound calls, the
// host object model and document proxy, collections, layout definitions and the server functions.
// Compile with -I<prefix>/include/xalscript (the pkg-config file and the CMake package add it).
#pragma once

#include "runtime/collection.h"
#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/dispatch.h"
#include "runtime/events.h"
#include "runtime/format.h"
#include "runtime/locale.h"
#include "runtime/operators.h"
#include "runtime/text.h"
#include "runtime/variant.h"

#include "bridge/callback_proxy.h"
#include "bridge/cmd_stat.h"
#include "bridge/host_model.h"
#include "bridge/proxy.h"
#include "bridge/ui_object.h"

#include "collections/dv_items.h"
#include "collections/lo_items.h"
#include "collections/string_array.h"
#include "collections/ui_strings.h"
#include "collections/value_texts.h"

#include "layout/brow_info.h"
#include "layout/cell_info.h"
#include "layout/cs_info.h"
#include "layout/ds_info.h"
#include "layout/imp_params.h"
#include "layout/link_info.h"
#include "layout/md_info.h"
#include "layout/sheet_info.h"

#include "server/server_functions.h"
