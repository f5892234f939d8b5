// A host of named signals, in another project.
#include "board/Board.h"

int main() {
  qor::Board board("sim:");
  board.write({{"async_out_data", 0xA}});
  return board.read("async_in_data") == 0xA ? 0 : 1;
}
