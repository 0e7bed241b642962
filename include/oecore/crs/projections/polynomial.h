// A plane fitted to control points: image x and y as polynomials of
// long/lat (degree 1 to 3), fitted by least squares, for scanned maps and
// images with no known projection.
//
// Immutable once read; shared between threads.
#pragma once

#include <oecore/crs/projection.h>

// How getErrorEstimate sums up the fit's residuals.
enum class OmbErrorMeasure { MaxError = 0, MeanError = 1 };
OMB_DESCRIBE_ENUM(OmbErrorMeasure, "ErrorMeasure", {{"MaxError", 0}, {"MeanError", 1}})

class OmbPolynomialProjection : public OmbProjection {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbPolynomialProjection() = default;
    OmbPolynomialProjection(const OmbPointArray& georeferencedPoints, const OmbPointArray& imagePoints, int degree);
    OmbPolynomialProjection* clone() const override { return new OmbPolynomialProjection(*this); }

    // Control points: long/lat in degrees, and where they lie in the image
    // (in the length unit). In configurations a text of "x y" pairs
    // separated by semicolons; OmbXArgument for other text.
    const OmbPointArray& georeferencedPoints() const noexcept { return geoPoints_; }
    void georeferencedPoints(const OmbPointArray& points) { geoPoints_ = points; }
    const OmbPointArray& imagePoints() const noexcept { return imagePoints_; }
    void imagePoints(const OmbPointArray& points) { imagePoints_ = points; }
    int polynomialDegree() const noexcept { return degree_; }
    void polynomialDegree(int degree) { degree_ = degree; }

    static OmbString pointsText(const OmbPointArray& points);
    static OmbPointArray parsePoints(const OmbString& text);

    // The largest or the mean distance, in image units, between the image
    // points and the fitted polynomials' values at their control points.
    double getErrorEstimate(OmbErrorMeasure measure) const;

    using OmbProjection::project;
    using OmbProjection::unproject;
    // Fits the polynomials: OmbXDifferentNumberOfGCP for lists of unequal
    // length, OmbXNotEnoughGCP for fewer points than terms,
    // OmbXInvalidOperation for a degree other than 1, 2 or 3.
    OmbProjCachedNumbers* init(const OmbGeodeticDatum& datum) const override;
    void project(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    // By Newton's method from the fitted inverse polynomials' guess;
    // OmbXProjectionFromFailureEx when it finds no root.
    void unproject(OmbPoint& p, const OmbProjCachedNumbers* cached) const override;
    void nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const override;
    bool equivalent(const OmbProjection& other) const override;

private:
    OmbPointArray geoPoints_;
    OmbPointArray imagePoints_;
    int degree_ = 1;
};
