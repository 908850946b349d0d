// Quaternions as four doubles x y z w, for arrays of them; a single rotation is a TalixRotation.
#pragma once

// Hamilton's product: it turns by b first, then by a. `product` may be a or b.
inline void multiplyQuaternions(double const* a, double const* b, double* product) {
  double const x = a[3] * b[0] + a[0] * b[3] + a[1] * b[2] - a[2] * b[1];
  double const y = a[3] * b[1] - a[0] * b[2] + a[1] * b[3] + a[2] * b[0];
  double const z = a[3] * b[2] + a[0] * b[1] - a[1] * b[0] + a[2] * b[3];
  double const w = a[3] * b[3] - a[0] * b[0] - a[1] * b[1] - a[2] * b[2];
  product[0] = x, product[1] = y, product[2] = z, product[3] = w;
}

// The vector x y z turned by the unit quaternion q.
inline void rotateByQuaternion(double const* q, double x, double y, double z, double* turned) {
  double const tx = 2 * (q[1] * z - q[2] * y), ty = 2 * (q[2] * x - q[0] * z), tz = 2 * (q[0] * y - q[1] * x);
  turned[0] = x + q[3] * tx + q[1] * tz - q[2] * ty;
  turned[1] = y + q[3] * ty + q[2] * tx - q[0] * tz;
  turned[2] = z + q[3] * tz + q[0] * ty - q[1] * tx;
}
