// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/visual_format.h"

#include <cctype>
#include <charconv>
#include <optional>

#include "platform/ui/view.h"

namespace vaelo {

namespace {

constexpr double StandardSpacing = 8;

/// "==other", ">=20@750" ...: a relation, a number or a view, and a priority.
struct Predicate {
  LayoutRelation relation = LayoutRelation::Equal;
  double constant = 0;
  View* view = nullptr;
  float priority = LayoutPriority::Required;
};

class Parser {
 public:
  Parser(std::string_view format, const VisualFormatBindings& bindings) : rest_(format), bindings_(bindings) {}

  std::vector<LayoutConstraintRef> run() {
    if (!parse()) made_.clear();
    return std::move(made_);
  }

 private:
  bool take(std::string_view token) {
    if (!rest_.starts_with(token)) return false;
    rest_.remove_prefix(token.size());
    return true;
  }

  bool parse() {
    vertical_ = take("V:");
    if (!vertical_) take("H:");
    bool leadingEdge = take("|");
    std::vector<Predicate> gap;
    if (leadingEdge && !parseGap(gap)) return false;
    View* previous = nullptr;
    for (;;) {
      View* view = parseView();
      if (!view) return false;
      if (leadingEdge && !previous) {
        if (!view->superview()) return false;
        join(*view, start(), *view->superview(), start(), gap);
      }
      if (previous) join(*view, start(), *previous, end(), gap);
      previous = view;
      if (rest_.empty()) return true;
      gap.clear();
      if (!parseGap(gap)) return false;
      if (take("|")) {
        if (!rest_.empty() || !view->superview()) return false;
        join(*view->superview(), end(), *view, end(), gap);
        return true;
      }
    }
  }

  /// Nothing, "-", "-N-" or "-(...)-".
  bool parseGap(std::vector<Predicate>& gap) {
    if (!take("-")) {
      gap.push_back({});
      return true;
    }
    if (rest_.starts_with("[") || rest_.starts_with("|")) {
      gap.push_back({.constant = StandardSpacing});
      return true;
    }
    if (take("(")) {
      if (!parsePredicates(gap, false)) return false;
    } else {
      Predicate one;
      if (!parsePredicate(one, false)) return false;
      gap.push_back(one);
    }
    return take("-");
  }

  View* parseView() {
    if (!take("[")) return nullptr;
    View* view = bound(takeName());
    if (!view) return nullptr;
    if (take("(")) {
      std::vector<Predicate> sizes;
      if (!parsePredicates(sizes, true)) return nullptr;
      for (const Predicate& size : sizes) {
        const LayoutAttribute other = size.view ? extent() : LayoutAttribute::NotAnAttribute;
        add(LayoutConstraint::make(*view, extent(), size.relation, size.view, other, 1, size.constant), size.priority);
      }
    }
    return take("]") ? view : nullptr;
  }

  bool parsePredicates(std::vector<Predicate>& list, bool viewsAllowed) {
    do {
      Predicate predicate;
      if (!parsePredicate(predicate, viewsAllowed)) return false;
      list.push_back(predicate);
    } while (take(","));
    return take(")");
  }

  bool parsePredicate(Predicate& predicate, bool viewsAllowed) {
    if (take("<=")) {
      predicate.relation = LayoutRelation::LessThanOrEqual;
    } else if (take(">=")) {
      predicate.relation = LayoutRelation::GreaterThanOrEqual;
    } else {
      take("==");
    }
    if (const std::optional<double> number = takeNumber()) {
      predicate.constant = *number;
    } else {
      predicate.view = viewsAllowed ? bound(takeName()) : nullptr;
      if (!predicate.view) return false;
    }
    if (take("@")) {
      const std::optional<double> priority = takeNumber();
      if (!priority) return false;
      predicate.priority = static_cast<float>(*priority);
    }
    return true;
  }

  std::optional<double> takeNumber() {
    double number = 0;
    const char* const begin = rest_.data();
    // A name may begin with letters that read as a number ("inf"), and a sign would be a gap.
    if (rest_.empty() || !std::isdigit(static_cast<unsigned char>(*begin))) return std::nullopt;
    const auto [stop, problem] = std::from_chars(begin, begin + rest_.size(), number, std::chars_format::fixed);
    if (problem != std::errc()) return std::nullopt;
    rest_.remove_prefix(static_cast<std::size_t>(stop - begin));
    return number;
  }

  std::string takeName() {
    std::size_t length = 0;
    while (length < rest_.size() && (std::isalnum(static_cast<unsigned char>(rest_[length])) || rest_[length] == '_')) {
      ++length;
    }
    const std::string name(rest_.substr(0, length));
    rest_.remove_prefix(length);
    return name;
  }

  View* bound(const std::string& name) const {
    const auto found = bindings_.find(name);
    return found == bindings_.end() ? nullptr : found->second;
  }

  void join(View& first, LayoutAttribute firstAttribute, View& second, LayoutAttribute secondAttribute,
            const std::vector<Predicate>& gap) {
    for (const Predicate& part : gap) {
      add(LayoutConstraint::make(first, firstAttribute, part.relation, &second, secondAttribute, 1, part.constant),
          part.priority);
    }
  }

  void add(LayoutConstraintRef constraint, float priority) {
    constraint->setPriority(priority);
    made_.push_back(std::move(constraint));
  }

  LayoutAttribute start() const { return vertical_ ? LayoutAttribute::Top : LayoutAttribute::Leading; }
  LayoutAttribute end() const { return vertical_ ? LayoutAttribute::Bottom : LayoutAttribute::Trailing; }
  LayoutAttribute extent() const { return vertical_ ? LayoutAttribute::Height : LayoutAttribute::Width; }

  std::string_view rest_;
  const VisualFormatBindings& bindings_;
  bool vertical_ = false;
  std::vector<LayoutConstraintRef> made_;
};

}  // namespace

std::vector<LayoutConstraintRef> constraintsWithVisualFormat(std::string_view format, const VisualFormatBindings& bindings) {
  return Parser(format, bindings).run();
}

}  // namespace vaelo
