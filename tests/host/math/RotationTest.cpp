// Rotations against identities and against 4x4 matrices.
#include <ImathEuler.h>
#include <ImathMatrix.h>
#include <ImathQuat.h>
#include <gtest/gtest.h>
#include <limits>
#include <numbers>
#include <random>

#include "host/math/TalixRotation.h"

namespace {

using M44 = Imath::M44d;
using RotOrder = TalixRotation::RotOrder;

constexpr double kPi = std::numbers::pi;
constexpr int kAxes[6][3] = {{0, 1, 2}, {0, 2, 1}, {1, 0, 2}, {1, 2, 0}, {2, 0, 1}, {2, 1, 0}};

std::mt19937_64 s_random(11);

double uniform(double low, double high) {
  return std::uniform_real_distribution<double>(low, high)(s_random);
}

Vec3 randomVec(double reach) {
  return {uniform(-reach, reach), uniform(-reach, reach), uniform(-reach, reach)};
}

TalixRotation randomRotation() {
  double const xyzw[4] = {uniform(-1, 1), uniform(-1, 1), uniform(-1, 1), uniform(-1, 1)};
  TalixRotation rotation;
  rotation.setQuaternion(xyzw);
  return rotation;
}

// Turning about one coordinate axis, for row vectors: v * M.
M44 aboutAxis(int axis, double angle) {
  Imath::V3d v(0);
  v[axis] = 1;
  return M44().setAxisAngle(v, angle);
}

// The first axis of the order is applied first.
M44 fromEuler(RotOrder order, Vec3 const& angles) {
  auto const& [i, j, k] = kAxes[order];
  return aboutAxis(i, angles[i]) * aboutAxis(j, angles[j]) * aboutAxis(k, angles[k]);
}

Vec3 turned(Vec3 const& v, M44 const& by) {
  Imath::V3d const result = Imath::V3d(v.x, v.y, v.z) * by;
  return {result.x, result.y, result.z};
}

// How far two rotations carry the unit vectors apart.
double apart(TalixRotation const& a, TalixRotation const& b) {
  double most = 0;
  for (Vec3 const& unit : {Vec3(1, 0, 0), Vec3(0, 1, 0), Vec3(0, 0, 1)})
    most = std::max(most, (a.rotate(unit) - b.rotate(unit)).length());
  return most;
}

double apart(TalixRotation const& a, M44 const& b) {
  double most = 0;
  for (Vec3 const& unit : {Vec3(1, 0, 0), Vec3(0, 1, 0), Vec3(0, 0, 1)})
    most = std::max(most, (a.rotate(unit) - turned(unit, b)).length());
  return most;
}

class RotationOrder : public testing::TestWithParam<int> {
 protected:
  RotOrder order() const { return static_cast<RotOrder>(GetParam()); }
};

TEST_P(RotationOrder, AppliesItsFirstAxisFirst) {
  for (int i = 0; i < 500; ++i) {
    Vec3 const angles = randomVec(7);
    TalixRotation rotation;
    rotation.setAsEuler(order(), angles);
    EXPECT_LT(apart(rotation, fromEuler(order(), angles)), 1e-14);
  }
}

TEST_P(RotationOrder, AnglesReadBackWithinTheirRanges) {
  auto const& [i, j, k] = kAxes[order()];
  for (int n = 0; n < 500; ++n) {
    Vec3 angles, read;
    angles[i] = uniform(-kPi, kPi), angles[j] = uniform(-kPi / 2, kPi / 2), angles[k] = uniform(-kPi, kPi);
    TalixRotation rotation;
    rotation.setAsEuler(order(), angles);
    rotation.getAsEuler(order(), read);
    for (int axis = 0; axis < 3; ++axis) EXPECT_NEAR(read[axis], angles[axis], 1e-11);
  }
}

// Close to gimbal lock single angles may lose digits, but the three together must not.
TEST_P(RotationOrder, AnglesGiveTheSameRotationNearGimbalLock) {
  auto const& [i, j, k] = kAxes[order()];
  for (double const off : {0.0, 1e-16, 1e-12, 9e-10, 1.1e-9, 3e-9, 1e-7, 1e-4, 0.1}) {
    for (double const side : {-1.0, 1.0}) {
      for (int n = 0; n < 20; ++n) {
        Vec3 angles, read;
        angles[i] = uniform(-kPi, kPi), angles[j] = side * (kPi / 2 - off), angles[k] = uniform(-kPi, kPi);
        TalixRotation rotation, again;
        rotation.setAsEuler(order(), angles);
        rotation.getAsEuler(order(), read);
        again.setAsEuler(order(), read);
        EXPECT_LT(apart(rotation, again), 3e-9) << "off by " << off;
        if (off >= 3e-9) {
          EXPECT_LT(apart(rotation, again), 1e-14) << "off by " << off;
        }
        if (off < 1e-10) {
          EXPECT_EQ(read[k], 0);
        }
      }
    }
  }
}

TEST_P(RotationOrder, UnrollsToTheNearestEqualAngles) {
  Vec3 former = randomVec(20);
  for (int n = 0; n < 200; ++n) {
    TalixRotation const rotation = randomRotation();
    Vec3 angles;
    rotation.getAsEuler(order(), angles);
    Vec3 const near = unrolledEuler(order(), angles, former);
    TalixRotation again;
    again.setAsEuler(order(), near);
    EXPECT_LT(apart(rotation, again), 1e-13);
    for (int axis = 0; axis < 3; ++axis) EXPECT_LE(std::abs(near[axis] - former[axis]), kPi + 1e-12);
    former = near;
  }
}

INSTANTIATE_TEST_SUITE_P(All, RotationOrder, testing::Range(0, 6));

// Of two axes, which may be one.
class RotationJoint : public testing::TestWithParam<int> {
 protected:
  int major() const { return GetParam() / 3; }
  int minor() const { return GetParam() % 3; }
  TalixRotation joint(double a, double b) const {
    TalixRotation rotation;
    rotation.setAsHardySpicerRotation(a, b, major(), minor(), randomRotation());
    return rotation;
  }
};

TEST_P(RotationJoint, TurnsAboutItsMajorAxisAndTheCarriedMinorOne) {
  for (int n = 0; n < 200; ++n) {
    double const a = uniform(-7, 7), b = uniform(-7, 7);
    // For row vectors the carried axis comes first.
    EXPECT_LT(apart(joint(a, b), aboutAxis(minor(), b) * aboutAxis(major(), a)), 1e-14);
    TalixRotation hinge;
    hinge.setAsHingeRotation(a, major());
    EXPECT_LT(apart(hinge, joint(a, 0)), 1e-14);
  }
}

TEST_P(RotationJoint, AnglesReadBack) {
  for (int n = 0; n < 400; ++n) {
    // Every second time at quarter turns, where Euler angles would lock.
    double const unit = n % 2 ? kPi / 2 : 1;
    double const a = n % 2 ? unit * (n / 2 % 5 - 2) : uniform(-kPi, kPi);
    double const b = n % 2 ? unit * (n / 10 % 5 - 2) : uniform(-kPi, kPi);
    double readA = 0, readB = 0;
    joint(a, b).getAsHardySpicerRotation(readA, readB, major(), minor());
    EXPECT_LT(apart(joint(readA, readB), joint(a, b)), 1e-14);
    if (major() != minor()) {
      EXPECT_NEAR(std::remainder(readA - a, 2 * kPi), 0, 1e-14);
      EXPECT_NEAR(std::remainder(readB - b, 2 * kPi), 0, 1e-14);
    } else {
      EXPECT_NEAR(std::remainder(joint(a, b).getAsHingeRotation(major()) - a - b, 2 * kPi), 0, 1e-14);
      EXPECT_EQ(readB, 0);
    }
    EXPECT_LE(std::abs(readA), kPi);
    EXPECT_LE(std::abs(readB), kPi);
  }
}

TEST_P(RotationJoint, AnglesAreThoseOfTheNearestJointAndHinge) {
  auto const away = [](TalixRotation const& from, TalixRotation const& to) {
    Vec3 way;
    (from.inverse() * to).getAsVector(way);
    return way.length();
  };
  for (int n = 0; n < 50; ++n) {
    TalixRotation const rotation = randomRotation();
    double a = 0, b = 0;
    rotation.getAsHardySpicerRotation(a, b, major(), minor());
    double const left = away(joint(a, b), rotation),
                 leftOfHinge = away(joint(rotation.getAsHingeRotation(major()), 0), rotation);
    for (int other = 0; other < 200; ++other) {
      double const x = uniform(-kPi, kPi), y = uniform(-kPi, kPi);
      ASSERT_LE(left, away(joint(x, y), rotation) + 1e-12);
      ASSERT_LE(leftOfHinge, away(joint(x, 0), rotation) + 1e-12);
    }
  }
}

INSTANTIATE_TEST_SUITE_P(AllAxes, RotationJoint, testing::Range(0, 9));

TEST(Rotation, ProductTurnsByTheRightFactorFirst) {
  for (int n = 0; n < 200; ++n) {
    TalixRotation const a = randomRotation(), b = randomRotation(), c = randomRotation();
    Vec3 const v = randomVec(1000);
    EXPECT_LT(((a * b).rotate(v) - a.rotate(b.rotate(v))).length(), 1e-9);
    EXPECT_LT(apart((a * b) * c, a * (b * c)), 1e-14);
    EXPECT_LT(apart(a * a.inverse(), TalixRotation()), 1e-14);
    EXPECT_LT(apart((a * b).inverse(), b.inverse() * a.inverse()), 1e-14);
    EXPECT_NEAR(a.rotate(v).length(), v.length(), 1e-9);
  }
}

TEST(Rotation, LongProductsStayUnit) {
  TalixRotation const step(Vec3(0.01, -0.02, 0.03));
  TalixRotation sum;
  for (int i = 0; i < 100'000; ++i) sum *= step;
  double const angle = Vec3(0.01, -0.02, 0.03).length() * 100'000;
  Vec3 axis(0.01, -0.02, 0.03);
  axis.setLength(std::remainder(angle, 2 * kPi));
  EXPECT_LT(apart(sum, TalixRotation(axis)), 1e-9);
  EXPECT_NEAR(sum.rotate({1, 0, 0}).length(), 1, 1e-14);
}

TEST(Rotation, VectorHoldsAxisTimesAngle) {
  for (double const angle : {0.0, 1e-300, 1e-12, 1e-9, 1e-5, 9.9e-5, 1.01e-4, 0.5, 3.0, kPi - 1e-9, kPi}) {
    for (int n = 0; n < 50; ++n) {
      Vec3 axis = randomVec(1), read;
      axis.normalize();
      TalixRotation const rotation(axis * angle);
      EXPECT_LT(apart(rotation, M44().setAxisAngle(Imath::V3d(axis.x, axis.y, axis.z), angle)), 1e-14);
      rotation.getAsVector(read);
      EXPECT_NEAR(read.length(), angle, std::max(angle * 1e-12, 1e-300));
      EXPECT_LT(apart(TalixRotation(read), rotation), 1e-14);
      if (angle < kPi) {
        EXPECT_LT((read - axis * angle).length(), 1e-12 * angle + 1e-300);
      }
    }
  }
  Vec3 read;
  TalixRotation(Vec3(0, 0, 4)).getAsVector(read);
  EXPECT_NEAR(read.z, 4 - 2 * kPi, 1e-14);
}

TEST(Rotation, SlerpGoesTheShorterArcEvenly) {
  for (int n = 0; n < 200; ++n) {
    TalixRotation const a = randomRotation();
    Vec3 axis = randomVec(1);
    axis.setLength(uniform(0, kPi - 0.01));
    TalixRotation const b = a * TalixRotation(axis);
    for (double const part : {0.0, 0.25, 0.5, 1.0})
      EXPECT_LT(apart(TalixRotation::slerp(a, b, part), a * TalixRotation(axis * part)), 1e-12);
  }
}

TEST(Rotation, BadQuaternionsAreNoRotation) {
  constexpr double nan = std::numeric_limits<double>::quiet_NaN();
  constexpr double inf = std::numeric_limits<double>::infinity();
  for (auto const& bad : {std::array{0.0, 0.0, 0.0, 0.0}, std::array{nan, 0.0, 0.0, 1.0},
                          std::array{0.0, inf, 0.0, 1.0}, std::array{0.0, 0.0, 0.0, -inf}}) {
    TalixRotation rotation(Vec3(1, 2, 3));
    rotation.setQuaternion(bad.data());
    EXPECT_EQ(apart(rotation, TalixRotation()), 0);
  }
  EXPECT_EQ(apart(TalixRotation(Vec3(nan, 0, 0)), TalixRotation()), 0);
  EXPECT_EQ(apart(TalixRotation(Vec3(0, inf, 0)), TalixRotation()), 0);
}

TEST(Rotation, UnitQuaternionsReadBackUnchanged) {
  for (int n = 0; n < 200; ++n) {
    double first[4], second[4];
    TalixRotation rotation = randomRotation();
    rotation.getQuaternion(first);
    rotation.setQuaternion(first);
    rotation.getQuaternion(second);
    for (int i = 0; i < 4; ++i) EXPECT_EQ(first[i], second[i]);
  }
}

TEST(Vector, LengthsSurviveExtremes) {
  EXPECT_DOUBLE_EQ(Vec3(3e200, 4e200, 0).length(), 5e200);
  Vec3 zero, v(0, -3, 4);
  zero.setLength(7);
  EXPECT_EQ(zero, Vec3());
  v.setLength(10);
  EXPECT_EQ(v, Vec3(0, -6, 8));
  EXPECT_EQ(v.normalize(), 10);
  EXPECT_TRUE(std::isnan(zero.normalize() + zero.x));
  EXPECT_EQ(Vec3(1, 2, 3).cross({4, 5, 6}), Vec3(-3, 6, -3));
  EXPECT_EQ(Vec3(1, 2, 3).dot({4, 5, 6}), 32);
}

}  // namespace
