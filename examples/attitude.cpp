// The attitude of an aircraft in several forms: where its camera looks, and its attitude halfway to
// another one.

#include <vetra/vetra.h>

#include <cstdio>
#include <iostream>

using vetra::qtn::Quaternion;

namespace {

constexpr double kDegree = 3.141592653589793 / 180.0;

// [angles]
Quaternion ToQuaternion(double dfYaw, double dfPitch, double dfRoll) {
    // From north, east, down to forward, right, down: first yaw about Z, then pitch about Y, then
    // roll about X. The array has the angle about X first, all the same.
    const double adfAngles[3] = {dfRoll * kDegree, dfPitch * kDegree, dfYaw * kDegree};
    double q[4];
    ConvertRotation(eRT_ZYX, adfAngles, eRT_QUATERNION, q);
    return {q[0], q[1], q[2], q[3]};
}
// [angles]

}  // namespace

int main() {
    try {
        const Quaternion oAttitude = ToQuaternion(30.0, 10.0, -5.0);
        std::printf("quaternion: %.6f %.6f %.6f, scalar %.6f\n", oAttitude[0], oAttitude[1],
                    oAttitude[2], oAttitude[3]);

        // [look]
        // The matrix takes components of a fixed vector from north, east, down to the aircraft's
        // axes; its transpose takes them back. So the camera, which looks straight down from the
        // aircraft, looks in the direction of the third row.
        double adfMatrix[9];
        oAttitude.ToMatrix(adfMatrix);
        const double adfDown[3] = {0.0, 0.0, 1.0};
        double adfLook[3];
        MtV3_Mult(adfMatrix, adfDown, adfLook);
        // [look]
        std::printf("the camera looks to: north %.6f, east %.6f, down %.6f\n", adfLook[0],
                    adfLook[1], adfLook[2]);

        double adfAxis[3];
        double dfAngle;
        oAttitude.ToAxisAndAngle(adfAxis, dfAngle);
        std::printf("one turn by %.4f degrees about %.6f %.6f %.6f\n", dfAngle / kDegree,
                    adfAxis[0], adfAxis[1], adfAxis[2]);

        // [halfway]
        // Halfway to another attitude, the short way round, and back to yaw, pitch and roll.
        Quaternion oNext = ToQuaternion(50.0, 0.0, 15.0);
        if (oAttitude.DotProd(oNext) < 0.0) {
            oNext = -oNext;
        }
        Quaternion oHalfway;
        Slerp(oAttitude, oNext, 0.5, oHalfway);
        // [halfway]
        const double q[4] = {oHalfway[0], oHalfway[1], oHalfway[2], oHalfway[3]};
        double adfAngles[3];
        ConvertRotation(eRT_QUATERNION, q, eRT_ZYX, adfAngles);
        std::printf("halfway: yaw %.4f, pitch %.4f, roll %.4f degrees\n", adfAngles[2] / kDegree,
                    adfAngles[1] / kDegree, adfAngles[0] / kDegree);
    } catch (const vetra::Exception& oError) {
        std::cerr << oError.what() << '\n';
        return 1;
    }
    return 0;
}
