#pragma once

#include <array>

#include "plot/record_hues.h"

namespace senseloom::tool {

// The colour of a hue on a light ground and on a dark one.
struct HueColour {
  const char* selector;  // of its class in a style sheet
  const char* light;
  const char* dark;
};

// By hue.
inline constexpr std::array<HueColour, kHues> kHueColours = {{
    {".h0", "#b6bec8", "#5b6572"},  {".h1", "#4878b8", "#5c94dd"},  {".h2", "#3f9c5a", "#4bb16b"},
    {".h3", "#d5504b", "#ee6a62"},  {".h4", "#ec9a2f", "#f2ab4a"},  {".h5", "#8a63b8", "#a583d6"},
    {".h6", "#e3c63c", "#ecd65c"},  {".h7", "#3aa6a6", "#4cc0bf"},  {".h8", "#7d8794", "#8f9bab"},
    {".h9", "#25497a", "#a9c7f0"},  {".h10", "#1f5e33", "#a3dcb4"}, {".h11", "#8c1f1b", "#f8b5b0"},
    {".h12", "#a8610b", "#f9d9a8"}, {".h13", "#553583", "#d3c0ee"}, {".h14", "#94800f", "#f6ebab"},
    {".h15", "#14686b", "#a9e2e1"}, {".h16", "#d887b8", "#e79fcb"}, {".h17", "#93694e", "#b58a6c"},
    {".h18", "#6b7a8c", "#8795a8"},
}};

}  // namespace senseloom::tool
