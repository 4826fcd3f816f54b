// The file format of a netlist database: one JSON document (UTF-8), for example
//
//   {
//     "format": "quillon-netlist",
//     "version": 1,
//     "designs": [
//       {
//         "name": "chip",
//         "properties": { "PART": "k100" },
//         "views": [
//           {
//             "name": "SOURCE",
//             "block": {
//               "name": "top",
//               "properties": { "TYPE": "top_cell" },
//               "blocks": [
//                 { "name": "u1", "properties": { "TYPE": "adder", "PARTITION": "p0" },
//                   "blocks": [ { "name": "g1", "properties": { "TYPE": "and2" } } ] }
//               ]
//             }
//           }
//         ]
//       }
//     ]
//   }
//
// - The document is an object with "format": "quillon-netlist", "version": 1 (an integer) and
//   "designs", an array of designs (it may be empty).
// - A design is an object with "name", optional "properties" and "views", an array of views.
// - A view is an object with "name", optional "properties" and "block", its top block.
// - A block is an object with "name", optional "properties" and optional "blocks", the array of
//   its inner blocks; a block without inner blocks is a primitive.
// - Names are non-empty texts. "properties" is an object whose values are texts ("PART", "TYPE",
//   "PARTITION" and any others); property names match exactly, case included.
// - Arrays keep their order: designs, views and inner blocks are read in file order.
// - Any other member, a missing member or a value of the wrong type makes the file unreadable.
// - A member named twice in one object (a property, too) counts with its last value.
// - Limits: a file larger than kMaxFileBytes is refused before it is read; blocks nest at most
//   kMaxBlockDepth levels (the top block is level 1), and no JSON value anywhere nests deeper than
//   kMaxJsonDepth containers, so that malformed input fails early instead of exhausting memory.
#pragma once

#include <cstdint>

namespace Xdm_FileFormat {

inline constexpr const char* kFormatName = "quillon-netlist";
inline constexpr int kVersion = 1;

inline constexpr std::uint64_t kMaxFileBytes = std::uint64_t{512} * 1024 * 1024;
inline constexpr int kMaxBlockDepth = 10000;
// Room for the deepest allowed block (two containers per level below the document's own five)
// and its properties, with a little to spare.
inline constexpr int kMaxJsonDepth = 2 * kMaxBlockDepth + 8;

}  // namespace Xdm_FileFormat
