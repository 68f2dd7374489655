// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/layer_colors.h"

#include <array>
#include <utility>

namespace tervane {

namespace {

template <std::size_t count>
QColor ColorOf(const std::array<std::pair<QRgb, QRgb>, count>& colors, std::size_t number, bool onDark) {
  const auto& [light, dark] = colors[number % count];
  return onDark ? dark : light;
}

}  // namespace

QColor CurveColor(std::size_t number, bool onDark) {
  constexpr std::array<std::pair<QRgb, QRgb>, 8> kColors{{{0xff1f6fb2, 0xff62aef0},
                                                          {0xffd1601a, 0xffff9b54},
                                                          {0xff2b8a4b, 0xff62c987},
                                                          {0xffa63a78, 0xffe58abf},
                                                          {0xff7a5c16, 0xffd9b64a},
                                                          {0xff5b50b5, 0xffa79df5},
                                                          {0xff128a91, 0xff4fd0d6},
                                                          {0xff555c66, 0xffb9c0ca}}};
  return ColorOf(kColors, number, onDark);
}

QColor LayerColor(std::size_t number, bool onDark) {
  constexpr std::array<std::pair<QRgb, QRgb>, 8> kColors{{{0xffe9d8a6, 0xff8d7f52},
                                                          {0xffb7c9a8, 0xff64785a},
                                                          {0xffd9b08c, 0xff866549},
                                                          {0xffa9c4cf, 0xff567684},
                                                          {0xffcdb4c9, 0xff79607a},
                                                          {0xffc9c2b8, 0xff6f6a63},
                                                          {0xffe3c3ae, 0xff8e6c58},
                                                          {0xff9fbfae, 0xff4f7364}}};
  return ColorOf(kColors, number, onDark);
}

}  // namespace tervane
