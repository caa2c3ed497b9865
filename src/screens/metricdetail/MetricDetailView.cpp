#include "screens/metricdetail/MetricDetailView.h"

#include <limits>
#include <utility>

#include "shell/TimeTexts.h"

namespace quorl {

MetricDetailView::MetricDetailView(std::shared_ptr<MetricDetailViewModel> viewModel)
    : viewModel_(std::move(viewModel)),
      showToast_("copied"),
      modelConnection_(viewModel_->onChange([this] { refresh(); })) {
  refresh();
}

std::string MetricDetailView::lastSeenText() const {
  return "Last seen on: " + timeText(viewModel_->collectedOn());
}

void MetricDetailView::refresh() {
  Earlier earlier;
  for (const Section& section : sections_) {
    for (const auto& cell : section.cells) {
      earlier.byId.emplace(std::pair(section.header, cell->metricObject().id), cell);
      earlier.byName.emplace(std::pair(section.header, cell->metricObject().attributeNameNonLocalized), cell);
    }
  }
  sections_.clear();
  for (const MetricSectional& sectional : viewModel_->metricSectionals())
    sections_.push_back(makeSection(std::string(kCaStatusName) + " " + sectional.sectionName, sectional.sectionMetrics,
                                    /*isSectioned=*/true, earlier));
  if (sections_.empty())
    sections_.push_back(makeSection(std::string(), viewModel_->metrics(), /*isSectioned=*/false, earlier));
  changed_();
}

void MetricDetailView::refreshBookmarks() {
  refresh();
  for (const Section& section : sections_) {
    if (!section.header.empty()) continue;
    for (const auto& cell : section.cells) cell->mark();
  }
  changed_();
}

MetricDetailView::Section MetricDetailView::makeSection(std::string header, const std::vector<Metric>& rows,
                                                        bool isSectioned, const Earlier& earlier) {
  Section section{std::move(header), {}};
  section.cells.reserve(rows.size());
  for (const Metric& row : rows) {
    if (const auto same = earlier.byId.find({section.header, row.id}); same != earlier.byId.end()) {
      section.cells.push_back(same->second);
      same->second->update(row);
      continue;
    }
    section.cells.push_back(makeCell(row, startsBookmarked(section.header, row, isSectioned, earlier), isSectioned));
  }
  return section;
}

bool MetricDetailView::startsBookmarked(const std::string& header, const Metric& row, bool isSectioned,
                                        const Earlier& earlier) const {
  if (isSectioned) {
    const auto flipped = flipped_.find({row.subsId, row.attributeNameNonLocalized});
    return flipped == flipped_.end() ? row.isBookmarked : flipped->second;
  }
  const auto before = earlier.byName.find({header, row.attributeNameNonLocalized});
  return before == earlier.byName.end() ? row.isBookmarked : before->second->isBookmarked();
}

std::shared_ptr<MetricDetailsViewCell> MetricDetailView::makeCell(const Metric& row, bool isBookmarked,
                                                                  bool isSectioned) {
  MetricDetailsViewCell::Actions actions;
  actions.graphableAction = [this, id = row.id, isSectioned] {
    const Place place = placeOf(id, isSectioned);
    viewProtocol_.showGraphForItemAt(*viewModel_, place.index, place.sectionIndex, isSectioned);
  };
  actions.bookMarkAction = [this, id = row.id, isSectioned](bool isPinned) {
    const Place place = placeOf(id, isSectioned);
    if (const Metric* metric = viewModel_->row(place.index, place.sectionIndex, isSectioned))
      flipped_[{metric->subsId, metric->attributeNameNonLocalized}] = isPinned;
    viewModel_->updateDashboardItem(place.index, isPinned, place.sectionIndex, isSectioned);
  };
  actions.onCopyAction = [this] { showToast_.show(); };
  return std::make_shared<MetricDetailsViewCell>(row, isBookmarked, std::move(actions));
}

MetricDetailView::Place MetricDetailView::placeOf(const Uuid& id, bool isSectioned) const {
  const std::size_t sectionCount = isSectioned ? viewModel_->metricSectionals().size() : 1;
  for (std::size_t sectionIndex = 0; sectionIndex < sectionCount; ++sectionIndex) {
    for (std::size_t index = 0;; ++index) {
      const Metric* metric = viewModel_->row(index, sectionIndex, isSectioned);
      if (metric == nullptr) break;
      if (metric->id == id) return {index, sectionIndex};
    }
  }
  return {std::numeric_limits<std::size_t>::max(), 0};
}

}  // namespace quorl
