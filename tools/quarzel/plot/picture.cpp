// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include "plot/curve_labels.hpp"
#include "plot/plot_script.hpp"
#include "report_text.hpp"

namespace quarzel::tool {

namespace {

DrawnCurve referenceCurve(const ReferenceCurve& reference, const RatePoints& points) {
    DrawnCurve drawn{reference.label, {}, false, true};
    for (const auto& [ebN0, rate] : points) {
        drawn.points.push_back({ebN0, {rate, rate, rate}});
    }
    return drawn;
}

/// Two empty panels with the title.
Picture pictureOf(const std::string& title) {
    return {title, {{"Bit error rate", {}}, {"Block error rate", {}}}};
}

void addReferences(Picture& picture, const std::vector<ReferenceCurve>& references) {
    for (const ReferenceCurve& reference : references) {
        picture.panels[0].curves.push_back(referenceCurve(reference, reference.ber));
        picture.panels[1].curves.push_back(referenceCurve(reference, reference.bler));
    }
}

}  // namespace

Picture ratesPicture(const std::vector<SweepCurve>& curves, const std::vector<ReferenceCurve>& references) {
    const CurveLabels labels = labelsOf(curves);
    Picture picture = pictureOf(labels.title);
    for (std::size_t i = 0; i < curves.size(); ++i) {
        DrawnCurve ber{labels.labels[i], {}, true, false};
        DrawnCurve bler = ber;
        for (const MeasuredPoint& point : curves[i].points) {
            ber.points.emplace_back(point.ebN0, point.ber);
            bler.points.emplace_back(point.ebN0, point.bler);
        }
        picture.panels[0].curves.push_back(std::move(ber));
        picture.panels[1].curves.push_back(std::move(bler));
    }
    addReferences(picture, references);
    return picture;
}

Picture iterationsPicture(const SweepCurve& curve, const std::vector<ReferenceCurve>& references) {
    Picture picture = pictureOf(labelsOf({curve}).title);
    for (std::size_t iteration = 0; iteration < static_cast<std::size_t>(curve.iterations); ++iteration) {
        DrawnCurve ber{"after " + counted(iteration + 1, "iteration", "iterations"), {}, false, false};
        DrawnCurve bler = ber;
        for (const MeasuredPoint& point : curve.points) {
            const double berThen = point.berAfter.at(iteration);
            const double blerThen = point.blerAfter.at(iteration);
            ber.points.push_back({point.ebN0, {berThen, berThen, berThen}});
            bler.points.push_back({point.ebN0, {blerThen, blerThen, blerThen}});
        }
        picture.panels[0].curves.push_back(std::move(ber));
        picture.panels[1].curves.push_back(std::move(bler));
    }
    addReferences(picture, references);
    return picture;
}

}  // namespace quarzel::tool
