// The C++ interface to libtevpf: named technical parameters and tables in binary parameter files.
//
//   auto file = tevpf::File::open("engine.pf");
//   auto engine = file.list("Engine");
//   double thrust = engine.get<double>("Thrust");
//   engine.set("Thrust", 481.5);
//   for (const tevpf::Parameter& p : engine) std::cout << p.name() << ' ' << p.units() << '\n';
//   auto elements = file.table("elements");
//   for (auto [symbol, melting] :
//        elements.ordered_by("melting").fields<std::string_view, float>("symbol", "melting")) ...
//   if (auto iron = elements.find("symbol", "Fe")) std::cout << iron->get<std::string_view>("name");
//   elements.append({26, "Fe", "Iron", 55.845});
//   file.save();
//
// Header-only, C++20, over the C interface: what is said there of names, bounds and files holds here.
//
//   Errors     Refusals and failures throw tevpf::Error, with the status, the library's two texts and
//              a sentence; out of memory is std::bad_alloc. Nothing has changed then. Comments name
//              the statuses that an operation adds to those of its class.
//   Files      Closed by their object. Changes live in memory until save().
//   Names      Exact, never cut: a new name that does not fit is refused, and a "*" at the end has
//              no special meaning.
//   Threads    None. All state is the process's, that of this interface included: use the library,
//              through whichever interface, from one thread at a time.
//   C calls    May be mixed in. C code must not close a file that a tevpf::File holds; and it must
//              choose its own current file, cursors and search columns again after calls made here.
#pragma once

#if !defined(__cplusplus) || \
    (__cplusplus < 202002L && (!defined(_MSVC_LANG) || _MSVC_LANG < 202002L))
#error "tevpf.hpp needs C++20"
#endif

#include "tevpf/column.hpp"
#include "tevpf/element.hpp"
#include "tevpf/error.hpp"
#include "tevpf/file.hpp"
#include "tevpf/list.hpp"
#include "tevpf/parameter.hpp"
#include "tevpf/row.hpp"
#include "tevpf/row_layout.hpp"
#include "tevpf/row_range.hpp"
#include "tevpf/table.hpp"
#include "tevpf/value.hpp"
