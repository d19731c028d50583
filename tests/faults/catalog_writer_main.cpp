// The program that the fault injection runs: works on a storage for a few rounds, and reports on
// its standard output. Exit status: 0 done, 3 when the catalog answered with an error.
//
//     catalog_writer STORAGE STATE SEED ROUNDS
#include <unistd.h>

#include <cstdlib>

#include "CatalogWriter.h"

int main(int count, char** arguments) {
  if (count != 5) return 2;
  vantrell::faults::CatalogWriter writer(arguments[1], arguments[2], STDOUT_FILENO,
                                         std::strtoull(arguments[3], nullptr, 10));
  return writer.work(std::atoi(arguments[4])) ? 0 : 3;
}
