#include "EdifPrimitiveCells.h"

#include <algorithm>
#include <cctype>
#include <string>

namespace Vad::EdifPrimitiveCells {

namespace {

// Upper case, in ascending byte order, without duplicates: looked up by bisection.
constexpr std::string_view kCells[] = {
    "ARITH_ADD1",  "ARITH_ADD4",    "ARITH_CARRY",  "ARITH_MULT18", "BUF_BIDIR",   "BUF_CLOCK",
    "BUF_DIFF_IN", "BUF_DIFF_OUT",  "BUF_IN",       "BUF_OUT",      "BUF_TRI",     "CELL_GND",
    "CELL_KEEPER", "CELL_PULLDOWN", "CELL_PULLUP",  "CELL_VCC",     "CLK_DIVIDER", "CLK_MANAGER",
    "CLK_PLL",     "FLOP_D",        "FLOP_DC",      "FLOP_DCE",     "FLOP_DP",     "FLOP_DPE",
    "FLOP_JK",     "FLOP_SR",       "FLOP_T",       "GATE_AND2",    "GATE_AND3",   "GATE_AND4",
    "GATE_AOI21",  "GATE_AOI22",    "GATE_BUF",     "GATE_INV",     "GATE_MUX2",   "GATE_MUX4",
    "GATE_MUX8",   "GATE_NAND2",    "GATE_NAND3",   "GATE_NAND4",   "GATE_NOR2",   "GATE_NOR3",
    "GATE_NOR4",   "GATE_OAI21",    "GATE_OAI22",   "GATE_OR2",     "GATE_OR3",    "GATE_OR4",
    "GATE_XNOR2",  "GATE_XNOR3",    "GATE_XOR2",    "GATE_XOR3",    "LATCH_D",     "LATCH_DC",
    "LATCH_DP",    "LUT_1",         "LUT_2",        "LUT_3",        "LUT_4",       "LUT_5",
    "LUT_6",       "MEM_BLOCK_16K", "MEM_BLOCK_4K", "MEM_RAM16X1",  "MEM_RAM32X1", "MEM_RAM64X1",
    "MEM_ROM16X1", "MEM_ROM32X1",   "PAD_BIDIR",    "PAD_IN",       "PAD_OUT",     "SHIFT_REG16",
};

}  // namespace

bool Contains(std::string_view cellName) {
  std::string upper(cellName);
  std::transform(upper.begin(), upper.end(), upper.begin(),
                 [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
  return std::binary_search(std::begin(kCells), std::end(kCells), std::string_view(upper));
}

}  // namespace Vad::EdifPrimitiveCells
