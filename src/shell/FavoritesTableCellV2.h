#pragma once

#include <string>

namespace quorl {

/// A row with three texts and a spinner.
struct FavoritesTableCellV2 {
  std::string titleLabel;
  std::string subtitleLabel;
  std::string valueLabel;
  bool isActivityIndicatorHidden = false;

  friend bool operator==(const FavoritesTableCellV2&, const FavoritesTableCellV2&) = default;
};

}  // namespace quorl
