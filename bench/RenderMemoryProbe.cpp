// Measures what a large result costs: builds the result of a load of N
// containers (two arrays of four endpoints each, as the plug-in builds it),
// reports the heap its values take, then renders it to standard output with
// the formatter named. Run under /usr/bin/time -v to see the peak beside the
// output's size:
//
//   render_memory_probe FORMATTER [ROWS] [--buffered] > out
//
// --buffered renders into a string first and writes that, as the tool once
// did, for comparison.
#include <malloc.h>

#include <cstring>
#include <iostream>
#include <sstream>
#include <string>

#include "LoadResult.h"
#include "fendle/Formatter.h"

int main(int argc, char** argv) {
  if (argc < 2) {
    std::cerr << "usage: render_memory_probe FORMATTER [ROWS] [--buffered]\n";
    return 2;
  }
  const int rows = argc > 2 && argv[2][0] != '-' ? std::stoi(argv[2]) : 10000;
  const bool buffered = std::strcmp(argv[argc - 1], "--buffered") == 0;
  const std::size_t before = mallinfo2().uordblks;
  const boost::shared_ptr<Fendle::MetaObj::MetaList> result = Bench::LoadResult(rows);
  const std::size_t tree = mallinfo2().uordblks - before;
  const Fendle::Format::FormatHints hints = Bench::LoadHints(result);
  auto formatter = Fendle::Format::CreateFormatter(argv[1]);
  if (!formatter) return 2;
  if (buffered) {
    std::ostringstream text;
    formatter->Render(result, hints, text);
    std::cout << text.str();
  } else {
    formatter->Render(result, hints, std::cout);
  }
  std::cout.flush();
  std::cerr << rows << " rows: values take " << tree << " bytes of heap (" << tree / rows
            << " per row)\n";
  return std::cout ? 0 : 1;
}
